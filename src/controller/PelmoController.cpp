#include "controller/PelmoController.h"

#include "addressbook/AddressBook.h"
#include "attachments/AttachmentsController.h"
#include "smtp/HtmlCharset.h"
#include "controller/PasswordStore.h"
#include "relink/Relink.h"
#include "relink/SuffixMap.h"
#include "relink/browser/FrontBrowser.h"
#include "smtp/SMTP.h"
#include "smtp/SmtpClient.h"
#include "util/CLog.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/TextUtilities.h"

#include <QDateTime>
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
      body(new QTextDocument(this)), attachments(new AttachmentsController(this)) {
    connect(body, &QTextDocument::contentsChanged, this, [this] { plainBody = QString(); });
}

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

QVariant PelmoController::setting(const char* key) {
    const auto overridden = overrides.constFind(QLatin1String(key));
    if (overridden != overrides.constEnd())
        return overridden.value();
    defaults.sync();
    return defaults.value(QLatin1String(key));
}

void PelmoController::overrideSetting(const QString& key, const QVariant& value) {
    overrides.insert(key, value);
}

QString PelmoController::stringSetting(const char* key) {
    const QVariant value = setting(key);
    if (!value.isValid())
        return {};
    // A comma left unquoted in a hand-edited settings file makes QSettings read a list.
    if (value.typeId() == QMetaType::QStringList)
        return value.toStringList().join(QStringLiteral(", "));
    return value.toString();
}

int PelmoController::integerSetting(const char* key) {
    return setting(key).toInt();
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
    // A password given for this run wins over the keyring's.
    if (overrides.contains(QStringLiteral("loginPassword")))
        return requiredSetting("loginPassword", "NoPassword",
                               "The outgoing SMTP server 'Password:' preference value has not "
                               "been specified.");
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
    return setting("useSSL").toBool();
}

int PelmoController::completionAction() {
    return integerSetting("completionAction");
}

// Message content

QString PelmoController::getMessage() {
    // The body's text is exported once per change, not once per copy.
    if (plainBody.isNull())
        plainBody = body->toPlainText();
    return replaceTags(plainBody);
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
    // Every getter is asked for every copy, so that a missing value stops the message.
    QStringList values;
    bool braced = false;
    for (const Tag& tag : kTags) {
        values << (this->*tag.getter)();
        braced = braced || values.last().contains(QLatin1Char('{')) ||
                 values.last().contains(QLatin1Char('}'));
    }
    // Tag after tag is the rule; when no value holds a brace, no value can take part in
    // another tag, and one pass over the text gives the same result.
    return braced ? replaceTagsInTurn(text, values) : replaceTagsInOnePass(text, values);
}

QString PelmoController::replaceTagsInTurn(const QString& text, const QStringList& values) {
    QString copy = text;
    for (size_t i = 0; i < std::size(kTags); ++i) {
        if (!values[i].isNull())
            copy.replace(QLatin1String(kTags[i].text), values[i], Qt::CaseInsensitive);
    }
    return copy;
}

QString PelmoController::replaceTagsInOnePass(const QString& text, const QStringList& values) {
    QString result;
    result.reserve(text.size() + text.size() / 8);
    qsizetype done = 0;
    for (qsizetype at = text.indexOf(QLatin1Char('{')); at >= 0;
         at = text.indexOf(QLatin1Char('{'), at + 1)) {
        for (size_t i = 0; i < std::size(kTags); ++i) {
            const QLatin1String tag(kTags[i].text);
            if (values[i].isNull() ||
                QStringView(text).mid(at, tag.size()).compare(tag, Qt::CaseInsensitive) != 0)
                continue;
            result += QStringView(text).mid(done, at - done);
            result += values[i];
            done = at + tag.size();
            at = done - 1;
            break;
        }
    }
    result += QStringView(text).mid(done);
    return result;
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

// The mailing run

void PelmoController::send() {
    window.showRecipientsWindow();
    webPageOrFileContents = getWebPageOrFile();
    if (window.sendButtonTitle() != LocalizedStringNS("Send")) {
        abort();
        return;
    }
    window.setSendButtonTitle(LocalizedStringNS("Stop"));
    stopSending = false;
    statusMsg(LocalizedStringNS("Sending mail."));
    defaults.sync();
    const QPointer<SMTP> before = currentDelivery;
    if (people) {
        window.setProgressCounting(0.0, static_cast<double>(people->size()), 0.0);
        sendMember();
    } else {
        window.setProgressBusy();
        startDelivery();
    }
    // Nobody left to mail, or a person without an address: no delivery will report back.
    if (currentDelivery == before)
        Q_EMIT runIdle();
}

bool PelmoController::sendMember() {
    if (stopSending)
        return false;
    if (!people || people->isEmpty()) {
        endRun();
        return false;
    }
    window.setProgressValue(window.progressMaximum() - static_cast<double>(people->size()) + 1.0);
    const Person person = people->constFirst();
    window.setName(firstAndLastName(person));
    // A person without an address is taken off all the same: the run halts there, since the
    // next person is only taken when a connection closes.
    if (!person.emails.isEmpty()) {
        window.setTo(person.primaryEmail());
        startDelivery();
    }
    if (people && !people->isEmpty())
        people->removeFirst();
    return true;
}

void PelmoController::startDelivery() {
    auto* delivery = new SMTP(*this);
    currentDelivery = delivery;
    connect(delivery, &SMTP::finished, this, [this, delivery](bool accepted) {
        Q_EMIT deliveryFinished(accepted);
        if (currentDelivery == delivery)
            Q_EMIT runIdle();
    });
    delivery->sendMail();
}

void PelmoController::endRun() {
    window.setProgressBusy();
    window.startProgressAnimation();
    window.stopProgressAnimation();
    people.reset();
    statusMsg(LocalizedStringNS("[Mailing completed at ") +
              DateDescription(QDateTime::currentDateTime()) + QStringLiteral("]"));
    window.setSendButtonTitle(LocalizedStringNS("Send"));
    Q_EMIT runCompleted();
}

void PelmoController::abort() {
    window.stopProgressAnimation();
    stopSending = true;
    window.setSendButtonTitle(LocalizedStringNS("Send"));
}

SmtpSession* PelmoController::createSession(const QString& host, int port) {
    if (sessionFactory)
        return sessionFactory(host, port);
    // "smtpTimeout" (seconds) shortens the waits for slow links and for tests.
    auto* client = new SmtpClient(host, static_cast<quint16>(port),
                                  std::chrono::seconds(integerSetting("smtpTimeout")));
    // Port 465 is implicit TLS by itself; "implicitTLS" is for servers that use it elsewhere.
    if (setting("implicitTLS").toBool())
        client->setImplicitTLS(true);
    return client;
}

void PelmoController::setSessionFactory(SessionFactory factory) {
    sessionFactory = std::move(factory);
}

// The message source

QString PelmoController::getWebPageOrFile() {
    const QString typed = window.webPageOrFile();
    if (typed.isNull())
        return {};
    const QString address = typed.toLower();
    if (!address.startsWith(QLatin1String("http://")) &&
        !address.startsWith(QLatin1String("https://")))
        return {};
    statusMsg(QStringLiteral("Downloading \"%1\"").arg(address));
    // The whole address is fetched lower-cased; links are resolved against it as typed.
    const QString page = DownloadURL(address);
    if (page.isNull()) {
        statusMsg(QStringLiteral("Could not download \"%1\"").arg(address));
        return {};
    }
    const QByteArray base = typed.toUtf8();
    const QByteArray bytes = page.toUtf8();
    CText text("");
    text.append(bytes.constData(), bytes.size());
    statusMsg(QStringLiteral("Relinking web page..."));
    // Reading the MIME database takes a tenth of a second: only runs with a page pay for it.
    EnsureSuffixMap();
    relink(CString256(base.constData()), text);
    return QString::fromUtf8(text.buffer(), text.length());
}

QString PelmoController::getWebPageOrFileContents() {
    if (webPageOrFileContents.isNull())
        return {};
    return replaceTags(webPageOrFileContents);
}
