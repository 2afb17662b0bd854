#pragma once

#include "addressbook/Person.h"
#include "controller/PelmoView.h"

#include <QList>
#include <QObject>
#include <QPointer>
#include <QSet>
#include <QSettings>
#include <QString>
#include <QStringList>
#include <QVariant>
#include <QVariantMap>

#include <functional>
#include <optional>

class AddressBook;
class AttachmentsController;
class SMTP;
class SmtpSession;
class PasswordStore;
class QTextDocument;

/**
 * The mailing controller: the settings and their validation, the message body and its tags,
 * the recipients chosen from the address book and those already mailed. It reaches its
 * window only through PelmoView, so the desktop window, the command line and the tests drive
 * the same code.
 *
 * The view, the address book and the password store are not owned and must outlive the
 * controller. Main thread only.
 */
class PelmoController : public QObject {
    Q_OBJECT

public:
    PelmoController(PelmoView& view, AddressBook& addressBook, PasswordStore& passwords,
                    QObject* parent = nullptr);
    ~PelmoController() override;

    /**
     * Start-up, once the view stands: no pending selection, an empty sent-recipients list,
     * the To and Name fields filled from the default-recipient settings that are present,
     * status "Ready.".
     */
    void startUp();
    /** The application is about to finish launching: starts the activity log. */
    void applicationWillFinishLaunching();
    /** The application terminates: stops the activity log. */
    void applicationWillTerminate();

    /** The message body; owned by the controller, shared with the window's editor. */
    QTextDocument* message() const { return body; }
    /** The window the controller drives. */
    PelmoView& view() const { return window; }

    /**
     * Makes value stand for the setting key until the controller goes, without writing it to
     * the settings file: one run from the command line with another server or port.
     */
    void overrideSetting(const QString& key, const QVariant& value);

    // The mailing run. One delivery (an SMTP object) at a time: the next person's starts when
    // the previous connection has closed.

    /**
     * The Send/Stop button: fetches the web page, then either stops the run (the button
     * reads "Stop") or starts one, over the pending selection or to the To field.
     */
    void send();
    /**
     * Takes the next pending person, fills To and Name, and starts their delivery when they
     * have an address. False when the run was stopped or no one is left (the run then ends).
     */
    bool sendMember();
    /** Stops the run after the delivery in progress; the persons not yet mailed stay pending. */
    void abort();
    /** A new session for one delivery, made by the session factory. Owned by the caller. */
    SmtpSession* createSession(const QString& host, int port);
    using SessionFactory = std::function<SmtpSession*(const QString& host, int port)>;
    /** Replaces how sessions are made (a dry run writes files; tests hand in their own). */
    void setSessionFactory(SessionFactory factory);

    // The message source.

    /** The web page field's page, downloaded and relinked; null when there is none. */
    QString getWebPageOrFile();
    /** This run's page with the tags replaced for the current recipient; null without a page. */
    QString getWebPageOrFileContents();
    /** The list of files attached to every message; owned by the controller. */
    AttachmentsController& getAttachments() const { return *attachments; }

    // Settings and fields. Every getter that reads a setting syncs the settings store first,
    // so a change saved by the preferences (or another process) is seen by the next call.
    // Those marked "throws" raise PelmoException with the failure's name and reason.

    /** "senderEmail"; throws NoSenderEmailAddress when missing or empty. */
    QString getFrom();
    /** "senderName"; throws NoSenderName. */
    QString getFromName();
    /** The To field; throws NoRecipientsEmail when empty. */
    QString getTo();
    /** The Name field; throws NoRecipientsName when empty. */
    QString getToName();
    /** The Subject field as it stands, maybe empty. */
    QString getSubject();
    /** "serverAddress"; throws NoServer. */
    QString getServer();
    /** "serverPort", 1 to 65365 inclusive; throws BadPort otherwise (a missing port is 0). */
    int getPort();
    /** "loginUsername"; throws NoUsername. */
    QString getUsername();
    /**
     * The system keyring's password when it answers with one, else "loginPassword"; throws
     * NoPassword when neither has one. Never logged.
     */
    QString getPassword();
    /** "defaultRecipientEmail", null when not set. */
    QString getDefaultTo();
    /** "defaultRecipientName", null when not set. */
    QString getDefaultToName();
    /** "selectedContentType": 0 HTML, 1 plain text, else no typed body; 0 when missing. */
    int getSelectedContentType();
    /** "selectedCharacterSet": 0 UTF-8, 1 US-ASCII, 2 ISO-8859-1, 3 Shift_JIS. */
    int getSelectedCharacterSet();
    /** "selectedAuthentication": 0 none, 1 PLAIN, 2 LOGIN, 3 CRAM-MD5. */
    int getSelectedLoginMechanism();
    /** "useSSL", false when missing. */
    bool useSSL();
    /** "completionAction": 0 nothing, 1 quit, 2 reset. */
    int completionAction();

    // Message content.

    /** The body's plain text with the tags replaced; throws what the tag getters throw. */
    QString getMessage();
    /**
     * The body as an HTML document in the chosen character set (see HtmlCharset), with the
     * tags replaced: a QString every character of which that set holds, so that
     * HtmlCharset::forIndex(getSelectedCharacterSet()).encode() gives its bytes without loss.
     * Null when the export fails; throws what the tag getters throw.
     */
    QString getHTMLMessage();
    /**
     * text with "{to}", "{toName}", "{from}", "{fromName}" and "{subject}" replaced in any
     * letter case by their getters' values. Every getter is called on every call, whether or
     * not its tag occurs, so their failures stop the message. Null for null text.
     */
    QString replaceTags(const QString& text);

    // Status, alerts and the activity log.

    /** Shows text on the status line and appends it to the activity log. */
    void statusMsg(const QString& text);
    /** Beeps, then shows an alert with the title and the explanation. */
    void doAlert(const QString& title, const QString& informativeText);
    /** Shows the activity log in the desktop's default application. */
    void openConsole();
    /** Clears the form for a new message: empty body and subject, default recipient. */
    void reset();

    // Recipients.

    /** The persons still to be mailed; nullopt when no group selection is pending. */
    const std::optional<QList<Person>>& getPeople() const { return people; }
    /** Makes persons the pending selection (a group chosen other than in the picker). */
    void setPeople(const QList<Person>& persons);
    /** Drops from the pending selection every person whose primary address was mailed. */
    void filterPeopleByRecipients();
    /** True when address was mailed, ignoring letter case only (nothing is trimmed). */
    bool recipientsContains(const QString& address) const;
    /** Records address as mailed. */
    void addRecipient(const QString& address);
    /** Forgets every mailed address. */
    void resetRecipients();

    // The sent-recipients table: column "index" shows the row number from 1, "email" the
    // address; anything else, or a row out of range, shows nothing (an invalid QVariant).
    int numberOfRows() const { return static_cast<int>(recipients.size()); }
    QVariant valueFor(const QString& column, int row) const;

public Q_SLOTS:
    /**
     * The picker's group selection changed (groups in the picker's order). Only the first
     * group counts: its members, less those already mailed, become the pending selection.
     * pickerIsKeyWindow tells that the user made the change in the picker, which then also
     * shows the group's name in the To and Name fields.
     */
    void abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow);
    /**
     * The picker's person selection, selected address or displayed property changed. A
     * person selection means one message: the pending selection is dropped. When the user
     * made the change in the picker, the first person's "first last" name goes to the Name
     * field and the first selected address (else the person's primary one) to the To field.
     */
    void abRecordSelected(const QList<qint64>& personIds, const QStringList& selectedAddresses,
                          bool pickerIsKeyWindow);
    /**
     * The user edited a field: editing To or Name drops the pending group selection. Text the
     * controller puts in a field is no edit and must not be reported.
     */
    void textDidChange(PelmoView::Field field);

Q_SIGNALS:
    /** The sent-recipients list changed. */
    void recipientsChanged();
    /** The run reached its end: every pending person was taken. */
    void runCompleted();
    /** One delivery will start nothing more; accepted when the server took its message. */
    void deliveryFinished(bool accepted);
    /** Nothing is in progress any more: the run is over, stopped or halted. */
    void runIdle();

private:
    QString requiredSetting(const char* key, const char* failureName, const char* reason);
    QString stringSetting(const char* key);
    int integerSetting(const char* key);
    QVariant setting(const char* key);
    static QString replaceTagsInTurn(const QString& text, const QStringList& values);
    static QString replaceTagsInOnePass(const QString& text, const QStringList& values);
    void recipientsDidChange();
    void startDelivery();
    void endRun();

    PelmoView& window;
    AddressBook& addressBook;
    PasswordStore& passwords;
    QSettings defaults;
    QTextDocument* body;
    /** body as plain text, null until asked for after a change. */
    QString plainBody;
    std::optional<QList<Person>> people;
    QStringList recipients;
    /** recipients case-folded, so that recipientsContains need not walk the list. */
    QSet<QString> foldedRecipients;
    QVariantMap overrides;
    bool stopSending = false;
    QString webPageOrFileContents;
    AttachmentsController* attachments;
    SessionFactory sessionFactory;
    /** The latest delivery started; a finished one that is still the latest leaves the run idle. */
    QPointer<SMTP> currentDelivery;
};
