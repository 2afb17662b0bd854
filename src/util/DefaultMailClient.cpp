#include "util/DefaultMailClient.h"

#include "util/CLog.h"
#include "util/IniFile.h"
#include "util/PrivateFiles.h"

#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <QStandardPaths>

#include <cerrno>
#include <cstring>

namespace {

constexpr char kMailto[] = "x-scheme-handler/mailto";
constexpr char kDefaults[] = "[Default Applications]";

QByteArray keyOf(const QByteArray& line) {
    return line.left(line.indexOf('=')).trimmed();
}

// The applications the file's [Default Applications] group lists for mailto, best first.
QStringList mailtoDefaultsIn(const QString& path) {
    return IniFile(path)
        .value(QStringLiteral("Default Applications"), QLatin1String(kMailto))
        .split(';', Qt::SkipEmptyParts);
}

// A desktop id names a file of an applications folder, or of a folder in it: "kde4-kmail.desktop"
// may be applications/kde4/kmail.desktop.
QString desktopFile(const QString& id, const QStringList& dataFolders) {
    if (id.isEmpty() || id.contains('/') || !id.endsWith(QLatin1String(".desktop")))
        return {};
    QStringList paths = {id};
    for (qsizetype dash = id.indexOf('-'); dash >= 0; dash = id.indexOf('-', dash + 1))
        paths << QString(id).replace(dash, 1, '/');
    for (const QString& folder : dataFolders) {
        for (const QString& path : paths) {
            if (QFileInfo(folder + QLatin1String("/applications/") + path).isFile())
                return folder + QLatin1String("/applications/") + path;
        }
    }
    return {};
}

bool isInstalled(const QString& id, const QStringList& dataFolders) {
    return !desktopFile(id, dataFolders).isEmpty();
}

// Without a default, links open in an installed application that says it takes them: the
// first one in the folders' order, the user's folder first.
QString anyMailClient(const QStringList& dataFolders) {
    for (const QString& folder : dataFolders) {
        const QString applications = folder + QLatin1String("/applications/");
        QStringList paths;
        for (QDirIterator it(applications, {QStringLiteral("*.desktop")}, QDir::Files,
                             QDirIterator::Subdirectories);
             it.hasNext();)
            paths << it.next();
        paths.sort();
        for (const QString& path : std::as_const(paths)) {
            if (IniFile(path)
                    .value(QStringLiteral("Desktop Entry"), QStringLiteral("MimeType"))
                    .split(';')
                    .contains(QLatin1String(kMailto)))
                return path.mid(applications.size()).replace('/', '-');
        }
    }
    return {};
}

// The file's text with Pelmo as the mailto default: the group's mailto line replaced, else one
// added after the group's last line, else the group added at the end. Nothing else changes.
QByteArray withPelmoDefault(const QByteArray& text) {
    const QByteArray entry = QByteArray(kMailto) + "=pelmo.desktop";
    QList<QByteArray> lines = text.split('\n');
    qsizetype last = -1; // the last line of [Default Applications] that is not blank
    for (qsizetype i = 0; i < lines.size(); ++i) {
        const QByteArray line = lines[i].trimmed();
        if (line.startsWith('[')) {
            if (last >= 0)
                break;
            if (line == kDefaults)
                last = i;
        } else if (last >= 0 && line.contains('=') && keyOf(line) == kMailto) {
            lines[i] = entry;
            return lines.join('\n');
        } else if (last >= 0 && !line.isEmpty()) {
            last = i;
        }
    }
    if (last >= 0) {
        lines.insert(last + 1, entry);
        return lines.join('\n');
    }
    QByteArray added = text;
    if (!added.isEmpty() && !added.endsWith('\n'))
        added += '\n';
    if (!added.isEmpty() && !added.endsWith("\n\n"))
        added += '\n';
    return added + kDefaults + '\n' + entry + '\n';
}

int failed(const QString& path, int error) {
    if (error == 0)
        error = EIO;
    LogEntry(QStringLiteral("Could not make Pelmo the default mail client: %1: %2")
                 .arg(path, QString::fromLocal8Bit(std::strerror(error)))
                 .toUtf8()
                 .constData());
    return error;
}

} // namespace

QString DefaultMailClient() {
    QStringList names;
    for (const QString& desktop :
         qEnvironmentVariable("XDG_CURRENT_DESKTOP").split(':', Qt::SkipEmptyParts))
        names << desktop.toLower() + QLatin1String("-mimeapps.list");
    names << QStringLiteral("mimeapps.list");
    const QStringList data = QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation);
    QStringList folders = QStandardPaths::standardLocations(QStandardPaths::GenericConfigLocation);
    for (const QString& folder : data)
        folders << folder + QLatin1String("/applications");
    for (const QString& folder : folders) {
        for (const QString& name : names) {
            for (const QString& entry : mailtoDefaultsIn(folder + '/' + name)) {
                const QString id = entry.trimmed();
                if (isInstalled(id, data))
                    return id;
            }
        }
    }
    return anyMailClient(data);
}

QString ApplicationName(const QString& id) {
    const QString name =
        IniFile(
            desktopFile(id, QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation)))
            .value(QStringLiteral("Desktop Entry"), QStringLiteral("Name"));
    return name.isEmpty() ? id : name;
}

QString UserMimeAppsList() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation) +
           QLatin1String("/mimeapps.list");
}

int MakePelmoDefaultMailClient() {
    const QString path = UserMimeAppsList();
    const QString folder = QFileInfo(path).path();
    errno = 0;
    if (!QFileInfo(folder).isDir() && !MakePrivateFolder(folder.toStdString()))
        return failed(path, errno);
    if (QFileInfo(path).isDir()) // Qt refuses it without setting errno
        return failed(path, EISDIR);
    QFile old(path);
    const bool existed = old.exists();
    if (existed && !old.open(QIODevice::ReadOnly))
        return failed(path, errno);
    const QByteArray text = withPelmoDefault(existed ? old.readAll() : QByteArray());
    QSaveFile file(path);
    errno = 0;
    // QSaveFile gives a new file the umask's mode; the user's list is theirs alone.
    if (!file.open(QIODevice::WriteOnly) ||
        (!existed && !file.setPermissions(QFileDevice::ReadOwner | QFileDevice::WriteOwner)))
        return failed(path, errno);
    if (file.write(text) != text.size() || !file.commit())
        return failed(path, errno);
    return 0;
}
