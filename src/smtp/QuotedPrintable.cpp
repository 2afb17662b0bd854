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

} // namespace

QByteArray EncodeQuotedPrintable(const QByteArray& bytes) {
    static const char digits[] = "0123456789ABCDEF";
    // Written through a pointer into a buffer sized for the worst case: every byte escaped, and
    // a soft break at least every 73 characters. An attachment goes through here for every copy.
    const qsizetype n = bytes.size();
    QByteArray out(3 * n + 2 * (3 * n / (maxEncodedChars - 2) + 1), Qt::Uninitialized);
    char* to = out.data();
    qsizetype lineLength = 0;
    for (qsizetype i = 0; i < n; ++i) {
        const auto c = static_cast<unsigned char>(bytes[i]);
        const bool literal = standsForItself(c, i + 1 == n);
        const qsizetype width = literal ? 1 : 3;
        // An escape is never split across a soft break.
        if (lineLength + width > maxEncodedChars) {
            *to++ = '=';
            *to++ = '\n';
            lineLength = 0;
        }
        if (literal) {
            *to++ = static_cast<char>(c);
        } else { // RFC 2045 6.7 (1): "=" and the byte in two upper-case hexadecimal digits.
            *to++ = '=';
            *to++ = digits[c >> 4];
            *to++ = digits[c & 0x0f];
        }
        lineLength += width;
    }
    out.truncate(to - out.constData());
    return out;
}
