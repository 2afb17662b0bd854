#include "gui/PreferencesDialog.h"

#include "controller/PasswordStore.h"
#include "util/DefaultMailClient.h"
#include "util/LocalizedStrings.h"

#include <QCheckBox>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QDoubleSpinBox>
#include <QFormLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QSpinBox>
#include <QVBoxLayout>

namespace {

using Key = MailSettings::Key;

constexpr char kKeyProperty[] = "settingsKey";

Key keyOf(const QWidget* widget) {
    return static_cast<Key>(widget->property(kKeyProperty).toInt());
}

void nameAfter(QWidget* widget, Key key) {
    widget->setObjectName(MailSettings::name(key));
    widget->setProperty(kKeyProperty, static_cast<int>(key));
}

QGroupBox* groupBox(const char* title, QFormLayout*& form) {
    auto* box = new QGroupBox(LocalizedStringNS(title));
    form = new QFormLayout(box);
    form->setFieldGrowthPolicy(QFormLayout::AllNonFixedFieldsGrow);
    return box;
}

} // namespace

PreferencesDialog::PreferencesDialog(PasswordStore& passwords, MailSettings& settings,
                                     QWidget* parent)
    : QDialog(parent), m_passwords(passwords), m_settings(settings) {
    setWindowTitle(LocalizedStringNS("Preferences"));
    setWindowModality(Qt::WindowModal);
    auto* left = new QVBoxLayout;
    left->addWidget(createSender());
    left->addWidget(createRecipient());
    left->addWidget(createMessage());
    left->addWidget(createCompletion());
    left->addWidget(createMailLinks());
    left->addStretch(1);
    auto* right = new QVBoxLayout;
    right->addWidget(createServer());
    right->addWidget(createUpdates());
    right->addWidget(createPace());
    right->addStretch(1);
    auto* columns = new QHBoxLayout;
    columns->addLayout(left, 1);
    columns->addLayout(right, 1);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel |
                                         QDialogButtonBox::Apply);
    connect(buttons, &QDialogButtonBox::accepted, this, &PreferencesDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &PreferencesDialog::reject);
    connect(buttons->button(QDialogButtonBox::Apply), &QPushButton::clicked, this,
            &PreferencesDialog::save);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(columns);
    layout->addWidget(buttons);
}

QLineEdit* PreferencesDialog::addText(QFormLayout* form, const char* label, Key key) {
    auto* edit = new QLineEdit;
    nameAfter(edit, key);
    edit->setMinimumWidth(220);
    form->addRow(LocalizedStringNS(label), edit);
    m_texts << edit;
    return edit;
}

// A choice stores the index of its item; a stored index without an item shows blank and is
// kept as it is.
QComboBox* PreferencesDialog::addChoice(QFormLayout* form, const char* label, Key key,
                                        const QList<const char*>& items) {
    auto* combo = new QComboBox;
    nameAfter(combo, key);
    for (const char* item : items)
        combo->addItem(LocalizedStringNS(item));
    form->addRow(LocalizedStringNS(label), combo);
    m_choices << combo;
    return combo;
}

QGroupBox* PreferencesDialog::createSender() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Sender"), form);
    addText(form, LocalizedKey("Name:"), Key::SenderName);
    addText(form, LocalizedKey("Email Address:"), Key::SenderEmail)
        ->setPlaceholderText(QStringLiteral("me@example.org"));
    return box;
}

QGroupBox* PreferencesDialog::createRecipient() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Default Recipient"), form);
    addText(form, LocalizedKey("Name:"), Key::DefaultRecipientName);
    addText(form, LocalizedKey("Email Address:"), Key::DefaultRecipientEmail);
    return box;
}

QGroupBox* PreferencesDialog::createServer() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Outgoing SMTP Server"), form);
    addText(form, LocalizedKey("Address:"), Key::ServerAddress)
        ->setPlaceholderText(QStringLiteral("smtp.example.org"));
    m_port = new QSpinBox;
    nameAfter(m_port, Key::ServerPort);
    m_port->setRange(0, 65535);
    m_port->setToolTip(LocalizedStringNS("25 or 587 for STARTTLS, 465 for SSL from the start"));
    form->addRow(LocalizedStringNS("Port:"), m_port);
    m_useSSL = new QCheckBox(LocalizedStringNS("Use SSL"));
    nameAfter(m_useSSL, Key::UseSSL);
    form->addRow(QString(), m_useSSL);
    m_reuseConnection = new QCheckBox(LocalizedStringNS("Send up to 50 messages per connection"));
    nameAfter(m_reuseConnection, Key::ReuseConnection);
    m_reuseConnection->setToolTip(
        LocalizedStringNS("Faster for a group; some servers limit what one connection may send"));
    form->addRow(QString(), m_reuseConnection);
    addChoice(form, LocalizedKey("Authentication:"), Key::SelectedAuthentication,
              {LocalizedKey("None"), "PLAIN", "LOGIN", "CRAM-MD5"});
    addText(form, LocalizedKey("Username:"), Key::LoginUsername);
    m_password = new QLineEdit;
    nameAfter(m_password, Key::LoginPassword);
    m_password->setEchoMode(QLineEdit::Password);
    form->addRow(LocalizedStringNS("Password:"), m_password);
    m_passwordNote = new QLabel;
    m_passwordNote->setObjectName(QStringLiteral("passwordNote"));
    m_passwordNote->setWordWrap(true);
    QFont small = m_passwordNote->font();
    small.setPointSizeF(small.pointSizeF() * 0.9);
    m_passwordNote->setFont(small);
    form->addRow(QString(), m_passwordNote);
    return box;
}

QGroupBox* PreferencesDialog::createMessage() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Message"), form);
    addChoice(form, LocalizedKey("Format:"), Key::SelectedContentType,
              {LocalizedKey("Rich text (HTML)"), LocalizedKey("Plain text"),
               LocalizedKey("No typed text")});
    addChoice(form, LocalizedKey("Character set:"), Key::SelectedCharacterSet,
              {LocalizedKey("Unicode (UTF-8)"), "ASCII", LocalizedKey("Western (ISO-8859-1)"),
               LocalizedKey("Japanese (Shift_JIS)")});
    m_plainAlternative =
        new QCheckBox(LocalizedStringNS("Add a plain-text version to rich-text messages"));
    nameAfter(m_plainAlternative, Key::AddPlainTextAlternative);
    form->addRow(QString(), m_plainAlternative);
    addText(form, LocalizedKey("Unsubscribe address:"), Key::ListUnsubscribe)
        ->setPlaceholderText(LocalizedStringNS("mailto: or https: address (optional)"));
    m_continueAfterRefusal =
        new QCheckBox(LocalizedStringNS("Skip a recipient the server refuses"));
    nameAfter(m_continueAfterRefusal, Key::ContinueAfterRefusal);
    m_continueAfterRefusal->setToolTip(
        LocalizedStringNS("The run goes on, and those refused are put in a new group to send to "
                          "again later"));
    form->addRow(QString(), m_continueAfterRefusal);
    return box;
}

QGroupBox* PreferencesDialog::createCompletion() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("When Mailing Completes"), form);
    addChoice(form, LocalizedKey("Then:"), Key::CompletionAction,
              {LocalizedKey("Do nothing"), LocalizedKey("Quit Pelmo"),
               LocalizedKey("Clear the message")});
    return box;
}

QGroupBox* PreferencesDialog::createUpdates() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Software Update"), form);
    m_checkForUpdates = new QCheckBox(LocalizedStringNS("Check for software updates at start-up"));
    nameAfter(m_checkForUpdates, Key::CheckForSoftwareUpdates);
    form->addRow(m_checkForUpdates);
    return box;
}

QGroupBox* PreferencesDialog::createMailLinks() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Links to E-mail Addresses"), form);
    m_defaultClient = new QLabel;
    m_defaultClient->setObjectName(QStringLiteral("defaultMailClient"));
    m_defaultClient->setWordWrap(true);
    form->addRow(m_defaultClient);
    m_makeDefault = new QPushButton(LocalizedStringNS("Make Pelmo the Default Mail Client"));
    m_makeDefault->setObjectName(QStringLiteral("makeDefaultMailClient"));
    m_makeDefault->setAutoDefault(false);
    connect(m_makeDefault, &QPushButton::clicked, this, [this] {
        Q_EMIT makeDefaultMailClientAsked();
        showDefaultMailClient();
    });
    form->addRow(m_makeDefault);
    return box;
}

QGroupBox* PreferencesDialog::createPace() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox(LocalizedKey("Pace"), form);
    m_delay = new QDoubleSpinBox;
    nameAfter(m_delay, Key::DelayBetweenMessages);
    m_delay->setRange(0, MailSettings::kMaxDelaySeconds);
    m_delay->setDecimals(1);
    m_delay->setSuffix(LocalizedStringNS(" s"));
    form->addRow(LocalizedStringNS("Delay between messages:"), m_delay);
    m_hourlyLimit = new QSpinBox;
    nameAfter(m_hourlyLimit, Key::MaxMessagesPerHour);
    m_hourlyLimit->setRange(0, MailSettings::kMaxMessagesPerHour);
    m_hourlyLimit->setSpecialValueText(LocalizedStringNS("No limit"));
    m_hourlyLimit->setToolTip(LocalizedStringNS("Messages in any hour, for servers that limit it"));
    form->addRow(LocalizedStringNS("At most per hour:"), m_hourlyLimit);
    m_retryTemporary = new QCheckBox(LocalizedStringNS("Try again when the server is busy"));
    nameAfter(m_retryTemporary, Key::RetryTemporaryFailures);
    m_retryTemporary->setToolTip(
        LocalizedStringNS("After 30 s, 2 min and 8 min; then the run stops as for any refusal"));
    form->addRow(QString(), m_retryTemporary);
    return box;
}

void PreferencesDialog::showDefaultMailClient() {
    const QString client = DefaultMailClient();
    const bool pelmo = client == QLatin1String("pelmo.desktop");
    m_defaultClient->setText(
        pelmo             ? LocalizedStringNS("Pelmo is your default mail client.")
        : client.isNull() ? LocalizedStringNS("No application handles links to e-mail addresses.")
                          : LocalizedStringNS("Links to e-mail addresses open in %1.")
                                .arg(ApplicationName(client)));
    m_makeDefault->setEnabled(!pelmo);
}

void PreferencesDialog::load() {
    showDefaultMailClient();
    m_settings.sync();
    for (QLineEdit* edit : std::as_const(m_texts))
        edit->setText(m_settings.string(keyOf(edit)));
    for (QComboBox* combo : std::as_const(m_choices)) {
        const int index = m_settings.integer(keyOf(combo));
        combo->setCurrentIndex(index >= 0 && index < combo->count() ? index : -1);
    }
    m_port->setValue(m_settings.contains(Key::ServerPort)
                         ? m_settings.integer(Key::ServerPort)
                         : MailSettings::suggested(Key::ServerPort).toInt());
    m_useSSL->setChecked(m_settings.boolean(Key::UseSSL));
    m_reuseConnection->setChecked(m_settings.boolean(Key::ReuseConnection));
    m_plainAlternative->setChecked(m_settings.boolean(Key::AddPlainTextAlternative));
    m_continueAfterRefusal->setChecked(m_settings.boolean(Key::ContinueAfterRefusal));
    // Absent, the check is on.
    m_checkForUpdates->setChecked(!m_settings.contains(Key::CheckForSoftwareUpdates) ||
                                  m_settings.boolean(Key::CheckForSoftwareUpdates));
    // A value the run would refuse shows as 0; the run says what is wrong with it.
    m_delay->setValue(m_settings.value(Key::DelayBetweenMessages).toDouble());
    m_hourlyLimit->setValue(m_settings.integer(Key::MaxMessagesPerHour));
    m_retryTemporary->setChecked(m_settings.boolean(Key::RetryTemporaryFailures));
    loadPassword();
}

void PreferencesDialog::loadPassword() {
    // Until the keyring answers, the field shows what the settings file holds.
    m_loadedPassword = m_settings.string(Key::LoginPassword);
    m_password->setText(m_loadedPassword);
    tellWherePasswordIs(!m_loadedPassword.isEmpty(), false);
    m_passwords.readPassword(
        MailSettings::name(Key::LoginPassword), this, [this](const QString& fromKeyring) {
            // A password typed meanwhile is the user's, and stays.
            if (fromKeyring.isEmpty() || m_password->text() != m_loadedPassword)
                return tellWherePasswordIs(!m_loadedPassword.isEmpty(), false);
            m_loadedPassword = fromKeyring;
            m_password->setText(fromKeyring);
            tellWherePasswordIs(true, true);
        });
}

void PreferencesDialog::save() {
    for (const QLineEdit* edit : std::as_const(m_texts))
        m_settings.setValue(keyOf(edit), edit->text().trimmed());
    for (const QComboBox* combo : std::as_const(m_choices)) {
        if (combo->currentIndex() >= 0)
            m_settings.setValue(keyOf(combo), combo->currentIndex());
    }
    m_settings.setValue(Key::ServerPort, m_port->value());
    m_settings.setValue(Key::UseSSL, m_useSSL->isChecked());
    m_settings.setValue(Key::ReuseConnection, m_reuseConnection->isChecked());
    m_settings.setValue(Key::AddPlainTextAlternative, m_plainAlternative->isChecked());
    m_settings.setValue(Key::ContinueAfterRefusal, m_continueAfterRefusal->isChecked());
    m_settings.setValue(Key::CheckForSoftwareUpdates, m_checkForUpdates->isChecked());
    m_settings.setValue(Key::DelayBetweenMessages, m_delay->value());
    m_settings.setValue(Key::MaxMessagesPerHour, m_hourlyLimit->value());
    m_settings.setValue(Key::RetryTemporaryFailures, m_retryTemporary->isChecked());
    if (m_password->text() != m_loadedPassword)
        savePassword();
}

void PreferencesDialog::savePassword() {
    const QString password = m_password->text();
    const QString key = MailSettings::name(Key::LoginPassword);
    m_loadedPassword = password;
    if (password.isEmpty()) {
        m_settings.remove(Key::LoginPassword);
        m_passwords.deletePassword(key, this, [](bool) {});
        return tellWherePasswordIs(false, false);
    }
    m_passwords.writePassword(key, password, this, [this, password](bool inKeyring) {
        if (inKeyring)
            // The keyring holds it now: no copy stays in the settings file in plain text.
            m_settings.remove(Key::LoginPassword);
        else
            m_settings.setValue(Key::LoginPassword, password);
        tellWherePasswordIs(true, inKeyring);
    });
}

void PreferencesDialog::tellWherePasswordIs(bool stored, bool inKeyring) {
    const bool keyring = m_passwords.keyringAnswers();
    QString note;
    if (inKeyring)
        note = LocalizedStringNS("The password is kept in the system keyring.");
    else if (stored && keyring)
        note = LocalizedStringNS("The password is kept in the settings file %1.");
    else if (stored)
        note = LocalizedStringNS("No keyring answered: the password is kept in the settings "
                                 "file %1.");
    else if (keyring)
        note = LocalizedStringNS("A password entered here will be kept in the system keyring.");
    else
        note = LocalizedStringNS("No keyring answered: a password entered here will be kept in "
                                 "the settings file %1.");
    m_passwordNote->setText(note.contains(QLatin1String("%1")) ? note.arg(m_settings.fileName())
                                                               : note);
}

void PreferencesDialog::accept() {
    save();
    QDialog::accept();
}
