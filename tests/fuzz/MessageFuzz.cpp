// MessageAssembly fed arbitrary header fields and body parts. Every call either takes its text
// or refuses it with PelmoException, exactly when a header text holds CR, LF or NUL or an
// address is empty; the message it writes has CRLF line ends only, no line above RFC 5322
// 2.1.1's 998 characters, no header field but its own, a subject that reads back as it was
// given, and the parts GMime finds.

#include "FuzzSupport.h"

#include "smtp/MessageAssembly.h"
#include "util/PelmoException.h"

#include <QSet>
#include <fuzzer/FuzzedDataProvider.h>
#include <gmime/gmime.h>

#include <algorithm>
#include <functional>
#include <memory>

namespace {

// UTF-8 as editors write it, or UTF-16 code units for what UTF-8 cannot carry (lone
// surrogates).
QString text(FuzzedDataProvider& in, size_t maxBytes) {
    const bool utf8 = in.ConsumeBool();
    const std::string bytes = in.ConsumeRandomLengthString(maxBytes);
    if (utf8)
        return QString::fromStdString(bytes);
    QString units;
    for (size_t i = 0; i + 1 < bytes.size(); i += 2)
        units += QChar(static_cast<char16_t>(static_cast<unsigned char>(bytes[i]) << 8 |
                                             static_cast<unsigned char>(bytes[i + 1])));
    return units;
}

bool breaksHeader(const QString& text) {
    return text.contains(QLatin1Char('\r')) || text.contains(QLatin1Char('\n')) ||
           text.contains(QChar(u'\0'));
}

// Runs the call and requires a refusal exactly when one is due.
void call(bool refusalDue, const std::function<void()>& function) {
    bool refused = false;
    try {
        function();
    } catch (const PelmoException&) {
        refused = true;
    }
    fuzz::require(refused == refusalDue, refusalDue ? "bad text taken" : "good text refused");
}

void checkLines(const QByteArray& message) {
    qsizetype lineStart = 0;
    for (qsizetype i = 0; i < message.size(); ++i) {
        if (message[i] == '\r')
            fuzz::require(i + 1 < message.size() && message[i + 1] == '\n', "a bare CR");
        if (message[i] != '\n')
            continue;
        fuzz::require(i > 0 && message[i - 1] == '\r', "a bare LF");
        fuzz::require(i - 1 - lineStart <= 998, "a line above 998 characters");
        lineStart = i + 1;
    }
    fuzz::require(lineStart == message.size(), "the message does not end with a line end");
}

// Any other field in the message's own header was made by a field's text; and the header is
// ASCII, its non-ASCII text encoded, unless an address is not.
void checkHeaderFields(const QByteArray& message, bool asciiAddresses) {
    static const QSet<QByteArray> ours = {"date",       "from",         "to",          "subject",
                                          "message-id", "mime-version", "content-type"};
    const qsizetype end = message.indexOf("\r\n\r\n");
    fuzz::require(end > 0, "no header");
    fuzz::require(!asciiAddresses || std::all_of(message.begin(), message.begin() + end,
                                                 [](char c) { return c > 0; }),
                  "8-bit header text");
    for (const QByteArray& line : message.left(end).split('\n')) {
        if (line.startsWith(' ') || line.startsWith('\t'))
            continue;
        fuzz::require(ours.contains(line.left(line.indexOf(':')).toLower()),
                      "a header field of the text's making");
    }
}

// The Subject field as RFC 2047 6.2 reads it: each encoded word decoded on its own, the space
// between two of them dropped. (GMime's reader joins the base64 of neighbouring words in one
// character set, and so loses what follows a padded word; other readers do not.)
QString subjectOf(const QByteArray& message) {
    const qsizetype start = message.indexOf("\r\nSubject: ");
    if (start < 0)
        return {};
    qsizetype end = start + 2;
    do
        end = message.indexOf("\r\n", end) + 2;
    while (message[end] == ' ' || message[end] == '\t');
    const QByteArray value = message.mid(start + 11, end - start - 13).replace("\r\n", "");
    QString subject;
    bool afterWord = false;
    for (const QByteArray& token : value.simplified().split(' ')) {
        const bool word = token.startsWith("=?") && token.endsWith("?=");
        if (!(word && afterWord))
            subject += QLatin1Char(' ');
        if (word) {
            char* decoded = g_mime_utils_header_decode_text(nullptr, token.constData());
            subject += QString::fromUtf8(decoded);
            g_free(decoded);
        } else {
            subject += QString::fromUtf8(token);
        }
        afterWord = word;
    }
    return subject;
}

struct GObjectUnref {
    void operator()(gpointer object) const { g_object_unref(object); }
};

void checkReadBack(const QByteArray& message, const QString& subject, int parts) {
    const std::unique_ptr<GMimeStream, GObjectUnref> stream(g_mime_stream_mem_new_with_buffer(
        message.constData(), static_cast<size_t>(message.size())));
    const std::unique_ptr<GMimeParser, GObjectUnref> parser(
        g_mime_parser_new_with_stream(stream.get()));
    const std::unique_ptr<GMimeMessage, GObjectUnref> mime(
        g_mime_parser_construct_message(parser.get(), nullptr));
    fuzz::require(mime != nullptr, "GMime finds no message");
    // UTF-8 cannot carry a lone surrogate: it goes as U+FFFD.
    fuzz::require(subjectOf(message).simplified() ==
                      QString::fromUtf8(subject.toUtf8()).simplified(),
                  "the subject does not read back");
    GMimeObject* top = g_mime_message_get_mime_part(mime.get());
    fuzz::require(GMIME_IS_MULTIPART(top) &&
                      g_mime_multipart_get_count(GMIME_MULTIPART(top)) == parts,
                  "the parts do not read back");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FuzzedDataProvider in(data, size);
    MessageAssembly message;
    QString subject;
    const QString wantedSubject = text(in, 200);
    call(breaksHeader(wantedSubject), [&] {
        message.setSubject(wantedSubject);
        subject = wantedSubject;
    });
    bool addressed = true, asciiAddresses = true;
    for (const auto setMailbox : {&MessageAssembly::setFrom, &MessageAssembly::setTo}) {
        const QString name = text(in, 100), address = text(in, 100);
        // Line breaks around a name are trimmed away with the other white space.
        const bool due = breaksHeader(name.trimmed()) || breaksHeader(address) || address.isEmpty();
        call(due, [&] { (message.*setMailbox)(name, address); });
        addressed = addressed && !due;
        asciiAddresses = asciiAddresses && std::all_of(address.begin(), address.end(),
                                                       [](QChar c) { return c.unicode() < 0x80; });
    }
    int parts = 0;
    while (parts < 3 && in.ConsumeBool()) {
        const QString mimeType = in.ConsumeBool()   ? text(in, 40)
                                 : in.ConsumeBool() ? QStringLiteral("text/html")
                                                    : QStringLiteral("text/plain");
        const int charsetIndex = in.ConsumeIntegralInRange(-1, 4);
        const QString body = text(in, 4000);
        call(breaksHeader(mimeType), [&] {
            message.addBodyPart(body, mimeType, charsetIndex);
            ++parts;
        });
    }
    QByteArray bytes;
    call(!addressed, [&] { bytes = message.toBytes(); });
    if (!addressed)
        return 0;
    checkLines(bytes);
    checkHeaderFields(bytes, asciiAddresses);
    checkReadBack(bytes, subject, parts);
    return 0;
}
