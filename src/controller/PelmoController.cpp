#include "controller/PelmoController.h"

#include "addressbook/AddressBook.h"
#include "controller/HtmlCharset.h"
#include "controller/PasswordStore.h"
#include "util/CLog.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QTextCursor>
#include <QTextDocument>

namespace {

// Each tag and the getter whose value replaces it. A row is all a new tag takes.
struct Tag {
    const char* text;
    QString (PelmoController::*getter)();
};

constexpr Tag kTags[] = {
    {"{to}", &PelmoController::getTo},           {"{toName}", &PelmoController::getToName},
    {"{from}", &PelmoController::getFrom},       {"{fromName}", &PelmoController::getFromName},
    {"{subject}", &PelmoController::getSubject},
};

// "%@ %@" of the first and last name, a missing part printed as a null object prints.
QString firstAndLastName(const Person& person) {
    const auto part = [](const QString& text) {
        return text.isNull() ? QStringLiteral("(null)") : text;
    };
    return part(person.firstName) + QLatin1Char(' ') + part(person.lastName);
}

} // namespace

PelmoController::PelmoController(PelmoView& view, AddressBook& book, PasswordStore& store,
                                 QObject* parent)
    : QObject(parent), window(view), addressBook(book), passwords(store),
      defaults(QStringLiteral("Orvale Software"), QStringLiteral("Pelmo")),
      body(new QTextDocument(this)) {}

PelmoController::~PelmoController() = default;

void PelmoController::startUp() {
    people.reset();
    recipients.clear();
    foldedRecipients.clear();
    const QString defaultTo = getDefaultTo();
    if (!defaultTo.isNull())
        window.setTo(defaultTo);
    const QString defaultToName = getDefaultToName();
    if (!defaultToName.isNull())
        window.setName(defaultToName);
    statusMsg(LocalizedStringNS("Ready."));
}

void PelmoController::applicationWillFinishLaunching() {
    StartLogging();
}

void PelmoController::applicationWillTerminate() {
    StopLogging();
}

// Settings

QString PelmoController::stringSetting(const char* key) {
    defaults.sync();
    const QVariant value = defaults.value(QLatin1String(key));
    if (!value.isValid())
        return {};
    // A comma left unquoted in a hand-edited settings file makes QSettings read a list.
    if (value.typeId() == QMetaType::QStringList)
        return value.toStringList().join(QStringLiteral(", "));
    return value.toString();
}

int PelmoController::integerSetting(const char* key) {
    defaults.sync();
    return defaults.value(QLatin1String(key)).toInt();
}

QString PelmoController::requiredSetting(const char* key, const char* failureName,
                                         const char* reason) {
    const QString value = stringSetting(key);
    if (value.isEmpty())
        throw PelmoException(QString::fromLatin1(failureName), LocalizedStringNS(reason));
    return value;
}

QString PelmoController::getFrom() {
    return requiredSetting("senderEmail", "NoSenderEmailAddress",
                           "The sender 'Email Address:' preference value has not been "
                           "specified.");
}

QString PelmoController::getFromName() {
    return requiredSetting("senderName", "NoSenderName",
                           "The sender 'Name:' preference value has not been specified.");
}

QString PelmoController::getTo() {
    const QString to = window.to();
    if (to.isEmpty())
        throw PelmoException(
            QStringLiteral("NoRecipientsEmail"),
            LocalizedStringNS("The 'Recipient Address:' value has not been specified."));
    return to;
}

QString PelmoController::getToName() {
    const QString name = window.name();
    if (name.isEmpty())
        throw PelmoException(
            QStringLiteral("NoRecipientsName"),
            LocalizedStringNS("The 'Recipients Name:' value has not been specified."));
    return name;
}

QString PelmoController::getSubject() {
    return window.subject();
}

QString PelmoController::getServer() {
    return requiredSetting("serverAddress", "NoServer",
                           "The outgoing SMTP server 'Address:' preference value has not been "
                           "specified.");
}

int PelmoController::getPort() {
    const int port = integerSetting("serverPort");
    // One unsigned comparison: 0 (a missing port too) and anything above 65365 fail. The
    // bound is 65365, not 65535, and stays so.
    if (static_cast<unsigned>(port) - 1u > 65364u)
        throw PelmoException(QStringLiteral("BadPort"),
                             LocalizedStringNS("The outgoing SMTP server 'Port:' preference "
                                               "value is out of range."));
    return port;
}

QString PelmoController::getUsername() {
    return requiredSetting("loginUsername", "NoUsername",
                           "The outgoing SMTP server 'Username:' preference value has not been "
                           "specified.");
}

QString PelmoController::getPassword() {
    const QString fromKeyring = passwords.readPassword(QStringLiteral("loginPassword"));
    if (!fromKeyring.isEmpty())
        return fromKeyring;
    return requiredSetting("loginPassword", "NoPassword",
                           "The outgoing SMTP server 'Password:' preference value has not been "
                           "specified.");
}

QString PelmoController::getDefaultTo() {
    return stringSetting("defaultRecipientEmail");
}

QString PelmoController::getDefaultToName() {
    return stringSetting("defaultRecipientName");
}

int PelmoController::getSelectedContentType() {
    return integerSetting("selectedContentType");
}

int PelmoController::getSelectedCharacterSet() {
    return integerSetting("selectedCharacterSet");
}

int PelmoController::getSelectedLoginMechanism() {
    return integerSetting("selectedAuthentication");
}

bool PelmoController::useSSL() {
    defaults.sync();
    return defaults.value(QStringLiteral("useSSL")).toBool();
}

int PelmoController::completionAction() {
    return integerSetting("completionAction");
}

// Message content

QString PelmoController::getMessage() {
    return replaceTags(body->toPlainText());
}

QString PelmoController::getHTMLMessage() {
    const HtmlCharset charset = HtmlCharset::forIndex(getSelectedCharacterSet());
    const QByteArray exported = charset.exportDocument(*body);
    if (exported.isEmpty())
        return {};
    // The tag values come from the fields and settings, so they may hold characters the
    // set cannot; they are escaped like those of the body.
    return charset.escapeUnencodable(replaceTags(charset.decode(exported)));
}

QString PelmoController::replaceTags(const QString& text) {
    if (text.isNull())
        return {};
    QString copy = text;
    for (const Tag& tag : kTags) {
        const QString value = (this->*tag.getter)();
        if (!value.isNull())
            copy.replace(QLatin1String(tag.text), value, Qt::CaseInsensitive);
    }
    return copy;
}

// Status, alerts and the log

void PelmoController::statusMsg(const QString& text) {
    window.setStatus(text);
    LogEntry(text.toUtf8().constData());
}

void PelmoController::doAlert(const QString& title, const QString& informativeText) {
    window.beep();
    window.alert(title, informativeText);
}

void PelmoController::openConsole() {
    OpenConsole();
}

void PelmoController::reset() {
    QTextCursor cursor(body);
    cursor.select(QTextCursor::Document);
    cursor.removeSelectedText();
    statusMsg(LocalizedStringNS("Ready."));
    window.setSubject(QString());
    // An unset default recipient leaves the fields empty.
    window.setTo(getDefaultTo());
    window.setName(getDefaultToName());
}

// Recipients

void PelmoController::setPeople(const QList<Person>& persons) {
    people = persons;
}

void PelmoController::filterPeopleByRecipients() {
    if (recipients.isEmpty())
        return;
    statusMsg(QStringLiteral("Filtering people by sent recipients..."));
    if (!people)
        return;
    QList<Person> kept;
    kept.reserve(people->size());
    for (const Person& person : std::as_const(*people)) {
        const QString address = person.primaryEmail();
        if (!address.isNull() && recipientsContains(address)) {
            statusMsg(QStringLiteral("Skipping %1").arg(address));
            continue;
        }
        kept.append(person);
    }
    people = std::move(kept);
}

bool PelmoController::recipientsContains(const QString& address) const {
    return foldedRecipients.contains(address.toCaseFolded());
}

void PelmoController::addRecipient(const QString& address) {
    recipients.append(address);
    foldedRecipients.insert(address.toCaseFolded());
    recipientsDidChange();
}

void PelmoController::resetRecipients() {
    recipients.clear();
    foldedRecipients.clear();
    recipientsDidChange();
}

void PelmoController::recipientsDidChange() {
    window.reloadRecipients();
    Q_EMIT recipientsChanged();
}

QVariant PelmoController::valueFor(const QString& column, int row) const {
    if (row < 0 || row >= recipients.size())
        return {};
    if (column == QLatin1String("index"))
        return row + 1;
    if (column == QLatin1String("email"))
        return recipients.at(row);
    return {};
}

// Selection

void PelmoController::abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow) {
    if (groupIds.isEmpty())
        return;
    const qint64 groupId = groupIds.constFirst();
    const std::optional<Group> group = addressBook.group(groupId);
    if (group && pickerIsKeyWindow) {
        window.setName(group->name);
        window.setTo(group->name);
    }
    std::optional<QList<Person>> members = addressBook.members(groupId);
    if (!members)
        return;
    people = std::move(members);
    filterPeopleByRecipients();
}

void PelmoController::abRecordSelected(const QList<qint64>& personIds,
                                       const QStringList& selectedAddresses,
                                       bool pickerIsKeyWindow) {
    people.reset();
    if (personIds.isEmpty())
        return;
    const std::optional<Person> person = addressBook.person(personIds.constFirst());
    if (!person || !pickerIsKeyWindow)
        return;
    window.setName(firstAndLastName(*person));
    window.setTo(selectedAddresses.isEmpty() ? person->primaryEmail()
                                             : selectedAddresses.constFirst());
}

void PelmoController::textDidChange(PelmoView::Field field) {
    if (field == PelmoView::Field::To || field == PelmoView::Field::Name)
        people.reset();
}
