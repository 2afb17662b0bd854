#pragma once

#include "controller/PelmoView.h"

#include <QMainWindow>
#include <QPointer>

class AddressBook;
class AttachmentsController;
class AttachmentsWindow;
class MailSettings;
class PasswordStore;
class PelmoController;
class PeoplePicker;
class PreferencesDialog;
class PreflightCheck;
class PreviewDialog;
class QDialog;
class QLabel;
class QLineEdit;
class QProgressBar;
class QPushButton;
class QTextEdit;
class LogWindow;
class RecipientsWindow;
class SoftwareUpdateController;
class SoftwareUpdateWindow;
class QMenu;

/**
 * Pelmo's window: the message editor with its formatting tool bar, the Subject, recipient and
 * web page fields, the Send/Stop button, the progress bar and the status line, and the buttons
 * that open the preferences, the people picker, the attachments and the activity log.
 *
 * The window is the controller's view and drives it only by forwarding: each button calls the
 * controller's action, each user edit of a field is reported with textDidChange, and the
 * controller shows its progress through the PelmoView calls. The editor shares the
 * controller's message document, and the attachments and sent-recipients windows show the
 * controller's own list and model. Those two, the people picker and the preferences dialog
 * are separate windows owned by this one. The controller, the address book, the password
 * store and the settings are not owned and must outlive the window.
 */
class MainWindow : public QMainWindow, public PelmoView {
    Q_OBJECT

public:
    MainWindow(AddressBook& addressBook, PasswordStore& passwords, MailSettings& settings,
               QWidget* parent = nullptr);
    ~MainWindow() override;

    /** Connects the window to the controller whose view it is; once, before it is shown. */
    void setController(PelmoController& controller);
    /**
     * Adds Software Update… to the File menu, and shows the automatic check's news as an
     * alert; once, after setController(). updates is not owned and must outlive the window.
     */
    void setSoftwareUpdate(SoftwareUpdateController& updates);
    PelmoController& controller() const { return *m_controller; }
    PeoplePicker& peoplePicker() const { return *m_picker; }
    RecipientsWindow& recipientsWindow() const { return *m_recipients; }
    AttachmentsController& attachments() const;
    AttachmentsWindow& attachmentsWindow() const { return *m_attachmentsWindow; }

    QString subject() const override;
    void setSubject(const QString& text) override;
    QString to() const override;
    void setTo(const QString& text) override;
    QString name() const override;
    void setName(const QString& text) override;
    QString webPageOrFile() const override;
    void setWebPageOrFile(const QString& text) override;
    void setStatus(const QString& text) override;
    void setProgressCounting(double minimum, double maximum, double value) override;
    void setProgressBusy() override;
    void setProgressValue(double value) override;
    double progressMaximum() const override;
    void startProgressAnimation() override;
    void stopProgressAnimation() override;
    QString sendButtonTitle() const override;
    void setSendButtonTitle(const QString& title) override;
    void showRecipientsWindow() override;
    /** A window-modal message box on this window; the call returns at once. */
    void alert(const QString& title, const QString& informativeText) override;
    void beep() override;

    /** Brings the people picker to the front. */
    /**
     * Asks, without blocking, whether the recipients an unfinished run of an earlier Pelmo
     * mailed go into the sent list (Restore) or are forgotten (Forget); closing the question
     * leaves them for the next start.
     */
    void offerInterruptedRun(int mailed);
    void showPeoplePicker();
    /** Brings the attachments window to the front. */
    void showAttachments();
    /** Opens the preferences as a window-modal dialog. */
    void showPreferences();
    /** Message ▸ Preview…: the copy a chosen member will receive. */
    void showPreview();
    /** Brings the activity log to the front, at its latest line that reads line if given. */
    void showLog(const QString& line = QString());

private:
    QWidget* createFields();
    QWidget* createEditor();
    QWidget* createSendRow();
    void createActions();
    /**
     * The Send button: before one copy to the To field, an address is required, and an
     * address already mailed in this session and an empty subject are asked about.
     */
    void sendPressed();
    /** A group's run goes once the check before it finds nothing, or the user says so. */
    void checkThenSend();
    /** The subject, web page and message as they stand, to tell unsent text from sent. */
    QString draft() const;
    void showStatus();

protected:
    void closeEvent(QCloseEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void connectPicker();
    /** Reports the user's edits of field, never the text the controller puts there. */
    void reportEdits(QLineEdit* edit, PelmoView::Field field);
    void showProgress();

    PasswordStore& m_passwords;
    MailSettings& m_settings;
    PelmoController* m_controller = nullptr;
    QLineEdit* m_subject = nullptr;
    QLineEdit* m_to = nullptr;
    QLineEdit* m_name = nullptr;
    QLineEdit* m_webPageOrFile = nullptr;
    QPushButton* m_webPageButton = nullptr;
    QTextEdit* m_message = nullptr;
    QPushButton* m_sendButton = nullptr;
    QProgressBar* m_spinner = nullptr;
    QLabel* m_status = nullptr;
    QLabel* m_selectionSummary = nullptr;
    PeoplePicker* m_picker = nullptr;
    RecipientsWindow* m_recipients = nullptr;
    PreferencesDialog* m_preferences = nullptr;
    PreviewDialog* m_preview = nullptr;
    /** The check before a group's run, while it is under way. */
    QPointer<PreflightCheck> m_preflight;
    /** Its findings, while shown; a new press of Send checks again. */
    QPointer<QDialog> m_preflightDialog;
    AttachmentsWindow* m_attachmentsWindow = nullptr;
    SoftwareUpdateWindow* m_softwareUpdateWindow = nullptr;
    LogWindow* m_logWindow = nullptr;
    QMenu* m_fileMenu = nullptr;
    QString m_statusText;
    QString m_sentDraft = QString(2, QChar(0)); // the draft of the latest Send, empty at first
    bool m_discarding = false;
    QAction* m_quitAction = nullptr;
    /** The progress indicator's state: a counting bar, or a busy one that may be animated. */
    bool m_busy = true;
    bool m_animating = false;
    double m_minimum = 0;
    double m_maximum = 0;
    double m_value = 0;
};
