// A downloaded page's bytes become text: the input's first line is the Content-Type header,
// the rest the page. Every page gives a text (Mac OS Roman reads any byte); valid UTF-8 is read
// as UTF-8; and a page in the charset its header declares reads as a whole conversion by iconv
// reads it.

#include "FuzzSupport.h"

#include "browser/PageDownload.h"

#include <QRegularExpression>

#include <iconv.h>

#include <optional>

namespace {

// The plain conversion: one call into room that no charset fills (iconv's decoders do not all
// resume a sequence cut by a full buffer), then the decoder's pending state flushed.
std::optional<QByteArray> iconvUtf8(const QByteArray& bytes, const QByteArray& charset) {
    const iconv_t cd = iconv_open("UTF-8", charset.constData());
    if (cd == reinterpret_cast<iconv_t>(-1))
        return std::nullopt;
    QByteArray out(bytes.size() * 64 + 64, '\0');
    char* in = const_cast<char*>(bytes.constData());
    char* to = out.data();
    size_t inLeft = static_cast<size_t>(bytes.size()), toLeft = static_cast<size_t>(out.size());
    const bool ok = iconv(cd, &in, &inLeft, &to, &toLeft) != static_cast<size_t>(-1) &&
                    iconv(cd, nullptr, nullptr, &to, &toLeft) != static_cast<size_t>(-1);
    iconv_close(cd);
    out.truncate(to - out.data());
    return ok ? std::optional(out) : std::nullopt;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const QByteArray input = fuzz::bytesOf(data, size);
    const qsizetype newline = input.indexOf('\n');
    const QString contentType = QString::fromLatin1(input.left(newline < 0 ? 0 : newline));
    const QByteArray page = newline < 0 ? input : input.mid(newline + 1);
    const QString text = DecodePage(page, contentType);
    fuzz::require(!text.isNull(), "a page without text");
    const QString utf8 = QString::fromUtf8(page);
    if (utf8.toUtf8() == page) {
        fuzz::require(text == utf8, "valid UTF-8 not read as UTF-8");
        return 0;
    }
    static const QRegularExpression declared(
        QStringLiteral(R"(^text/html; charset=([A-Za-z0-9._:-]+)$)"));
    const QRegularExpressionMatch match = declared.match(contentType);
    if (!match.hasMatch())
        return 0;
    const std::optional<QByteArray> converted = iconvUtf8(page, match.captured(1).toLatin1());
    if (converted)
        fuzz::require(text == QString::fromUtf8(*converted),
                      "the declared charset reads otherwise");
    return 0;
}
