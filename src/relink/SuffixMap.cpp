#include "relink/SuffixMap.h"

#include <QMimeDatabase>

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

void InitializeSuffixMap() {
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
            ICMapEntry entry{};
            entry.fileType = fileTypeFor(extension.mid(1));
            copyTruncated(entry.extension, sizeof entry.extension, extension);
            copyTruncated(entry.MIMEType, sizeof entry.MIMEType, preferred.toLatin1());
            if (Link<CString256, ICMapEntry>* record =
                    gSuffixMap.insert(CString256(extension.constData()), entry))
                record->value = entry;
        }
    }
}
