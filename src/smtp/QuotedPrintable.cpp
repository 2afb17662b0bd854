#include "smtp/QuotedPrintable.h"

namespace {

// RFC 2045 6.7 (5): 76 characters a line; the last is kept for the soft break's "=".
constexpr qsizetype maxEncodedChars = 75;

// RFC 2045 6.7 (2), (3): printable ASCII but "=" stands for itself, and so do space and tab,
// except as the very last byte, where a transport may strip trailing white space.
bool standsForItself(unsigned char c, bool last) {
    if (c == ' ' || c == '\t')
        return !last;
    return c >= 33 && c <= 126 && c != '=';
}

// RFC 2045 6.7 (1): "=" and the byte in two upper-case hexadecimal digits.
void appendEscape(QByteArray& out, unsigned char c) {
    static const char digits[] = "0123456789ABCDEF";
    out += '=';
    out += digits[c >> 4];
    out += digits[c & 0x0f];
}

} // namespace

QByteArray EncodeQuotedPrintable(const QByteArray& bytes) {
    QByteArray out;
    out.reserve(bytes.size() * 3);
    qsizetype lineLength = 0;
    for (qsizetype i = 0; i < bytes.size(); ++i) {
        const auto c = static_cast<unsigned char>(bytes[i]);
        const bool literal = standsForItself(c, i + 1 == bytes.size());
        const qsizetype width = literal ? 1 : 3;
        // An escape is never split across a soft break.
        if (lineLength + width > maxEncodedChars) {
            out += "=\n";
            lineLength = 0;
        }
        if (literal)
            out += static_cast<char>(c);
        else
            appendEscape(out, c);
        lineLength += width;
    }
    return out;
}
