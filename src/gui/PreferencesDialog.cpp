#include "gui/PreferencesDialog.h"

#include "controller/PasswordStore.h"
#include "util/LocalizedStrings.h"

#include <QCheckBox>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QSpinBox>
#include <QVBoxLayout>

namespace {

const QString kPasswordKey = QStringLiteral("loginPassword");
constexpr char kKeyProperty[] = "settingsKey";

QString keyOf(const QWidget* widget) {
    return widget->property(kKeyProperty).toString();
}

QGroupBox* groupBox(const char* title, QFormLayout*& form) {
    auto* box = new QGroupBox(LocalizedStringNS(title));
    form = new QFormLayout(box);
    form->setFieldGrowthPolicy(QFormLayout::AllNonFixedFieldsGrow);
    return box;
}

} // namespace

PreferencesDialog::PreferencesDialog(PasswordStore& passwords, QWidget* parent)
    : QDialog(parent), m_passwords(passwords),
      m_settings(QStringLiteral("Orvale Software"), QStringLiteral("Pelmo")) {
    setWindowTitle(LocalizedStringNS("Preferences"));
    setWindowModality(Qt::WindowModal);
    auto* left = new QVBoxLayout;
    left->addWidget(createSender());
    left->addWidget(createRecipient());
    left->addWidget(createMessage());
    left->addWidget(createCompletion());
    left->addStretch(1);
    auto* right = new QVBoxLayout;
    right->addWidget(createServer());
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

QLineEdit* PreferencesDialog::addText(QFormLayout* form, const char* label, const char* key) {
    auto* edit = new QLineEdit;
    edit->setObjectName(QLatin1String(key));
    edit->setProperty(kKeyProperty, QLatin1String(key));
    edit->setMinimumWidth(220);
    form->addRow(LocalizedStringNS(label), edit);
    m_texts << edit;
    return edit;
}

// A choice stores the index of its item; a stored index without an item shows blank and is
// kept as it is.
QComboBox* PreferencesDialog::addChoice(QFormLayout* form, const char* label, const char* key,
                                        const QList<const char*>& items) {
    auto* combo = new QComboBox;
    combo->setObjectName(QLatin1String(key));
    combo->setProperty(kKeyProperty, QLatin1String(key));
    for (const char* item : items)
        combo->addItem(LocalizedStringNS(item));
    form->addRow(LocalizedStringNS(label), combo);
    m_choices << combo;
    return combo;
}

QGroupBox* PreferencesDialog::createSender() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox("Sender", form);
    addText(form, "Name:", "senderName");
    addText(form, "Email Address:", "senderEmail")
        ->setPlaceholderText(QStringLiteral("me@example.org"));
    return box;
}

QGroupBox* PreferencesDialog::createRecipient() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox("Default Recipient", form);
    addText(form, "Name:", "defaultRecipientName");
    addText(form, "Email Address:", "defaultRecipientEmail");
    return box;
}

QGroupBox* PreferencesDialog::createServer() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox("Outgoing SMTP Server", form);
    addText(form, "Address:", "serverAddress")
        ->setPlaceholderText(QStringLiteral("smtp.example.org"));
    m_port = new QSpinBox;
    m_port->setObjectName(QStringLiteral("serverPort"));
    m_port->setRange(0, 65535);
    m_port->setToolTip(LocalizedStringNS("25 or 587 for STARTTLS, 465 for SSL from the start"));
    form->addRow(LocalizedStringNS("Port:"), m_port);
    m_useSSL = new QCheckBox(LocalizedStringNS("Use SSL"));
    m_useSSL->setObjectName(QStringLiteral("useSSL"));
    form->addRow(QString(), m_useSSL);
    addChoice(form, "Authentication:", "selectedAuthentication",
              {"None", "PLAIN", "LOGIN", "CRAM-MD5"});
    addText(form, "Username:", "loginUsername");
    m_password = new QLineEdit;
    m_password->setObjectName(kPasswordKey);
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
    QGroupBox* box = groupBox("Message", form);
    addChoice(form, "Format:", "selectedContentType",
              {"Rich text (HTML)", "Plain text", "No typed text"});
    addChoice(form, "Character set:", "selectedCharacterSet",
              {"Unicode (UTF-8)", "ASCII", "Western (ISO-8859-1)", "Japanese (Shift_JIS)"});
    return box;
}

QGroupBox* PreferencesDialog::createCompletion() {
    QFormLayout* form = nullptr;
    QGroupBox* box = groupBox("When Mailing Completes", form);
    addChoice(form, "Then:", "completionAction", {"Do nothing", "Quit Pelmo", "Clear the message"});
    return box;
}

void PreferencesDialog::load() {
    m_settings.sync();
    for (QLineEdit* edit : std::as_const(m_texts))
        edit->setText(m_settings.value(keyOf(edit)).toString());
    for (QComboBox* combo : std::as_const(m_choices)) {
        const int index = m_settings.value(keyOf(combo)).toInt();
        combo->setCurrentIndex(index >= 0 && index < combo->count() ? index : -1);
    }
    m_port->setValue(m_settings.value(QStringLiteral("serverPort"), 25).toInt());
    m_useSSL->setChecked(m_settings.value(QStringLiteral("useSSL")).toBool());
    loadPassword();
}

void PreferencesDialog::loadPassword() {
    const QString fromKeyring = m_passwords.readPassword(kPasswordKey);
    const bool inKeyring = !fromKeyring.isEmpty();
    m_loadedPassword = inKeyring ? fromKeyring : m_settings.value(kPasswordKey).toString();
    m_password->setText(m_loadedPassword);
    tellWherePasswordIs(!m_loadedPassword.isEmpty(), inKeyring);
}

void PreferencesDialog::save() {
    for (const QLineEdit* edit : std::as_const(m_texts)) {
        const QString text = edit->text().trimmed();
        if (text.isEmpty())
            m_settings.remove(keyOf(edit));
        else
            m_settings.setValue(keyOf(edit), text);
    }
    for (const QComboBox* combo : std::as_const(m_choices)) {
        if (combo->currentIndex() >= 0)
            m_settings.setValue(keyOf(combo), combo->currentIndex());
    }
    m_settings.setValue(QStringLiteral("serverPort"), m_port->value());
    m_settings.setValue(QStringLiteral("useSSL"), m_useSSL->isChecked());
    if (m_password->text() != m_loadedPassword)
        savePassword();
    m_settings.sync();
}

void PreferencesDialog::savePassword() {
    const QString password = m_password->text();
    bool inKeyring = false;
    if (password.isEmpty()) {
        m_passwords.deletePassword(kPasswordKey);
        m_settings.remove(kPasswordKey);
    } else if (m_passwords.writePassword(kPasswordKey, password)) {
        // The keyring holds it now: no copy stays in the settings file in plain text.
        m_settings.remove(kPasswordKey);
        inKeyring = true;
    } else {
        m_settings.setValue(kPasswordKey, password);
    }
    m_loadedPassword = password;
    tellWherePasswordIs(!password.isEmpty(), inKeyring);
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
