#include "browser/FirefoxSession.h"

#include "util/IniFile.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

#include <lz4.h>

#include <climits>
#include <cmath>
#include <unistd.h>

namespace {

bool fail(QString* why, const QString& reason) {
    if (why)
        *why = reason;
    return false;
}

QString sessionFile(const QString& folder) {
    return folder + QStringLiteral("/sessionstore-backups/recovery.jsonlz4");
}

// The number at key: fallback when absent, nullopt when it is no whole number.
std::optional<qint64> position(const QJsonObject& object, const QString& key, qint64 fallback) {
    const QJsonValue value = object.value(key);
    if (value.isUndefined())
        return fallback;
    // Checked before the cast: a double beyond qint64 does not convert.
    const double number = value.toDouble();
    if (!value.isDouble() || std::abs(number) > 1e9 || number != std::floor(number))
        return std::nullopt;
    return static_cast<qint64>(number);
}

// The 1-based element at key's position in array (the last when key is absent).
std::optional<QJsonObject> pick(const QJsonObject& holder, const QString& arrayKey,
                                const QString& key, bool lastByDefault, QString* why) {
    const QJsonArray array = holder.value(arrayKey).toArray();
    if (array.isEmpty())
        return fail(why, QStringLiteral("no %1 in the session").arg(arrayKey)), std::nullopt;
    const std::optional<qint64> at = position(holder, key, lastByDefault ? array.size() : 1);
    if (!at || *at < 1 || *at > array.size() || !array.at(*at - 1).isObject())
        return fail(why, QStringLiteral("%1 out of range of the %2").arg(key, arrayKey)),
               std::nullopt;
    return array.at(*at - 1).toObject();
}

} // namespace

QByteArray FirefoxSession::decodeMozLz4(const QByteArray& file, QString* why) {
    static const QByteArray magic("mozLz40\0", 8);
    if (!file.startsWith(magic))
        return fail(why, QStringLiteral("not a mozLz4 file")), QByteArray();
    if (file.size() < 12)
        return fail(why, QStringLiteral("truncated mozLz4 header")), QByteArray();
    const auto byte = [&](int i) { return static_cast<quint32>(static_cast<uchar>(file[i])); };
    const qint64 size = byte(8) | byte(9) << 8 | byte(10) << 16 | byte(11) << 24;
    const qint64 blockSize = file.size() - 12;
    if (size > maxDecodedSize || blockSize > INT_MAX)
        return fail(why, QStringLiteral("session too large")), QByteArray();
    // An LZ4 block expands at most 255 times: a header that claims more is not believed.
    if (size > blockSize * 255)
        return fail(why, QStringLiteral("truncated LZ4 block")), QByteArray();
    QByteArray out(size, Qt::Uninitialized);
    const int made = LZ4_decompress_safe(file.constData() + 12, out.data(),
                                         static_cast<int>(blockSize), static_cast<int>(size));
    if (made < 0)
        return fail(why, QStringLiteral("corrupt or truncated LZ4 block")), QByteArray();
    if (made != size)
        return fail(why, QStringLiteral("LZ4 block of %1 bytes where the header says %2")
                             .arg(made)
                             .arg(size)),
               QByteArray();
    return size == 0 ? QByteArray("") : out;
}

std::optional<FrontPage> FirefoxSession::frontPage(const QByteArray& json, QString* why) {
    QJsonParseError error;
    const QJsonDocument document = QJsonDocument::fromJson(json, &error);
    if (!document.isObject())
        return fail(why, QStringLiteral("not a session: %1")
                             .arg(error.error ? error.errorString()
                                              : QStringLiteral("no object at the top"))),
               std::nullopt;
    // Closed windows are kept apart, in _closedWindows; selectedWindow counts open ones only.
    QJsonObject session = document.object();
    if (position(session, QStringLiteral("selectedWindow"), 1) == 0)
        session.remove(QStringLiteral("selectedWindow"));
    const auto window =
        pick(session, QStringLiteral("windows"), QStringLiteral("selectedWindow"), false, why);
    if (!window)
        return std::nullopt;
    const auto tab = pick(*window, QStringLiteral("tabs"), QStringLiteral("selected"), false, why);
    if (!tab)
        return std::nullopt;
    const auto entry = pick(*tab, QStringLiteral("entries"), QStringLiteral("index"), true, why);
    if (!entry)
        return std::nullopt;
    const QString url = entry->value(QStringLiteral("url")).toString();
    if (url.isEmpty())
        return fail(why, QStringLiteral("the front page has no address")), std::nullopt;
    const QJsonValue title = entry->value(QStringLiteral("title"));
    return FrontPage{url, title.isString() ? title.toString() : QString()};
}

QString FirefoxSession::profileFolder(const QString& firefoxHome, const QStringList& arguments,
                                      qint64 pid, QString* why) {
    // Firefox takes its options with one dash or two, in any case, and values after = too.
    QString named, byName;
    for (qsizetype i = 1; i < arguments.size(); ++i) {
        QString option = arguments[i];
        if (!option.startsWith('-'))
            continue;
        option = option.mid(option.startsWith(QStringLiteral("--")) ? 2 : 1);
        const qsizetype eq = option.indexOf('=');
        const QString key = option.left(eq).toLower();
        if (key != QStringLiteral("profile") && key != QStringLiteral("p"))
            continue;
        const QString value = eq >= 0 ? option.mid(eq + 1) : arguments.value(i + 1);
        (key == QStringLiteral("p") ? byName : named) = value;
    }
    if (!named.isEmpty()) {
        // A relative folder is relative to where Firefox started.
        const QString cwd = QFileInfo(QStringLiteral("/proc/%1/cwd").arg(pid)).symLinkTarget();
        return QDir::cleanPath(QDir(cwd.isEmpty() ? QDir::currentPath() : cwd).filePath(named));
    }

    const QDir home(firefoxHome);
    const QList<IniFile::Group> ini =
        IniFile(home.filePath(QStringLiteral("profiles.ini"))).groups();
    if (ini.isEmpty())
        return fail(why, QStringLiteral("no profiles.ini in %1").arg(firefoxHome)), QString();
    const auto folderOf = [&](const QHash<QString, QString>& keys) {
        const QString path = keys.value(QStringLiteral("Path"));
        return keys.value(QStringLiteral("IsRelative")) == QStringLiteral("1")
                   ? QDir::cleanPath(home.filePath(path))
                   : path;
    };
    QList<QHash<QString, QString>> profiles;
    for (const IniFile::Group& section : ini)
        if (section.name.startsWith(QStringLiteral("Profile")) &&
            !section.keys.value(QStringLiteral("Path")).isEmpty())
            profiles.append(section.keys);

    if (!byName.isEmpty()) {
        for (const auto& profile : profiles)
            if (profile.value(QStringLiteral("Name")) == byName)
                return folderOf(profile);
        return fail(why, QStringLiteral("no profile named %1 in profiles.ini").arg(byName)),
               QString();
    }

    // A running Firefox holds its profile with a lock symlink to "IP:+PID".
    for (const auto& profile : profiles) {
        char target[256];
        const QByteArray lock = QFile::encodeName(folderOf(profile) + QStringLiteral("/lock"));
        const ssize_t n = ::readlink(lock.constData(), target, sizeof target);
        const QByteArray link(target, n > 0 ? n : 0);
        const qsizetype plus = link.lastIndexOf(":+");
        if (plus >= 0 && link.mid(plus + 2).toLongLong() == pid)
            return folderOf(profile);
    }

    // Each installation names its default profile; the most recently saved one is in use.
    QList<IniFile::Group> installs =
        IniFile(home.filePath(QStringLiteral("installs.ini"))).groups();
    if (installs.isEmpty())
        for (const IniFile::Group& section : ini)
            if (section.name.startsWith(QStringLiteral("Install")))
                installs.append(section);
    QString newest;
    QDateTime newestTime;
    for (const IniFile::Group& install : installs) {
        const QString path = install.keys.value(QStringLiteral("Default"));
        if (path.isEmpty())
            continue;
        const QString folder = QDir::cleanPath(home.filePath(path));
        const QDateTime saved = QFileInfo(sessionFile(folder)).lastModified();
        if (newest.isEmpty() || (saved.isValid() && (!newestTime.isValid() || saved > newestTime)))
            newest = folder, newestTime = saved;
    }
    if (!newest.isEmpty())
        return newest;

    for (const auto& profile : profiles)
        if (profile.value(QStringLiteral("Default")) == QStringLiteral("1"))
            return folderOf(profile);
    return fail(why, QStringLiteral("no Firefox profile in use in %1").arg(firefoxHome)), QString();
}

std::optional<FrontPage> FirefoxSession::read(const QString& profileFolder, QString* why) {
    QFile file(sessionFile(profileFolder));
    if (!file.exists())
        return fail(why, QStringLiteral("no session file in %1").arg(profileFolder)), std::nullopt;
    if (file.size() > maxDecodedSize || !file.open(QIODevice::ReadOnly))
        return fail(why, QStringLiteral("cannot read %1").arg(file.fileName())), std::nullopt;
    const QByteArray json = decodeMozLz4(file.readAll(), why);
    if (json.isNull())
        return std::nullopt;
    return frontPage(json, why);
}
