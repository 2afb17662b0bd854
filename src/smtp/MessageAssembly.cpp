#include "smtp/MessageAssembly.h"

#include "smtp/Base64Lines.h"
#include "smtp/EncodedAttachments.h"
#include "smtp/HtmlCharset.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/TextUtilities.h"

#include <QFileInfo>
#include <QRandomGenerator>
#include <QUrl>

#include <gmime/gmime.h>

#include <algorithm>
#include <cstring>
#include <utility>

namespace {

struct GObjectUnref {
    void operator()(gpointer object) const { g_object_unref(object); }
};
template <class T>
using GPointer = std::unique_ptr<T, GObjectUnref>;

struct FormatOptionsFree {
    void operator()(GMimeFormatOptions* options) const { g_mime_format_options_free(options); }
};

GMimeMessage* newMessage() {
    [[maybe_unused]] static const bool initialised = [] {
        g_mime_init();
        return true;
    }();
    return g_mime_message_new(TRUE);
}

// Boundaries and Message-IDs need to be unique, not secret: the process's generator, seeded
// once from the system, serves them, where GMime would open /dev/urandom for each.
QRandomGenerator& uniqueSource() {
    return *QRandomGenerator::global();
}

// GMime's own form, "=-" and 20 base64 characters (120 bits).
QByteArray newBoundary() {
    quint32 random[4];
    uniqueSource().fillRange(random);
    return "=-" + QByteArray(reinterpret_cast<const char*>(random), 15).toBase64();
}

GMimeMultipart* newMultipart(const char* subtype) {
    auto* multipart = static_cast<GMimeMultipart*>(g_object_new(GMIME_TYPE_MULTIPART, nullptr));
    const GPointer<GMimeContentType> type(g_mime_content_type_new("multipart", subtype));
    g_mime_object_set_content_type(GMIME_OBJECT(multipart), type.get());
    g_mime_multipart_set_boundary(multipart, newBoundary().constData());
    return multipart;
}

bool breaksHeaderLine(QChar c) {
    return c == QLatin1Char('\r') || c == QLatin1Char('\n') || c == QChar(u'\0');
}

bool breaksHeader(const QString& text) {
    return std::any_of(text.begin(), text.end(), breaksHeaderLine);
}

// RFC 5322 2.2: a header field is one line; a CR or LF in a value would end it and could start
// a header of the sender's making, and a NUL would cut GMime's C string short.
QByteArray headerText(const QString& text, const QString& what) {
    if (breaksHeader(text))
        throw PelmoException(QStringLiteral("BadHeaderText"),
                             LocalizedString("The %1 holds a line break or a null character, "
                                             "which cannot go into a mail header.")
                                 .arg(what));
    return text.toUtf8();
}

// The names of the header texts, as the refusals give them.
QString subjectWhat() {
    return LocalizedString("subject");
}
QString senderNameWhat() {
    return LocalizedString("sender's name");
}
QString senderWhat() {
    return LocalizedString("sender's address");
}
QString recipientNameWhat() {
    return LocalizedString("recipient's name");
}
QString recipientWhat() {
    return LocalizedString("recipient's address");
}

QString attachmentDescription(QString fileName) {
    std::replace_if(fileName.begin(), fileName.end(), breaksHeaderLine, QLatin1Char(' '));
    return LocalizedString("name of the attachment \"%1\"").arg(fileName);
}

QByteArray attachmentName(const QString& path) {
    const QString fileName = QFileInfo(path).fileName();
    return headerText(fileName, attachmentDescription(fileName));
}

// RFC 5322 3.6.4: a unique left part (128 random bits in base 36) and the sender's domain, as
// mailers do; an address without a usable domain (a local user, a domain literal) falls back to
// localhost.
QByteArray newMessageId(const QByteArray& domain) {
    const auto base36 = [](quint64 random) { return QByteArray::number(random, 36).toUpper(); };
    return base36(uniqueSource().generate64()) + '.' + base36(uniqueSource().generate64()) + '@' +
           domain;
}

QByteArray messageIdDomain(const QString& address) {
    const qsizetype at = address.lastIndexOf(QLatin1Char('@'));
    const QByteArray domain = at < 0 ? QByteArray() : QUrl::toAce(address.mid(at + 1));
    const bool usable = !domain.isEmpty() && std::all_of(domain.begin(), domain.end(), [](char c) {
        return isHiorLoAlpha(static_cast<unsigned char>(c)) ||
               isDig(static_cast<unsigned char>(c)) || c == '-' || c == '.';
    });
    return usable ? domain : QByteArrayLiteral("localhost");
}

// The charset parameter for each character-set setting index; other indexes name none.
const char* charsetParameter(int characterSetIndex) {
    switch (characterSetIndex) {
    case 0:
        return "utf-8";
    case 1:
        return "us-ascii";
    case 2:
        return "iso-8859-1";
    case 3:
        return "shift-jis";
    default:
        return nullptr;
    }
}

// RFC 2046 4.1.1: text travels with CRLF line breaks, whatever the editor or page used.
// Every copy passes through here: text with LF breaks only, as the editor and most pages give
// it, is copied a line at a time.
QString withCrlfLineEnds(const QString& text) {
    QString out;
    out.reserve(text.size() + text.size() / 32);
    qsizetype done = 0;
    if (!text.contains(QLatin1Char('\r'))) {
        for (qsizetype at = text.indexOf(QLatin1Char('\n')); at >= 0;
             at = text.indexOf(QLatin1Char('\n'), done)) {
            out += QStringView(text).mid(done, at - done);
            out += QLatin1String("\r\n");
            done = at + 1;
        }
        out += QStringView(text).mid(done);
        return out;
    }
    for (qsizetype at = 0; at < text.size(); ++at) {
        const QChar c = text.at(at);
        if (c != QLatin1Char('\r') && c != QLatin1Char('\n'))
            continue;
        out += QStringView(text).mid(done, at - done);
        out += QLatin1String("\r\n");
        if (c == QLatin1Char('\r') && at + 1 < text.size() && text.at(at + 1) == QLatin1Char('\n'))
            ++at;
        done = at + 1;
    }
    out += QStringView(text).mid(done);
    return out;
}

// RFC 2047 2, 4.2, 5: the subject in "Q" encoded words of whole characters, each on a line of
// its own that stays within 76 characters, the first one's "Subject: " included; as a raw
// header value, folded with "\n ".
QByteArray encodedSubject(const QString& text) {
    constexpr qsizetype maxEncodedText = 76 - 9 - 12; // "Subject: ", "=?UTF-8?Q?" and "?="
    QByteArray raw, word;
    const auto endWord = [&] {
        raw += " =?UTF-8?Q?" + word + "?=\n";
        word.clear();
    };
    for (const char32_t codePoint : text.toUcs4()) {
        QByteArray encoded;
        for (const char byte : QString::fromUcs4(&codePoint, 1).toUtf8()) {
            const auto c = static_cast<unsigned char>(byte);
            if (isHiorLoAlpha(c) || isDig(c) || QByteArrayView("!*+-/").contains(byte))
                encoded += byte;
            else if (c == ' ')
                encoded += '_';
            else
                encoded += '=' + QByteArray::number(c, 16).toUpper().rightJustified(2, '0');
        }
        if (word.size() + encoded.size() > maxEncodedText)
            endWord();
        word += encoded;
    }
    endWord();
    return raw;
}

// HTML keeps every character as a numeric character reference; the controller's HTML already
// holds them, a downloaded page may not. Other text can only mark the loss.
QByteArray bodyBytes(const QString& text, const QString& mimeType, int characterSetIndex) {
    const HtmlCharset charset = HtmlCharset::forIndex(characterSetIndex);
    const QString canonical = withCrlfLineEnds(text);
    const bool html = mimeType.compare(QLatin1String("text/html"), Qt::CaseInsensitive) == 0;
    return charset.encode(html ? charset.escapeUnencodable(canonical)
                               : charset.replaceUnencodable(canonical));
}

void setContentType(GMimePart* part, const QByteArray& mimeType) {
    const GPointer<GMimeContentType> type(g_mime_content_type_parse(nullptr, mimeType.constData()));
    g_mime_object_set_content_type(GMIME_OBJECT(part), type.get());
}

// What the parts carry, already encoded, kept out of GMime's tree: GMime would pass every byte
// of it through its line-end filter, a byte at a time, for every copy. The tree holds a marker
// in its place, which the written message has replaced by the content.
struct Contents {
    /** Random like a boundary, so that no header or file holds it by chance; and base64 and
     *  quoted-printable text never hold its "=-" at all. */
    QByteArray marker = newBoundary() + "-content-";
    QList<QByteArray> encoded;

    void set(GMimePart* part, const QByteArray& bytes, GMimeContentEncoding encodedAs) {
        encoded.append(bytes);
        const QByteArray placeholder = marker + QByteArray::number(encoded.size() - 1) + '.';
        const GPointer<GMimeStream> stream(g_mime_stream_mem_new_with_buffer(
            placeholder.constData(), static_cast<size_t>(placeholder.size())));
        const GPointer<GMimeDataWrapper> content(
            g_mime_data_wrapper_new_with_stream(stream.get(), encodedAs));
        g_mime_part_set_content(part, content.get());
        g_mime_part_set_content_encoding(part, encodedAs);
    }

    /** written, as GMime wrote it with LF line ends, with the contents in their places and
     *  CRLF line ends. */
    QByteArray placedIn(QByteArrayView written) const;
};

// RFC 5322 2.1: CRLF ends every line of a message; a CR already before an LF is kept, as
// GMime's own conversion keeps it. Runs between LFs are copied whole. Writes to to, or with
// to null only counts; answers the bytes written.
qsizetype withCrlf(QByteArrayView bytes, char* to, char& last) {
    qsizetype written = 0;
    const char* from = bytes.data();
    const char* const end = from + bytes.size();
    while (from < end) {
        const auto* lf = static_cast<const char*>(std::memchr(from, '\n', size_t(end - from)));
        const qsizetype run = (lf ? lf : end) - from;
        if (to)
            std::memcpy(to + written, from, size_t(run));
        written += run;
        if (run > 0)
            last = from[run - 1];
        if (!lf)
            break;
        if (last != '\r') {
            if (to)
                to[written] = '\r';
            ++written;
        }
        if (to)
            to[written] = '\n';
        ++written;
        last = '\n';
        from = lf + 1;
    }
    return written;
}

QByteArray Contents::placedIn(QByteArrayView written) const {
    // The pieces in order: the message as written, cut at the markers, and each content.
    QList<QByteArrayView> pieces;
    qsizetype done = 0;
    for (qsizetype at = written.indexOf(marker); at >= 0; at = written.indexOf(marker, done)) {
        pieces << written.sliced(done, at - done);
        const qsizetype number = at + marker.size();
        const qsizetype dot = written.indexOf('.', number);
        pieces << QByteArrayView(encoded.at(written.sliced(number, dot - number).toInt()));
        done = dot + 1;
    }
    pieces << written.sliced(done);
    // Measured first, then written straight into their place: a copy may be megabytes.
    qsizetype size = 0;
    char last = 0;
    for (const QByteArrayView piece : pieces)
        size += withCrlf(piece, nullptr, last);
    QByteArray out(size, Qt::Uninitialized);
    qsizetype at = 0;
    last = 0;
    for (const QByteArrayView piece : pieces)
        at += withCrlf(piece, out.data() + at, last);
    return out;
}

// A base64 text part, as addBodyPart() describes it.
GPointer<GMimePart> bodyPart(const QString& text, const QString& mimeType, int characterSetIndex,
                             Contents& contents) {
    GPointer<GMimePart> part(g_mime_part_new());
    setContentType(part.get(), headerText(mimeType, LocalizedString("content type")));
    if (const char* charset = charsetParameter(characterSetIndex))
        g_mime_object_set_content_type_parameter(GMIME_OBJECT(part.get()), "charset", charset);
    // Encoded here: GMime's encoder takes several times as long, for the same lines.
    contents.set(part.get(), EncodeBase64Lines(bodyBytes(text, mimeType, characterSetIndex)),
                 GMIME_CONTENT_ENCODING_BASE64);
    return part;
}

} // namespace

struct MessageAssembly::Message {
    GPointer<GMimeMessage> mime{newMessage()};
    GPointer<GMimeMultipart> parts{newMultipart("mixed")};
    QString sender;
    QString recipient;
    Contents contents;

    void setMailbox(GMimeAddressType type, const QString& name, const QString& address,
                    const QString& nameWhat, const QString& addressWhat);
    /** The name's and the address's header texts; throws as setMailbox() describes. */
    static std::pair<QByteArray, QByteArray> mailboxText(const QString& name,
                                                         const QString& address,
                                                         const QString& nameWhat,
                                                         const QString& addressWhat);
};

std::pair<QByteArray, QByteArray>
MessageAssembly::Message::mailboxText(const QString& name, const QString& address,
                                      const QString& nameWhat, const QString& addressWhat) {
    QByteArray nameText = headerText(name.trimmed(), nameWhat);
    QByteArray addressText = headerText(address, addressWhat);
    if (address.isEmpty())
        throw PelmoException(QStringLiteral("BadAddress"),
                             LocalizedString("The %1 is empty.").arg(addressWhat));
    return {nameText, addressText};
}

// Both checks come before the list is touched, so a refused mailbox leaves the old one.
void MessageAssembly::Message::setMailbox(GMimeAddressType type, const QString& name,
                                          const QString& address, const QString& nameWhat,
                                          const QString& addressWhat) {
    const auto [nameText, addressText] = mailboxText(name, address, nameWhat, addressWhat);
    InternetAddressList* list = g_mime_message_get_addresses(mime.get(), type);
    internet_address_list_clear(list);
    const GPointer<InternetAddress> mailbox(internet_address_mailbox_new(
        nameText.isEmpty() ? nullptr : nameText.constData(), addressText.constData()));
    internet_address_list_add(list, mailbox.get());
}

MessageAssembly::MessageAssembly() : message(std::make_unique<Message>()) {
    g_mime_message_set_mime_part(message->mime.get(), GMIME_OBJECT(message->parts.get()));
    // RFC 5322 3.6.1: the time the message was made, with the local offset.
    GDateTime* now = g_date_time_new_now_local();
    g_mime_message_set_date(message->mime.get(), now);
    g_date_time_unref(now);
}

MessageAssembly::~MessageAssembly() = default;

void MessageAssembly::checkHeaders(const QString& subject, const QString& senderName,
                                   const QString& sender, const QString& recipientName,
                                   const QString& recipient, const QStringList& attachments) {
    headerText(subject, subjectWhat());
    Message::mailboxText(senderName, sender, senderNameWhat(), senderWhat());
    Message::mailboxText(recipientName, recipient, recipientNameWhat(), recipientWhat());
    for (const QString& path : attachments)
        attachmentName(path);
}

void MessageAssembly::setSubject(const QString& subject) {
    // No charset given: GMime picks the smallest that holds the text for RFC 2047 words.
    g_mime_message_set_subject(message->mime.get(), headerText(subject, subjectWhat()).constData(),
                               nullptr);
    // Text that looks like an encoded word must be encoded itself, or readers would decode it;
    // GMime does, but folds inside its words when they are long, which breaks them for every
    // reader. Such a subject is written here instead.
    if (subject.contains(QLatin1String("=?")))
        g_mime_header_set_raw_value(
            g_mime_header_list_get_header(
                g_mime_object_get_header_list(GMIME_OBJECT(message->mime.get())), "Subject"),
            encodedSubject(subject).constData());
}

void MessageAssembly::setFrom(const QString& name, const QString& address) {
    message->setMailbox(GMIME_ADDRESS_TYPE_FROM, name, address, senderNameWhat(), senderWhat());
    message->sender = address;
    g_mime_message_set_message_id(message->mime.get(),
                                  newMessageId(messageIdDomain(address)).constData());
}

void MessageAssembly::setTo(const QString& name, const QString& address) {
    message->setMailbox(GMIME_ADDRESS_TYPE_TO, name, address, recipientNameWhat(), recipientWhat());
    message->recipient = address;
}

void MessageAssembly::addBodyPart(const QString& text, const QString& mimeType,
                                  int characterSetIndex) {
    g_mime_multipart_add(
        message->parts.get(),
        GMIME_OBJECT(bodyPart(text, mimeType, characterSetIndex, message->contents).get()));
}

void MessageAssembly::addAlternativeBodyParts(const QString& plain, const QString& html,
                                              int characterSetIndex) {
    const GPointer<GMimeMultipart> alternative(newMultipart("alternative"));
    g_mime_multipart_add(alternative.get(),
                         GMIME_OBJECT(bodyPart(plain, QStringLiteral("text/plain"),
                                               characterSetIndex, message->contents)
                                          .get()));
    g_mime_multipart_add(alternative.get(),
                         GMIME_OBJECT(bodyPart(html, QStringLiteral("text/html"), characterSetIndex,
                                               message->contents)
                                          .get()));
    g_mime_multipart_add(message->parts.get(), GMIME_OBJECT(alternative.get()));
}

bool MessageAssembly::setListUnsubscribe(const QString& address) {
    const QUrl url(address.trimmed(), QUrl::StrictMode);
    const QString scheme = url.scheme().toLower();
    if (!url.isValid() || (scheme != QLatin1String("mailto") && scheme != QLatin1String("https")))
        return false;
    const QByteArray value = '<' + url.toEncoded() + '>';
    // RFC 5322 2.1.1: 998 characters a line at most; a URL has no space to fold at.
    if (value.size() > 998 - qsizetype(sizeof "List-Unsubscribe: ") + 1)
        return false;
    GMimeObject* top = GMIME_OBJECT(message->mime.get());
    g_mime_object_set_header(top, "List-Unsubscribe", value.constData(), nullptr);
    // RFC 2369 2: readers look for the URL in angle brackets. GMime would fold a long one into
    // RFC 2047 encoded words, which no reader decodes in this header; it goes on one line.
    g_mime_header_set_raw_value(
        g_mime_header_list_get_header(g_mime_object_get_header_list(top), "List-Unsubscribe"),
        (' ' + value + '\n').constData());
    if (scheme == QLatin1String("https"))
        g_mime_object_set_header(top, "List-Unsubscribe-Post", "List-Unsubscribe=One-Click",
                                 nullptr);
    return true;
}

bool MessageAssembly::addAttachment(const QString& path) {
    return attach(path, EncodedAttachments::read(path));
}

bool MessageAssembly::addAttachment(const QString& path, EncodedAttachments& encoded) {
    return attach(path, encoded.quotedPrintable(path));
}

bool MessageAssembly::attach(const QString& path, const std::optional<QByteArray>& encoded) {
    if (!encoded)
        return false;
    const QByteArray name = attachmentName(path);
    const GPointer<GMimePart> part(g_mime_part_new());
    if (const QString type = MimeTypeForPath(path); !type.isNull())
        setContentType(part.get(), type.toUtf8());
    g_mime_part_set_filename(part.get(), name.constData());
    // Encoded by us rather than by GMime, whose encoder writes LF bytes as line breaks, which
    // a reader decodes as CRLF: binary files would not arrive as they left.
    message->contents.set(part.get(), *encoded, GMIME_CONTENT_ENCODING_QUOTEDPRINTABLE);
    g_mime_multipart_add(message->parts.get(), GMIME_OBJECT(part.get()));
    return true;
}

QByteArray MessageAssembly::toBytes() const {
    if (message->sender.isEmpty() || message->recipient.isEmpty())
        throw PelmoException(QStringLiteral("IncompleteMessage"),
                             LocalizedString("The message has no sender or no recipient."));
    const std::unique_ptr<GMimeFormatOptions, FormatOptionsFree> options(
        g_mime_format_options_new());
    // RFC 2231 3, 4: long and non-ASCII file names split and percent-encoded.
    g_mime_format_options_set_param_encoding_method(options.get(),
                                                    GMIME_PARAM_ENCODING_METHOD_RFC2231);
    const GPointer<GMimeStream> stream(g_mime_stream_mem_new());
    g_mime_object_write_to_stream(GMIME_OBJECT(message->mime.get()), options.get(), stream.get());
    const GByteArray* bytes = g_mime_stream_mem_get_byte_array(GMIME_STREAM_MEM(stream.get()));
    return message->contents.placedIn(
        QByteArrayView(bytes->data, static_cast<qsizetype>(bytes->len)));
}

QString MessageAssembly::envelopeSender() const {
    return message->sender;
}

QString MessageAssembly::messageId() const {
    return QString::fromUtf8(g_mime_message_get_message_id(message->mime.get()));
}

QStringList MessageAssembly::envelopeRecipients() const {
    return message->recipient.isEmpty() ? QStringList() : QStringList{message->recipient};
}
