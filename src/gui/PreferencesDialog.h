#pragma once

#include "controller/MailSettings.h"

#include <QDialog>

class PasswordStore;
class QCheckBox;
class QComboBox;
class QDoubleSpinBox;
class QFormLayout;
class QGroupBox;
class QLabel;
class QLineEdit;
class QPushButton;
class QSpinBox;

/**
 * The preferences: sender, default recipient, outgoing server with its login, message format
 * and what to do when a mailing completes, each kept under its settings key; and which
 * application opens links to e-mail addresses, with a button that asks for Pelmo. The password goes
 * to the system keyring when one answers, else to the settings file; the dialog
 * says which. Values are stored as typed: the controller checks them when it mails.
 *
 * The keyring answers in the background: the password field fills in, and the note changes,
 * when it has. Owned by its parent (the main window); the password store and the settings are
 * not owned.
 */
class PreferencesDialog : public QDialog {
    Q_OBJECT

public:
    PreferencesDialog(PasswordStore& passwords, MailSettings& settings, QWidget* parent);

    /** Shows the settings as they are now stored. */
    void load();
    /** Stores every value shown; the password only when it was changed. */
    void save();
    void accept() override;

Q_SIGNALS:
    /** The user asked for links to e-mail addresses to open in Pelmo. */
    void makeDefaultMailClientAsked();

private:
    QGroupBox* createSender();
    QGroupBox* createRecipient();
    QGroupBox* createServer();
    QGroupBox* createMessage();
    QGroupBox* createCompletion();
    QGroupBox* createMailLinks();
    QGroupBox* createPace();
    QGroupBox* createUpdates();
    void showDefaultMailClient();
    QLineEdit* addText(QFormLayout* form, const char* label, MailSettings::Key key);
    QComboBox* addChoice(QFormLayout* form, const char* label, MailSettings::Key key,
                         const QList<const char*>& items);
    void loadPassword();
    void savePassword();
    void tellWherePasswordIs(bool stored, bool inKeyring);

    PasswordStore& m_passwords;
    MailSettings& m_settings;
    QList<QLineEdit*> m_texts;
    QList<QComboBox*> m_choices;
    QSpinBox* m_port = nullptr;
    QCheckBox* m_useSSL = nullptr;
    QCheckBox* m_reuseConnection = nullptr;
    QCheckBox* m_plainAlternative = nullptr;
    QCheckBox* m_continueAfterRefusal = nullptr;
    QCheckBox* m_checkForUpdates = nullptr;
    QDoubleSpinBox* m_delay = nullptr;
    QSpinBox* m_hourlyLimit = nullptr;
    QCheckBox* m_retryTemporary = nullptr;
    QLineEdit* m_password = nullptr;
    QLabel* m_passwordNote = nullptr;
    QLabel* m_defaultClient = nullptr;
    QPushButton* m_makeDefault = nullptr;
    QString m_loadedPassword;
};
