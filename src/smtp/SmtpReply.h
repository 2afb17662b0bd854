#pragma once

#include <QByteArray>
#include <QByteArrayView>
#include <QList>
#include <QStringList>

#include <optional>

/** One line of a server reply (RFC 5321 4.2): "code-text" goes on, "code text" is the last. */
struct SmtpReplyLine {
    int code = 0;
    QByteArray text; ///< after the code and its separator
    bool last = false;
};

/** A reply line without its line end; nullopt when it is not "3DIGIT [(SP / "-") text]". */
std::optional<SmtpReplyLine> ParseSmtpReplyLine(QByteArrayView line);

/** One whole server reply. */
struct SmtpReply {
    int code = 0;            ///< the last line's
    QList<QByteArray> lines; ///< the text of each line
    QByteArray raw;          ///< every line as received, line ends included
};

/**
 * Cuts what a server sends into replies. A line ends at LF (CRLF, or LF alone as some servers
 * write). A line that is not a reply line, or an unfinished reply above maxReplySize, is an
 * error after which the reader gives nothing more.
 */
class SmtpReplyReader {
public:
    enum class Error { None, Malformed, Overlong };

    // RFC 5321 4.5.3.1.5 allows 512 bytes a line; a reply this long without its last line is
    // not SMTP, and refusing it keeps a broken server from filling memory.
    static constexpr qsizetype maxReplySize = 64 * 1024;

    void feed(QByteArrayView bytes);
    /** The next whole reply; nullopt until more bytes come, and for good after an error. */
    std::optional<SmtpReply> next();
    Error error() const { return m_error; }
    /** The line that made the error Malformed, without its line end. */
    const QByteArray& malformedLine() const { return m_malformedLine; }
    /** Forgets everything fed and not yet taken. */
    void clear();

private:
    QByteArray m_buffer;
    qsizetype m_start = 0; // where the untaken bytes of m_buffer begin
    SmtpReply m_pending;
    Error m_error = Error::None;
    QByteArray m_malformedLine;
};

/** What a positive EHLO reply announces of what the client uses. */
struct SmtpCapabilities {
    QStringList mechanisms;  ///< AUTH (RFC 4954 3), upper-case, each once
    bool size = false;       ///< SIZE (RFC 1870)
    qint64 sizeLimit = 0;    ///< SIZE's limit in bytes; 0 for none
    bool smtpUtf8 = false;   ///< SMTPUTF8 (RFC 6531 3.2): addresses may be UTF-8
    bool pipelining = false; ///< PIPELINING (RFC 2920): commands may go without waiting

    static SmtpCapabilities fromEhlo(const SmtpReply& reply);
};
