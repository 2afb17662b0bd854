#include "smtp/Base64Lines.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>

namespace {

constexpr char kAlphabet[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

// The two characters of every 12 bits: a quantum of three bytes is two lookups.
constexpr auto kPairs = [] {
    std::array<std::array<char, 2>, 4096> pairs{};
    for (std::size_t bits = 0; bits < pairs.size(); ++bits)
        pairs[bits] = {kAlphabet[bits >> 6], kAlphabet[bits & 63]};
    return pairs;
}();

char* wholeQuantum(char* to, const unsigned char* from) {
    const std::uint32_t bits =
        std::uint32_t(from[0]) << 16 | std::uint32_t(from[1]) << 8 | std::uint32_t(from[2]);
    std::memcpy(to, kPairs[bits >> 12].data(), 2);
    std::memcpy(to + 2, kPairs[bits & 4095].data(), 2);
    return to + 4;
}

// The last one or two bytes, "=" standing for each one missing.
char* lastQuantum(char* to, const unsigned char* from, int count) {
    const std::uint32_t bits = std::uint32_t(from[0]) << 16 | std::uint32_t(count > 1 ? from[1] : 0)
                                                                  << 8;
    to[0] = kAlphabet[bits >> 18];
    to[1] = kAlphabet[(bits >> 12) & 63];
    to[2] = count > 1 ? kAlphabet[(bits >> 6) & 63] : '=';
    to[3] = '=';
    return to + 4;
}

} // namespace

// RFC 2045 6.8: "no more than 76 characters" a line, 19 quanta of 57 bytes. Every text part of
// every copy is encoded here, in one pass straight into its lines: QByteArray::toBase64 and a
// second pass to cut the lines took longer than GMime's encoder, which this replaces.
QByteArray EncodeBase64Lines(const QByteArray& bytes) {
    constexpr qsizetype bytesPerLine = 57;
    const qsizetype size = bytes.size();
    const qsizetype lines = (size + bytesPerLine - 1) / bytesPerLine;
    QByteArray out((size + 2) / 3 * 4 + lines, Qt::Uninitialized);
    const auto* from = reinterpret_cast<const unsigned char*>(bytes.constData());
    const unsigned char* const end = from + size;
    char* to = out.data();
    while (from < end) {
        const unsigned char* const lineEnd = from + std::min(bytesPerLine, qsizetype(end - from));
        for (; lineEnd - from >= 3; from += 3)
            to = wholeQuantum(to, from);
        if (from < lineEnd) {
            to = lastQuantum(to, from, int(lineEnd - from));
            from = lineEnd;
        }
        *to++ = '\n';
    }
    return out;
}
