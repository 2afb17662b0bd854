#include "util/TextUtilities.h"

#include <QRegularExpression>
#include <QStringDecoder>

#include "text/CString256.h"

#include <QDateTime>
#include <QFileInfo>
#include <QMimeDatabase>

#include <cstdio>
#include <cstring>
#include <new>
#include <utility>

void reverse(char* s) {
    if (s == nullptr)
        return;
    for (size_t i = 0, j = std::strlen(s); i + 1 < j; ++i, --j)
        std::swap(s[i], s[j - 1]);
}

void itoa(char* out, short max, long value) {
    const bool negative = value < 0;
    // Unsigned arithmetic gives the magnitude of LONG_MIN too.
    unsigned long magnitude =
        negative ? 0UL - static_cast<unsigned long>(value) : static_cast<unsigned long>(value);
    int budget = (max <= 0 ? 1 : max) - 1;
    char* p = out;
    while (budget-- > 0) {
        *p++ = static_cast<char>('0' + magnitude % 10);
        magnitude /= 10;
        if (magnitude == 0)
            break;
    }
    if (negative)
        *p++ = '-';
    *p = 0;
    reverse(out);
}

namespace {

char* newDecimal(unsigned long magnitude, bool negative) {
    int digits = 1;
    for (unsigned long rest = magnitude / 10; rest != 0; rest /= 10)
        ++digits;
    char* out = new (std::nothrow) char[digits + 2];
    if (out == nullptr)
        return nullptr;
    char* p = out;
    if (negative)
        *p++ = '-';
    p += digits;
    *p = 0;
    do {
        *--p = static_cast<char>('0' + magnitude % 10);
        magnitude /= 10;
    } while (magnitude != 0);
    return out;
}

char* newSignedDecimal(long value) {
    const bool negative = value < 0;
    return newDecimal(negative ? 0UL - static_cast<unsigned long>(value)
                               : static_cast<unsigned long>(value),
                      negative);
}

bool inRange(unsigned char c, unsigned char first, unsigned char last) {
    // Wraps modulo 256, so one comparison rejects bytes on both sides of the range.
    return static_cast<unsigned char>(c - first) <= static_cast<unsigned char>(last - first);
}

bool oneOf(unsigned char c, const char* set) {
    return c != 0 && std::strchr(set, c) != nullptr;
}

void writeEscape(char* out, unsigned char c) {
    std::snprintf(out, 4, "%1s%2x", "%", c);
    if (out[1] == ' ')
        out[1] = '0';
}

void appendUnit(CString256& text, uint32_t count, const char* one, const char* many) {
    if (count == 0)
        return;
    text += static_cast<long>(count);
    text += count == 1 ? one : many;
}

} // namespace

char* itoa(unsigned long value) {
    return newDecimal(value, false);
}
char* itoa(long value) {
    return newSignedDecimal(value);
}
char* itoa(short value) {
    return newSignedDecimal(value);
}

bool isHiAlpha(unsigned char c) {
    return inRange(c, 'A', 'Z');
}
bool isLoAlpha(unsigned char c) {
    return inRange(c, 'a', 'z');
}
bool isHiorLoAlpha(unsigned char c) {
    return isHiAlpha(c) || isLoAlpha(c);
}
bool isDig(unsigned char c) {
    return inRange(c, '0', '9');
}
bool isSafe(unsigned char c) {
    return oneOf(c, "$+-._");
}
bool isExtra(unsigned char c) {
    return oneOf(c, "!'()*,");
}
bool isReserved(unsigned char c) {
    return oneOf(c, "&/:;=?@");
}
bool isPunctuation(unsigned char c) {
    return oneOf(c, "\"#%<>");
}
bool isNational(unsigned char c) {
    return oneOf(c, "[\\]^`{|}~");
}

bool NeedsURLEncoding(unsigned char c) {
    return !(isHiorLoAlpha(c) || isDig(c) || isSafe(c) || isExtra(c) || isNational(c) ||
             isReserved(c) || isPunctuation(c));
}

void URLencode(char* out, unsigned char c) {
    if (NeedsURLEncoding(c)) {
        writeEscape(out, c);
        return;
    }
    out[0] = static_cast<char>(c);
    out[1] = 0;
}

void URLSafeEncode(char* out, unsigned char c) {
    if (isHiorLoAlpha(c) || isDig(c) || oneOf(c, "$-_.+&")) {
        out[0] = static_cast<char>(c);
        out[1] = 0;
        return;
    }
    writeEscape(out, c);
}

void ElapsedTimeMessage(uint32_t seconds, CString256& text) {
    if (seconds == 0) {
        text = "0 secs";
        return;
    }
    appendUnit(text, seconds / 3600, " hr ", " hrs ");
    appendUnit(text, seconds % 3600 / 60, " min ", " mins ");
    appendUnit(text, seconds % 60, " sec ", " secs ");
}

QString DateDescription(const QDateTime& date) {
    // A mailing run shows the time twice a copy, most often within the same second: the text
    // last made is kept, with the second and offset it stands for.
    thread_local std::pair<qint64, int> described{0, 0};
    thread_local QString description;
    const std::pair<qint64, int> moment{date.toSecsSinceEpoch(), date.offsetFromUtc()};
    if (moment == described && !description.isNull())
        return description;
    const int offset = moment.second / 60;
    const int magnitude = offset < 0 ? -offset : offset;
    description = date.toString(QStringLiteral("yyyy-MM-dd HH:mm:ss ")) +
                  QLatin1Char(offset < 0 ? '-' : '+') +
                  QStringLiteral("%1%2")
                      .arg(magnitude / 60, 2, 10, QLatin1Char('0'))
                      .arg(magnitude % 60, 2, 10, QLatin1Char('0'));
    described = moment;
    return description;
}

QString MimeTypeForPath(const QString& path) {
    const QString fileName = QFileInfo(path).fileName();
    const qsizetype dot = fileName.lastIndexOf(QLatin1Char('.'));
    // A leading dot marks a hidden file, not an extension; a trailing one names none.
    if (dot <= 0 || dot == fileName.size() - 1)
        return {};
    const QList<QMimeType> types = QMimeDatabase().mimeTypesForFileName(fileName);
    return types.isEmpty() ? QString() : types.first().name();
}

bool IsAddrSpec(const QString& text) {
    // atext of RFC 5322 3.2.3 (with any non-ASCII character), qtext and quoted-pair of 3.2.4,
    // dtext of 3.4.1; \z, as $ would let a final line break through.
    static const QString atom =
        QStringLiteral(R"([A-Za-z0-9!#$%&'*+/=?^_`{|}~\x{80}-\x{10FFFF}-]+)");
    static const QString dotAtom = atom + QStringLiteral(R"((?:\.)") + atom + QStringLiteral(")*");
    static const QRegularExpression addrSpec(
        QStringLiteral(R"(\A(?:)") + dotAtom +
        QStringLiteral(
            R"(|"(?:[\x{20}\x{21}\x{23}-\x{5B}\x{5D}-\x{7E}\x{80}-\x{10FFFF}]|\\[\x{20}-\x{7E}])*"))") +
        QStringLiteral("@(?:") + dotAtom +
        QStringLiteral(R"(|\[[\x{21}-\x{5A}\x{5E}-\x{7E}]*\])\z)"));
    return addrSpec.match(text).hasMatch();
}

QString DecodeUtf8Strictly(const QByteArray& bytes) {
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    const QString text = decoder.decode(bytes);
    return decoder.hasError() ? QString() : text;
}
