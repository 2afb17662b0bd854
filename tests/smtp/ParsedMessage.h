#pragma once

#include <QByteArray>
#include <QString>

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

/** One leaf part of a parsed message, as a receiving mail reader sees it. */
struct ParsedPart {
    /** The Content-Type header's type ("text/html"); empty when the part has no such header. */
    std::string mimeType;
    std::optional<std::string> charset;
    /** "base64", "quoted-printable", ... */
    std::string transferEncoding;
    /** The file name, RFC 2231 / RFC 2047 decoded. */
    std::optional<QString> fileName;
    /** The content with its transfer encoding undone. */
    QByteArray content;
};

/** A message read back with GMime's parser, the way a receiving client reads it. */
struct ParsedMessage {
    /** Parses bytes; the result's parsed is false when GMime finds no message. */
    static ParsedMessage parse(const QByteArray& bytes);

    bool parsed = false;
    std::string mimeType;
    std::optional<std::string> transferEncoding;
    std::optional<std::string> mimeVersion;
    std::optional<std::string> messageId;
    /** Seconds since 1970, when there is a Date header. */
    std::optional<int64_t> date;
    /** Decoded (RFC 2047). */
    QString subject;
    QString fromName;
    QString fromAddress;
    int toCount = 0;
    QString toName;
    QString toAddress;
    /** The leaves of the top-level multipart, in order. */
    std::vector<ParsedPart> parts;
};
