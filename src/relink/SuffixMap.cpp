#include "relink/SuffixMap.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QMimeDatabase>
#include <QSaveFile>
#include <QStandardPaths>

#include <algorithm>
#include <cctype>
#include <cstring>

CMap<CString256, ICMapEntry> gSuffixMap;

namespace {

// Identifies Pelmo wherever a four-character code is expected.
constexpr char kSignature[] = "Pelm";

uint32_t fileTypeFor(const QByteArray& suffix) {
    char code[4] = {' ', ' ', ' ', ' '};
    for (int i = 0; i < 4 && i < suffix.size(); ++i)
        code[i] = static_cast<char>(std::toupper(static_cast<unsigned char>(suffix[i])));
    uint32_t type = 0;
    StrToFourCharCode(code, type);
    return type;
}

// Only plain "*.ext" globs name a suffix; "*.[1-9]" or "README*" do not.
bool isSuffixGlob(const QString& glob) {
    if (!glob.startsWith(QLatin1String("*.")) || glob.size() < 3)
        return false;
    for (QChar c : glob.mid(1)) {
        if (c == QLatin1Char('*') || c == QLatin1Char('?') || c == QLatin1Char('[') ||
            c.unicode() > 0x7f)
            return false;
    }
    return true;
}

void copyTruncated(char* out, size_t room, const QByteArray& text) {
    const size_t n = std::min(room - 1, static_cast<size_t>(text.size()));
    std::memcpy(out, text.constData(), n);
    out[n] = 0;
}

} // namespace

void StrToFourCharCode(const char* s, uint32_t& code) {
    std::memcpy(&code, s, sizeof code);
}

uint32_t GetOurSignature() {
    uint32_t code = 0;
    StrToFourCharCode(kSignature, code);
    return code;
}

void EnsureSuffixMap() {
    if (gSuffixMap.count == 0)
        InitializeSuffixMap();
}

namespace {

// Reading every type's globs parses the whole MIME database, most of a short command's time,
// so the map is kept in the user's cache and built again only when the database changes:
// update-mime-database rewrites mime.cache, and adding or removing a package touches its folder.
QString databaseStamp() {
    QStringList parts{QStringLiteral("pelmo suffix map 1")};
    for (const QString& folder :
         QStandardPaths::locateAll(QStandardPaths::GenericDataLocation, QStringLiteral("mime"),
                                   QStandardPaths::LocateDirectory))
        for (const char* name : {"mime.cache", "packages"}) {
            const QFileInfo part(folder + QLatin1Char('/') + QLatin1String(name));
            parts << part.filePath() + QLatin1Char(' ') +
                         QString::number(part.exists() ? part.lastModified().toMSecsSinceEpoch()
                                                       : 0);
        }
    return parts.join(QLatin1Char('\n')) + QLatin1String("\n\n");
}

QString cachePath() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericCacheLocation) +
           QLatin1String("/pelmo/suffix-map");
}

void insertEntry(const QByteArray& extension, const QByteArray& mimeType) {
    ICMapEntry entry{};
    entry.fileType = fileTypeFor(extension.mid(1));
    copyTruncated(entry.extension, sizeof entry.extension, extension);
    copyTruncated(entry.MIMEType, sizeof entry.MIMEType, mimeType);
    if (Link<CString256, ICMapEntry>* record =
            gSuffixMap.insert(CString256(extension.constData()), entry))
        record->value = entry;
}

// The cache: the stamp, then one "suffix TAB type" line an entry, in the map's order.
bool loadCached(const QByteArray& stamp) {
    QFile file(cachePath());
    if (!file.open(QIODevice::ReadOnly) || file.read(stamp.size()) != stamp)
        return false;
    const QList<QByteArray> lines = file.readAll().split('\n');
    for (const QByteArray& line : lines) {
        const qsizetype tab = line.indexOf('\t');
        if (tab > 0)
            insertEntry(line.left(tab), line.mid(tab + 1));
    }
    return gSuffixMap.count > 0;
}

// A cache that cannot be written costs only time at the next start.
void saveCache(const QByteArray& stamp) {
    const QString path = cachePath();
    if (!QDir().mkpath(QFileInfo(path).path()))
        return;
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return;
    file.write(stamp);
    for (const elem<Link<CString256, ICMapEntry>*>* row = gSuffixMap.list.first; row;
         row = row->next)
        file.write(QByteArray(row->data->value.extension) + '\t' + row->data->value.MIMEType +
                   '\n');
    file.commit();
}

void buildFromDatabase() {
    const QMimeDatabase database;
    QList<QMimeType> types = database.allMimeTypes();
    // Name order keeps the map's insertion order the same from run to run.
    std::sort(types.begin(), types.end(),
              [](const QMimeType& a, const QMimeType& b) { return a.name() < b.name(); });
    for (const QMimeType& type : types) {
        for (const QString& glob : type.globPatterns()) {
            if (!isSuffixGlob(glob))
                continue;
            const QByteArray extension = glob.mid(1).toLatin1();
            // Several types may claim a suffix (".html"); the database's own choice is the one
            // a file with that name gets everywhere else on the desktop.
            const QString preferred = database
                                          .mimeTypeForFile(QLatin1String("x") + glob.mid(1),
                                                           QMimeDatabase::MatchExtension)
                                          .name();
            insertEntry(extension, preferred.toLatin1());
        }
    }
}

} // namespace

void InitializeSuffixMap() {
    const QByteArray stamp = databaseStamp().toUtf8();
    if (loadCached(stamp))
        return;
    buildFromDatabase();
    saveCache(stamp);
}
