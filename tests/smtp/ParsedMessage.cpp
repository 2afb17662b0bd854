#include "smtp/ParsedMessage.h"

#include <gmime/gmime.h>

#include <memory>

namespace {

struct GObjectUnref {
    void operator()(gpointer object) const { g_object_unref(object); }
};
template <class T>
using GPointer = std::unique_ptr<T, GObjectUnref>;

std::optional<std::string> text(const char* value) {
    if (value == nullptr)
        return std::nullopt;
    return std::string(value);
}

std::string takeText(char* value) {
    std::string result = value == nullptr ? std::string() : std::string(value);
    g_free(value);
    return result;
}

void readMailbox(InternetAddressList* list, QString& name, QString& address) {
    if (list == nullptr || internet_address_list_length(list) == 0)
        return;
    InternetAddress* first = internet_address_list_get_address(list, 0);
    name = QString::fromUtf8(internet_address_get_name(first));
    if (INTERNET_ADDRESS_IS_MAILBOX(first))
        address =
            QString::fromUtf8(internet_address_mailbox_get_addr(INTERNET_ADDRESS_MAILBOX(first)));
}

QByteArray decodedContent(GMimePart* part) {
    GMimeDataWrapper* content = g_mime_part_get_content(part);
    if (content == nullptr)
        return {};
    const GPointer<GMimeStream> stream(g_mime_stream_mem_new());
    g_mime_data_wrapper_write_to_stream(content, stream.get());
    const GByteArray* bytes = g_mime_stream_mem_get_byte_array(GMIME_STREAM_MEM(stream.get()));
    return QByteArray(reinterpret_cast<const char*>(bytes->data),
                      static_cast<qsizetype>(bytes->len));
}

ParsedPart readPart(GMimeObject* object) {
    ParsedPart part;
    if (g_mime_object_get_header(object, "Content-Type") != nullptr)
        part.mimeType =
            takeText(g_mime_content_type_get_mime_type(g_mime_object_get_content_type(object)));
    part.charset = text(g_mime_object_get_content_type_parameter(object, "charset"));
    if (!GMIME_IS_PART(object))
        return part;
    GMimePart* leaf = GMIME_PART(object);
    part.transferEncoding =
        g_mime_content_encoding_to_string(g_mime_part_get_content_encoding(leaf));
    if (const char* fileName = g_mime_part_get_filename(leaf))
        part.fileName = QString::fromUtf8(fileName);
    part.content = decodedContent(leaf);
    return part;
}

void readTop(GMimeMessage* mime, ParsedMessage& message) {
    GMimeObject* top = g_mime_message_get_mime_part(mime);
    if (top == nullptr)
        return;
    message.mimeType =
        takeText(g_mime_content_type_get_mime_type(g_mime_object_get_content_type(top)));
    message.transferEncoding = text(g_mime_object_get_header(top, "Content-Transfer-Encoding"));
    if (!GMIME_IS_MULTIPART(top))
        return;
    GMimeMultipart* multipart = GMIME_MULTIPART(top);
    for (int i = 0; i < g_mime_multipart_get_count(multipart); ++i)
        message.parts.push_back(readPart(g_mime_multipart_get_part(multipart, i)));
}

} // namespace

ParsedMessage ParsedMessage::parse(const QByteArray& bytes) {
    [[maybe_unused]] static const bool initialised = [] {
        g_mime_init();
        return true;
    }();
    ParsedMessage message;
    const GPointer<GMimeStream> stream(
        g_mime_stream_mem_new_with_buffer(bytes.constData(), static_cast<size_t>(bytes.size())));
    const GPointer<GMimeParser> parser(g_mime_parser_new_with_stream(stream.get()));
    const GPointer<GMimeMessage> mime(g_mime_parser_construct_message(parser.get(), nullptr));
    if (mime == nullptr)
        return message;
    message.parsed = true;
    message.mimeVersion = text(g_mime_object_get_header(GMIME_OBJECT(mime.get()), "MIME-Version"));
    message.messageId = text(g_mime_message_get_message_id(mime.get()));
    if (GDateTime* date = g_mime_message_get_date(mime.get()))
        message.date = g_date_time_to_unix(date);
    message.subject = QString::fromUtf8(g_mime_message_get_subject(mime.get()));
    readMailbox(g_mime_message_get_from(mime.get()), message.fromName, message.fromAddress);
    InternetAddressList* to = g_mime_message_get_to(mime.get());
    message.toCount = to == nullptr ? 0 : internet_address_list_length(to);
    readMailbox(to, message.toName, message.toAddress);
    readTop(mime.get(), message);
    return message;
}
