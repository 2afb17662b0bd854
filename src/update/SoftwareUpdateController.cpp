#include "update/SoftwareUpdateController.h"

#include "util/AppIdentity.h"

#include "update/VersionDocument.h"
#include "util/CLog.h"
#include "util/LocalizedStrings.h"

#include <QDir>
#include <QFileInfo>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QRegularExpression>
#include <QSettings>
#include <QStandardPaths>
#include <QTimer>

#include <climits>

namespace {

constexpr int kMaxRedirects = 5;

// RFC 6266 section 4.3: only the last path segment of a suggested name is used, and a name that
// would be hidden, empty or a folder reference is not one.
QString safeFileName(QString name) {
    name.replace(QLatin1Char('\\'), QLatin1Char('/'));
    name = name.section(QLatin1Char('/'), -1).trimmed();
    name.remove(QRegularExpression(QStringLiteral("[\\x00-\\x1f\\x7f]")));
    while (name.startsWith(QLatin1Char('.')))
        name.remove(0, 1);
    return name;
}

// The filename parameter of a Content-Disposition header (RFC 6266 section 4.1): filename*, in
// RFC 8187's charset'language'percent-encoded form, wins over filename, a token or a quoted
// string (RFC 9110 section 5.6.4).
QString dispositionFileName(const QByteArray& header) {
    static const QRegularExpression extended(
        QStringLiteral(R"(;\s*filename\*\s*=\s*(?:UTF-8|utf-8)'[^']*'([^;\s]+))"));
    static const QRegularExpression plain(
        QStringLiteral(R"re(;\s*filename\s*=\s*(?:"((?:[^"\\]|\\.)*)"|([^;\s]+)))re"));
    const QString text = QString::fromLatin1(header);
    if (const QRegularExpressionMatch match = extended.match(text); match.hasMatch())
        return QString::fromUtf8(QByteArray::fromPercentEncoding(match.captured(1).toLatin1()));
    if (const QRegularExpressionMatch match = plain.match(text); match.hasMatch()) {
        if (match.capturedLength(2) > 0)
            return match.captured(2);
        static const QRegularExpression escaped(QStringLiteral(R"(\\(.))"));
        return match.captured(1).replace(escaped, QStringLiteral("\\1"));
    }
    return {};
}

QString desktopFolder() {
    QString folder = QStandardPaths::writableLocation(QStandardPaths::DesktopLocation);
    if (folder.isEmpty())
        folder = QDir::homePath() + QStringLiteral("/Desktop");
    if (!QFileInfo::exists(folder) && QDir().mkpath(folder))
        QFile::setPermissions(folder, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    return folder;
}

// An HTTP status outside `from`..299 is not the document asked for (RFC 9110 section 15): an
// error page's body is not the update, nor is a redirect's or an interim response's.
bool httpFailed(QNetworkReply* reply, int from = 100) {
    const QVariant code = reply->attribute(QNetworkRequest::HttpStatusCodeAttribute);
    return code.isValid() && (code.toInt() < from || code.toInt() >= 300);
}

} // namespace

SoftwareUpdateController::SoftwareUpdateController(QObject* parent) : QObject(parent) {
    m_network.setParent(this); // so that its replies are found among our children
}

SoftwareUpdateController::~SoftwareUpdateController() {
    // A download cut short by quitting leaves no half file on the desktop.
    if (m_download) {
        m_download->disconnect(this);
        m_download->abort();
    }
    if (m_file.isOpen()) {
        m_file.close();
        m_file.remove();
    }
}

QString SoftwareUpdateController::getOurVersionString() {
    return QStringLiteral(PELMO_VERSION);
}

int SoftwareUpdateController::getVersionNumber(const QString& version) {
    QByteArray bytes = version.toLatin1().left(255);
    bytes.replace('.', QByteArray());
    // Read as atol() reads: leading white space, a sign, then decimal digits; clamped rather
    // than overflowing.
    qsizetype i = 0;
    while (i < bytes.size() && (bytes[i] == ' ' || (bytes[i] >= '\t' && bytes[i] <= '\r')))
        ++i;
    bool negative = false;
    if (i < bytes.size() && (bytes[i] == '+' || bytes[i] == '-'))
        negative = bytes[i++] == '-';
    long long value = 0;
    for (; i < bytes.size() && bytes[i] >= '0' && bytes[i] <= '9'; ++i) {
        value = value * 10 + (bytes[i] - '0');
        if (value > static_cast<long long>(INT_MAX) + 1)
            value = static_cast<long long>(INT_MAX) + 1;
    }
    if (negative)
        return static_cast<int>(-value);
    return value > INT_MAX ? INT_MAX : static_cast<int>(value);
}

QUrl SoftwareUpdateController::settingOr(const char* key, const char* compiledIn) {
    QSettings settings(QString::fromLatin1(kOrganisationName),
                       QString::fromLatin1(kApplicationName));
    settings.sync(); // another Pelmo may just have changed it
    const QVariant value = settings.value(QLatin1String(key));
    return QUrl(value.isValid() ? value.toString() : QString::fromUtf8(compiledIn));
}

bool SoftwareUpdateController::checkForSoftwareUpdates() const {
    QSettings settings(QString::fromLatin1(kOrganisationName),
                       QString::fromLatin1(kApplicationName));
    settings.sync();
    return settings.value(QStringLiteral("checkForSoftwareUpdates"), true).toBool();
}

void SoftwareUpdateController::setTimeouts(std::chrono::milliseconds check,
                                           std::chrono::milliseconds download) {
    m_checkTimeout = check;
    m_downloadTimeout = download;
}

void SoftwareUpdateController::awake() {
    if (!checkForSoftwareUpdates())
        return;
    // A child timer rather than QTimer::singleShot, so that the armed check can be seen.
    auto* timer = new QTimer(this);
    timer->setSingleShot(true);
    connect(timer, &QTimer::timeout, this, &SoftwareUpdateController::checkForSoftwareUpdate);
    connect(timer, &QTimer::timeout, timer, &QObject::deleteLater);
    timer->start(std::chrono::seconds(5));
}

QNetworkReply* SoftwareUpdateController::get(const QUrl& url, std::chrono::milliseconds timeout) {
    QNetworkRequest request(url);
    // The published version must come from the server, never from a cache.
    request.setAttribute(QNetworkRequest::CacheLoadControlAttribute,
                         QNetworkRequest::AlwaysNetwork);
    request.setTransferTimeout(static_cast<int>(timeout.count()));
    return m_network.get(request);
}

bool SoftwareUpdateController::fetchVersion(
    void (SoftwareUpdateController::*finished)(QNetworkReply*)) {
    const QUrl url = settingOr("softwareUpdateVersionURL", PELMO_UPDATE_VERSION_URL);
    if (!url.isValid() || url.isRelative())
        return false;
    QNetworkReply* reply = get(url, m_checkTimeout);
    connect(reply, &QNetworkReply::finished, this, [this, reply, finished] {
        reply->deleteLater();
        (this->*finished)(reply);
    });
    return true;
}

void SoftwareUpdateController::checkForSoftwareUpdate() {
    fetchVersion(&SoftwareUpdateController::automaticCheckFinished);
}

void SoftwareUpdateController::automaticCheckFinished(QNetworkReply* reply) {
    // Unasked, only news is worth a word.
    if (reply->error() != QNetworkReply::NoError || httpFailed(reply))
        return;
    const std::optional<PublishedVersion> published = ReadVersionDocument(reply->readAll());
    if (!published || getVersionNumber(getOurVersionString()) >= published->number)
        return;
    Q_EMIT updateAvailable(
        LocalizedFormat("An update is available for Pelmo (version %@.) Use Software Update in "
                        "the Pelmo menu to download it.",
                        {published->string}),
        LocalizedStringNS("(You can turn off automatic software update checks in Preferences.)"));
}

void SoftwareUpdateController::status(const QString& text, bool logged) {
    if (logged)
        LogEntry(text.toUtf8().constData());
    Q_EMIT statusChanged(text);
}

void SoftwareUpdateController::checkVersion() {
    m_softwareUpdateCheckInProgress = true;
    status(LocalizedStringNS("Checking for a software update..."), false);
    Q_EMIT checkBusyChanged(true);
    if (fetchVersion(&SoftwareUpdateController::manualCheckFinished))
        return;
    status(LocalizedStringNS("Pelmo could not check for a software update at this time."), false);
    m_softwareUpdateCheckInProgress = false;
    Q_EMIT checkBusyChanged(false);
    Q_EMIT checkFinished(false);
}

void SoftwareUpdateController::manualCheckFinished(QNetworkReply* reply) {
    m_softwareUpdateCheckInProgress = false;
    if (reply->error() != QNetworkReply::NoError || httpFailed(reply)) {
        status(LocalizedFormat("Connection failed with error: %@ %@",
                               {reply->errorString(), reply->url().toString()}),
               false);
        Q_EMIT checkBusyChanged(false);
        Q_EMIT checkFinished(false);
        return;
    }
    status(LocalizedStringNS("Loaded the version information..."), false);
    Q_EMIT checkBusyChanged(false);
    const std::optional<PublishedVersion> published = ReadVersionDocument(reply->readAll());
    if (!published) {
        status(LocalizedStringNS("The current version information could not be read."), false);
        Q_EMIT checkFinished(false);
        return;
    }
    status(getVersionNumber(getOurVersionString()) < published->number
               ? LocalizedStringNS("An update is available for Pelmo.")
               : LocalizedStringNS("Your software is up to date."),
           false);
    Q_EMIT currentVersionChanged(published->string);
    Q_EMIT checkFinished(true);
}

void SoftwareUpdateController::clickSoftwareUpdateButton() {
    if (m_softwareDownloadInProgress)
        return;
    m_softwareDownloadInProgress = true;
    Q_EMIT downloadProgressChanged(true, 0);
    m_downloadUrl = settingOr("softwareUpdateDownloadURL", PELMO_UPDATE_DOWNLOAD_URL);
    if (!m_downloadUrl.isValid() || m_downloadUrl.isRelative()) {
        LogEntry(LocalizedStringNS("The download could not start.").toUtf8().constData());
        m_softwareDownloadInProgress = false;
        Q_EMIT downloadFinished(false, {});
        return;
    }
    m_redirects = 0;
    m_received = 0;
    QNetworkRequest request(m_downloadUrl);
    request.setAttribute(QNetworkRequest::RedirectPolicyAttribute,
                         QNetworkRequest::UserVerifiedRedirectPolicy);
    request.setMaximumRedirectsAllowed(kMaxRedirects + 1); // the last one refused by us
    request.setTransferTimeout(static_cast<int>(m_downloadTimeout.count()));
    m_download = m_network.get(request);
    QNetworkReply* reply = m_download;
    connect(reply, &QNetworkReply::redirected, this, [this, reply](const QUrl& to) {
        if (++m_redirects > kMaxRedirects)
            downloadFailed(LocalizedStringNS("The download was redirected too many times."), to);
        else if (!allowRedirect(to))
            downloadFailed(
                LocalizedStringNS("The download was redirected to another host without HTTPS."),
                to);
        else
            Q_EMIT reply->redirectAllowed();
    });
    connect(reply, &QNetworkReply::readyRead, this, &SoftwareUpdateController::downloadReadyRead);
    connect(reply, &QNetworkReply::finished, this, &SoftwareUpdateController::downloadDone);
}

// RFC 9110 section 15.4: a redirect is followed only to a secure address or on the host first
// asked, so that no plain-text detour can hand over another file.
bool SoftwareUpdateController::allowRedirect(const QUrl& to) const {
    return to.scheme() == QLatin1String("https") || to.host() == m_downloadUrl.host();
}

bool SoftwareUpdateController::createDestination() {
    QString name = safeFileName(dispositionFileName(m_download->rawHeader("Content-Disposition")));
    if (name.isEmpty())
        name = safeFileName(m_download->url().fileName());
    if (name.isEmpty())
        name = LocalizedStringNS("Pelmo update");
    const QDir folder(desktopFolder());
    const qsizetype dot = name.lastIndexOf(QLatin1Char('.'));
    const QString base = dot > 0 ? name.left(dot) : name;
    const QString suffix = dot > 0 ? name.mid(dot) : QString();
    // NewOnly: a file of the user's, even one that appears this very moment, is never replaced.
    for (int copy = 1; copy < 10000; ++copy) {
        m_file.setFileName(folder.filePath(
            copy == 1 ? name : QStringLiteral("%1 (%2)%3").arg(base).arg(copy).arg(suffix)));
        if (m_file.open(QIODevice::WriteOnly | QIODevice::NewOnly)) {
            LogEntry(LocalizedFormat("Final file destination: %@", {m_file.fileName()})
                         .toUtf8()
                         .constData());
            return true;
        }
        if (!m_file.exists())
            break;
    }
    return false;
}

void SoftwareUpdateController::downloadReadyRead() {
    if (!m_download || httpFailed(m_download, 200))
        return;
    if (!m_file.isOpen() && !createDestination()) {
        downloadFailed(m_file.errorString());
        return;
    }
    // Called again when the reply ends, often with nothing left: no line for no bytes.
    const QByteArray chunk = m_download->readAll();
    if (chunk.isEmpty())
        return;
    if (m_file.write(chunk) != chunk.size()) {
        downloadFailed(m_file.errorString());
        return;
    }
    m_received += chunk.size();
    const QVariant length = m_download->header(QNetworkRequest::ContentLengthHeader);
    if (!length.isValid() || length.toLongLong() <= 0) {
        status(LocalizedStringNS("Bytes received : %d")
                   .replace(QLatin1String("%d"), QString::number(m_received)),
               true);
        return;
    }
    const float percent =
        static_cast<float>(m_received) / static_cast<float>(length.toLongLong()) * 100.0f;
    status(LocalizedStringNS("Percent complete : %f")
               .replace(QLatin1String("%f"), QString::asprintf("%f", static_cast<double>(percent))),
           true);
    Q_EMIT downloadProgressChanged(true, percent);
}

void SoftwareUpdateController::downloadDone() {
    if (!m_download)
        return;
    m_download->deleteLater();
    if (m_download->error() != QNetworkReply::NoError) {
        downloadFailed(m_download->errorString());
        return;
    }
    if (httpFailed(m_download, 200)) {
        downloadFailed(LocalizedStringNS("The server did not send the file."));
        return;
    }
    downloadReadyRead(); // an empty file, or what arrived with the end
    if (!m_download)
        return;
    const QVariant length = m_download->header(QNetworkRequest::ContentLengthHeader);
    if (length.isValid() && length.toLongLong() != m_received) {
        downloadFailed(LocalizedStringNS("The server sent less than it announced."));
        return;
    }
    if (!m_file.isOpen() && !createDestination()) {
        downloadFailed(m_file.errorString());
        return;
    }
    if (!m_file.flush()) {
        downloadFailed(m_file.errorString());
        return;
    }
    m_file.close();
    m_download = nullptr;
    status(LocalizedStringNS("The download has completed."), true);
    Q_EMIT downloadProgressChanged(false, 0);
    m_softwareDownloadInProgress = false;
    Q_EMIT downloadFinished(true, m_file.fileName());
}

void SoftwareUpdateController::downloadFailed(const QString& description, const QUrl& url) {
    QNetworkReply* reply = m_download;
    m_download = nullptr;
    reply->disconnect(this);
    reply->abort();
    reply->deleteLater();
    LogEntry(LocalizedFormat("Download failed! Error - %@ %@",
                             {description, (url.isEmpty() ? reply->url() : url).toString()})
                 .toUtf8()
                 .constData());
    // A half-downloaded package is of no use and looks like the real one: it goes.
    QString path;
    if (m_file.isOpen()) {
        path = m_file.fileName();
        m_file.close();
        m_file.remove();
    }
    m_softwareDownloadInProgress = false;
    Q_EMIT downloadFinished(false, path);
}
