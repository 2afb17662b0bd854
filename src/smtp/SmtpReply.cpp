#include "smtp/SmtpReply.h"

#include <algorithm>
#include <utility>

namespace {

QByteArrayView withoutLineEnd(QByteArrayView line) {
    while (line.endsWith('\n') || line.endsWith('\r'))
        line.chop(1);
    return line;
}

// RFC 4422 3.1: 1 to 20 upper-case letters, digits, hyphens and underscores. Anything else is
// no mechanism Pelmo could ask for, and would reach the status line as the server wrote it.
bool isMechanismName(const QString& word) {
    return word.size() <= 20 && std::all_of(word.begin(), word.end(), [](QChar c) {
               return (c >= QLatin1Char('A') && c <= QLatin1Char('Z')) ||
                      (c >= QLatin1Char('0') && c <= QLatin1Char('9')) || c == QLatin1Char('-') ||
                      c == QLatin1Char('_');
           });
}

// The words of an EHLO line in upper case, between spaces and "=" signs: some servers still
// write the pre-standard "AUTH=LOGIN PLAIN". Every copy's session reads these lines.
QList<QByteArray> ehloWords(const QByteArray& line) {
    QList<QByteArray> words;
    qsizetype start = 0;
    for (qsizetype at = 0; at <= line.size(); ++at) {
        if (at < line.size() && line[at] != ' ' && line[at] != '=')
            continue;
        if (at > start)
            words.append(line.sliced(start, at - start).toUpper());
        start = at + 1;
    }
    return words;
}

} // namespace

// RFC 5321 4.2: Reply-line = *( Reply-code "-" [ textstring ] CRLF )
//                            Reply-code [ SP textstring ] CRLF
std::optional<SmtpReplyLine> ParseSmtpReplyLine(QByteArrayView line) {
    if (line.size() < 3 ||
        !std::all_of(line.begin(), line.begin() + 3, [](char c) { return c >= '0' && c <= '9'; }))
        return std::nullopt;
    if (line.size() > 3 && line[3] != ' ' && line[3] != '-')
        return std::nullopt;
    return SmtpReplyLine{(line[0] - '0') * 100 + (line[1] - '0') * 10 + (line[2] - '0'),
                         line.sliced(std::min<qsizetype>(line.size(), 4)).toByteArray(),
                         line.size() == 3 || line[3] == ' '};
}

void SmtpReplyReader::feed(QByteArrayView bytes) {
    m_buffer.remove(0, std::exchange(m_start, 0));
    m_buffer += bytes;
}

std::optional<SmtpReply> SmtpReplyReader::next() {
    while (m_error == Error::None) {
        const qsizetype end = m_buffer.indexOf('\n', m_start);
        if (end < 0) {
            if (m_pending.raw.size() + m_buffer.size() - m_start > maxReplySize)
                m_error = Error::Overlong;
            return std::nullopt;
        }
        const QByteArrayView raw = QByteArrayView(m_buffer).sliced(m_start, end + 1 - m_start);
        m_start = end + 1;
        m_pending.raw += raw;
        const std::optional<SmtpReplyLine> line = ParseSmtpReplyLine(withoutLineEnd(raw));
        if (!line) {
            m_error = Error::Malformed;
            m_malformedLine = withoutLineEnd(raw).toByteArray();
            return std::nullopt;
        }
        m_pending.lines += line->text;
        if (line->last) {
            m_pending.code = line->code;
            return std::exchange(m_pending, {});
        }
    }
    return std::nullopt;
}

void SmtpReplyReader::clear() {
    m_buffer.clear();
    m_start = 0;
    m_pending = {};
}

// RFC 5321 4.1.1.1: every line after the first of a 250 EHLO reply is "keyword [params]".
SmtpCapabilities SmtpCapabilities::fromEhlo(const SmtpReply& reply) {
    SmtpCapabilities capabilities;
    for (qsizetype i = 1; i < reply.lines.size(); ++i) {
        const QList<QByteArray> words = ehloWords(reply.lines[i]);
        if (words.isEmpty())
            continue;
        if (words[0] == "AUTH") {
            for (const QByteArray& word : words.mid(1))
                if (const QString mechanism = QString::fromLatin1(word);
                    isMechanismName(mechanism) && !capabilities.mechanisms.contains(mechanism))
                    capabilities.mechanisms += mechanism;
        } else if (words[0] == "SIZE") {
            // RFC 1870 4: SIZE without a number, or 0, means no fixed limit; a negative one
            // is no limit either.
            capabilities.size = true;
            capabilities.sizeLimit = words.size() > 1 ? std::max(words[1].toLongLong(), 0LL) : 0;
        } else if (words[0] == "SMTPUTF8") {
            capabilities.smtpUtf8 = true;
        } else if (words[0] == "PIPELINING") {
            capabilities.pipelining = true;
        }
    }
    return capabilities;
}
