#include "controller/MailSettings.h"

#include "util/AppIdentity.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/PrivateFiles.h"

#include <QFile>
#include <QFileInfo>

#include <algorithm>
#include <iterator>

#include <sys/stat.h>

namespace {

using Key = MailSettings::Key;

// Each setting: its stored name, what a form suggests when it is missing, and for the required
// ones the failure raised when it is missing or empty. A missing integer reads 0 and a missing
// boolean false, whatever the form suggests.
struct Row {
    Key key;
    const char* name;
    QVariant suggested;
    const char* failure;
    const char* reason;
};

const Row kTable[] = {
    {Key::SenderEmail,
     "senderEmail",
     {},
     "NoSenderEmailAddress",
     LocalizedKey("The sender 'Email Address:' preference value has not been specified.")},
    {Key::SenderName,
     "senderName",
     {},
     "NoSenderName",
     LocalizedKey("The sender 'Name:' preference value has not been specified.")},
    {Key::DefaultRecipientEmail, "defaultRecipientEmail", {}, nullptr, nullptr},
    {Key::DefaultRecipientName, "defaultRecipientName", {}, nullptr, nullptr},
    {Key::SelectedContentType, "selectedContentType", 0, nullptr, nullptr},
    {Key::SelectedCharacterSet, "selectedCharacterSet", 0, nullptr, nullptr},
    {Key::SelectedAuthentication, "selectedAuthentication", 0, nullptr, nullptr},
    {Key::UseSSL, "useSSL", false, nullptr, nullptr},
    {Key::ServerAddress,
     "serverAddress",
     {},
     "NoServer",
     LocalizedKey("The outgoing SMTP server 'Address:' preference value has not been specified.")},
    {Key::ServerPort, "serverPort", 25, "BadPort",
     LocalizedKey("The outgoing SMTP server 'Port:' preference value is out of range.")},
    {Key::CompletionAction, "completionAction", 0, nullptr, nullptr},
    {Key::LoginUsername,
     "loginUsername",
     {},
     "NoUsername",
     LocalizedKey("The outgoing SMTP server 'Username:' preference value has not been specified.")},
    {Key::LoginPassword,
     "loginPassword",
     {},
     "NoPassword",
     LocalizedKey("The outgoing SMTP server 'Password:' preference value has not been specified.")},
    // Seconds for both waiting limits of a connection; 0 keeps the transport's own.
    {Key::SmtpTimeout, "smtpTimeout", 0, nullptr, nullptr},
    // Implicit TLS on a port other than 465.
    {Key::ImplicitTLS, "implicitTLS", false, nullptr, nullptr},
    // Read by the software update check too, which sits below this table.
    {Key::CheckForSoftwareUpdates, "checkForSoftwareUpdates", true, nullptr, nullptr},
    // Up to 50 copies over one connection instead of one connection a copy.
    {Key::ReuseConnection, "reuseConnection", false, nullptr, nullptr},
    // Rich text goes with a plain-text version of itself.
    {Key::AddPlainTextAlternative, "addPlainTextAlternative", false, nullptr, nullptr},
    // A mailto: or https: address where a recipient unsubscribes.
    {Key::ListUnsubscribe, "listUnsubscribe", QVariant(), nullptr, nullptr},
    // A member's copy refused for good is skipped instead of stopping the run.
    {Key::ContinueAfterRefusal, "continueAfterRefusal", false, nullptr, nullptr},
    // The pace of a run, for servers that limit how much mail they take and how fast.
    {Key::DelayBetweenMessages, "delayBetweenMessages", 0, "BadDelay",
     LocalizedKey("The 'Delay between messages:' preference value is not a number of seconds "
                  "from 0 to 86400.")},
    {Key::MaxMessagesPerHour, "maxMessagesPerHour", 0, "BadHourlyLimit",
     LocalizedKey("The 'At most per hour:' preference value is not a whole number from 0 (no "
                  "limit) to 100000.")},
    // A copy refused for now (421, 450, 451, 452) goes again after a back-off.
    {Key::RetryTemporaryFailures, "retryTemporaryFailures", false, nullptr, nullptr},
    // What each server announced as its SIZE: "host:port=bytes" entries, blank-separated.
    {Key::ServerSizeLimits, "serverSizeLimits", QVariant(), nullptr, nullptr},
};

const Row& rowOf(Key key) {
    return kTable[static_cast<int>(key)];
}

PelmoException failureOf(Key key) {
    const Row& row = rowOf(key);
    return PelmoException(QString::fromLatin1(row.failure), LocalizedStringNS(row.reason));
}

std::filesystem::path pathOf(const QString& name) {
    return std::filesystem::path(name.toStdString());
}

} // namespace

MailSettings::MailSettings()
    : store(QString::fromLatin1(kOrganisationName), QString::fromLatin1(kApplicationName)) {
    static_assert(std::size(kTable) == static_cast<size_t>(Key::ServerSizeLimits) + 1);
    // The file may hold the password when no keyring answers: made private before anything is
    // written to it, and tightened when an older Pelmo left it readable.
    const QFileInfo file(store.fileName());
    if (MakePrivateFolder(pathOf(file.absolutePath())))
        MakePrivateFile(pathOf(file.absoluteFilePath()));
}

QString MailSettings::name(Key key) {
    return QString::fromLatin1(rowOf(key).name);
}

std::optional<MailSettings::Key> MailSettings::keyNamed(const QString& name) {
    for (const Row& row : kTable)
        if (name == QLatin1String(row.name))
            return row.key;
    return std::nullopt;
}

QStringList MailSettings::names() {
    QStringList all;
    for (const Row& row : kTable)
        all << QString::fromLatin1(row.name);
    return all;
}

QVariant MailSettings::suggested(Key key) {
    return rowOf(key).suggested;
}

QVariant MailSettings::value(Key key) {
    const auto overridden = overrides.constFind(name(key));
    if (overridden != overrides.constEnd())
        return overridden.value();
    return store.value(name(key));
}

bool MailSettings::contains(Key key) {
    return value(key).isValid();
}

QString MailSettings::string(Key key) {
    const QVariant stored = value(key);
    if (!stored.isValid())
        return {};
    // A comma left unquoted in a hand-edited settings file makes QSettings read a list.
    if (stored.typeId() == QMetaType::QStringList)
        return stored.toStringList().join(QStringLiteral(", "));
    return stored.toString();
}

int MailSettings::integer(Key key) {
    return value(key).toInt();
}

bool MailSettings::boolean(Key key) {
    return value(key).toBool();
}

QString MailSettings::required(Key key) {
    const QString stored = string(key);
    if (stored.isEmpty())
        throw failureOf(key);
    return stored;
}

int MailSettings::port() {
    const int stored = integer(Key::ServerPort);
    // One unsigned comparison: 0 (a missing port too) and anything above 65365 fail. The
    // bound is 65365, not 65535, and stays so.
    if (static_cast<unsigned>(stored) - 1u > 65364u)
        throw failureOf(Key::ServerPort);
    return stored;
}

double MailSettings::delayBetweenMessages() {
    const QVariant stored = value(Key::DelayBetweenMessages);
    if (!stored.isValid())
        return 0;
    bool isNumber = false;
    const double seconds = stored.toString().trimmed().toDouble(&isNumber);
    // Written as !(in range) so that NaN fails too.
    if (!isNumber || !(seconds >= 0 && seconds <= kMaxDelaySeconds))
        throw failureOf(Key::DelayBetweenMessages);
    return seconds;
}

int MailSettings::maxMessagesPerHour() {
    const QVariant stored = value(Key::MaxMessagesPerHour);
    if (!stored.isValid())
        return 0;
    bool isNumber = false;
    const int copies = stored.toString().trimmed().toInt(&isNumber);
    if (!isNumber || copies < 0 || copies > kMaxMessagesPerHour)
        throw failureOf(Key::MaxMessagesPerHour);
    return copies;
}

bool MailSettings::isOverridden(Key key) const {
    return overrides.contains(name(key));
}

namespace {

QString serverEntry(const QString& host, int port) {
    return host.toLower() + QLatin1Char(':') + QString::number(port) + QLatin1Char('=');
}

} // namespace

qint64 MailSettings::sizeLimit(const QString& host, int port) {
    const QString server = serverEntry(host, port);
    for (const QString& entry : string(Key::ServerSizeLimits).split(QLatin1Char(' ')))
        if (entry.startsWith(server))
            return std::max<qint64>(0, entry.mid(server.size()).toLongLong());
    return 0;
}

void MailSettings::rememberSizeLimit(const QString& host, int port, qint64 limit) {
    const QString server = serverEntry(host, port);
    QStringList entries = string(Key::ServerSizeLimits).split(QLatin1Char(' '), Qt::SkipEmptyParts);
    entries.removeIf([&server](const QString& entry) { return entry.startsWith(server); });
    if (limit > 0)
        entries << server + QString::number(limit);
    if (entries.join(QLatin1Char(' ')) != string(Key::ServerSizeLimits))
        setValue(Key::ServerSizeLimits, entries.join(QLatin1Char(' ')));
}

void MailSettings::setValue(Key key, const QVariant& newValue) {
    if (newValue.typeId() == QMetaType::QString && newValue.toString().isEmpty())
        return remove(key);
    store.setValue(name(key), newValue);
    save();
}

void MailSettings::remove(Key key) {
    store.remove(name(key));
    save();
}

void MailSettings::overrideValue(Key key, const QVariant& newValue) {
    overrides.insert(name(key), newValue);
}

void MailSettings::sync() {
    // Stamped before reading: a save by another process during the read shows next time.
    const FileStamp now = stampOfFile();
    if (lastRead == now)
        return;
    store.sync();
    lastRead = now;
}

void MailSettings::save() {
    store.sync();
    // Saving replaces the file; the new one must be as private as the old.
    MakePrivateFile(pathOf(store.fileName()));
    // Another process may have saved right after this one: the next sync() reads the file.
    lastRead.reset();
}

MailSettings::FileStamp MailSettings::stampOfFile() const {
    struct stat status {};
    if (::stat(QFile::encodeName(store.fileName()).constData(), &status) != 0)
        return {};
    const auto nanoseconds = [](const timespec& time) {
        return static_cast<long long>(time.tv_sec) * 1'000'000'000 + time.tv_nsec;
    };
    return {true,
            static_cast<unsigned long long>(status.st_dev),
            static_cast<unsigned long long>(status.st_ino),
            static_cast<long long>(status.st_size),
            nanoseconds(status.st_mtim),
            nanoseconds(status.st_ctim)};
}
