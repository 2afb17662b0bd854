// The SMTP reply reader on arbitrary server bytes, fed whole and in small pieces: both give the
// same replies, which are the input's lines cut where the reply ends, and what an EHLO reply
// announces is usable as it stands.

#include "FuzzSupport.h"

#include "smtp/SmtpReply.h"

#include <QRegularExpression>

#include <algorithm>

namespace {

struct Reading {
    QList<SmtpReply> replies;
    SmtpReplyReader::Error error;
};

Reading read(const QByteArray& input, qsizetype piece) {
    SmtpReplyReader reader;
    Reading reading;
    for (qsizetype at = 0; at < input.size(); at += piece) {
        reader.feed(QByteArrayView(input).sliced(at, std::min(piece, input.size() - at)));
        while (std::optional<SmtpReply> reply = reader.next())
            reading.replies += *reply;
    }
    reading.error = reader.error();
    return reading;
}

bool same(const SmtpReply& a, const SmtpReply& b) {
    return a.code == b.code && a.lines == b.lines && a.raw == b.raw;
}

// RFC 4422 3.1: a mechanism name is 1 to 20 upper-case letters, digits, hyphens and underscores.
bool isMechanismName(const QString& name) {
    static const QRegularExpression mechanism(QStringLiteral("^[A-Z0-9_-]{1,20}$"));
    return mechanism.match(name).hasMatch();
}

void checkCapabilities(const SmtpReply& reply) {
    const SmtpCapabilities capabilities = SmtpCapabilities::fromEhlo(reply);
    QStringList mechanisms = capabilities.mechanisms;
    fuzz::require(std::all_of(mechanisms.begin(), mechanisms.end(), isMechanismName),
                  "a mechanism that is no mechanism name");
    fuzz::require(mechanisms.removeDuplicates() == 0, "a mechanism listed twice");
    fuzz::require(capabilities.sizeLimit >= 0, "a negative size limit");
    fuzz::require(capabilities.size || capabilities.sizeLimit == 0, "a limit without SIZE");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const QByteArray input = fuzz::bytesOf(data, size);
    const Reading whole = read(input, std::max<qsizetype>(input.size(), 1));
    const Reading pieces = read(input, static_cast<qsizetype>(size % 7) + 1);
    fuzz::require(
        whole.error == pieces.error && whole.replies.size() == pieces.replies.size() &&
            std::equal(whole.replies.begin(), whole.replies.end(), pieces.replies.begin(), same),
        "the replies depend on how the bytes arrive");
    QByteArray taken;
    for (const SmtpReply& reply : whole.replies) {
        fuzz::require(reply.code >= 0 && reply.code <= 999, "a code of more than three digits");
        fuzz::require(reply.raw.endsWith('\n') && reply.raw.count('\n') == reply.lines.size(),
                      "the lines are not the reply's lines");
        taken += reply.raw;
        checkCapabilities(reply);
    }
    fuzz::require(input.startsWith(taken), "the replies are not the input's bytes");
    if (whole.error == SmtpReplyReader::Error::None)
        fuzz::require(input.size() - taken.size() <= SmtpReplyReader::maxReplySize,
                      "an unfinished reply beyond the limit");
    return 0;
}
