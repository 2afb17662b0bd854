#include "controller/PreflightCheck.h"

#include "attachments/AttachmentsController.h"
#include "controller/MailSettings.h"
#include "controller/MessageTemplate.h"
#include "controller/PelmoView.h"
#include "util/LocalizedStrings.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>
#include <QSet>
#include <QTextDocument>

#include <cmath>

namespace {

using Finding = PreflightCheck::Finding;
using Kind = Finding::Kind;

// A word in braces is what a tag looks like; "{ }", "{}" and CSS rules ("{color: red}") are
// not, so they are never taken for a mistyped tag.
const QRegularExpression& tagLike() {
    static const QRegularExpression pattern(QStringLiteral("\\{([A-Za-z][A-Za-z0-9_]*)\\}"));
    return pattern;
}

// What a reader sees of a page: scripts, styles and comments hold braces of their own.
QString pageText(const QString& page) {
    static const QRegularExpression hidden(
        QStringLiteral("<script\\b.*?</script\\s*>|<style\\b.*?</style\\s*>|<!--.*?-->"),
        QRegularExpression::CaseInsensitiveOption | QRegularExpression::DotMatchesEverythingOption);
    return QString(page).remove(hidden);
}

bool isTag(const QString& word) {
    for (const char* tag : {"to", "toName", "from", "fromName", "subject"})
        if (word.compare(QLatin1String(tag), Qt::CaseInsensitive) == 0)
            return true;
    return false;
}

// Megabytes to one decimal, rounded towards the side that keeps "more than" true.
QString megabytes(qint64 bytes, bool up) {
    const double tenths = static_cast<double>(bytes) / (1024.0 * 1024.0) * 10.0;
    QString text = QString::number((up ? std::ceil(tenths) : std::floor(tenths)) / 10.0, 'f', 1);
    if (text.endsWith(QLatin1String(".0")))
        text.chop(2);
    return text;
}

} // namespace

PreflightCheck::PreflightCheck(const CopyPreview::Parts& parts, QObject* parent)
    : QObject(parent), m_parts(parts) {}

void PreflightCheck::start() {
    m_state = State::Checking;
    m_copy = new CopyPreview(m_parts, this);
    connect(m_copy, &CopyPreview::finished, this, [this] {
        m_copy->deleteLater();
        Input input;
        input.subject = m_parts.view.subject();
        input.body = m_parts.message.body()->toPlainText();
        input.page = m_copy->page();
        input.attachments = m_parts.attachments.getAttachments();
        // A copy that cannot be made halts the run with its own message; its size is unknown.
        if (m_copy->state() == CopyPreview::State::Ready) {
            input.messageBytes = m_copy->bytes().size();
            input.server = m_copy->request().server;
            input.serverLimit =
                m_parts.settings.sizeLimit(m_copy->request().server, m_copy->request().port);
        }
        input.pageAddress = m_copy->pageAddress();
        input.pageError = m_copy->pageError();
        m_findings = check(input);
        m_state = State::Done;
        Q_EMIT finished();
    });
    m_copy->start(1);
}

QList<Finding> PreflightCheck::check(const Input& input) {
    QList<Finding> found;
    if (input.subject.trimmed().isEmpty())
        found.append({Kind::EmptySubject, LocalizedStringNS("The subject is empty.")});
    QSet<QString> reported;
    for (const QString& text : {input.subject, input.body, pageText(input.page)}) {
        for (const QRegularExpressionMatch& match : tagLike().globalMatch(text)) {
            const QString word = match.captured(1);
            if (isTag(word) || reported.contains(word.toLower()))
                continue;
            reported.insert(word.toLower());
            found.append({Kind::UnknownTag,
                          LocalizedStringNS("\"%1\" is not a tag and goes out as written; the "
                                            "tags are {to}, {toName}, {from}, {fromName} and "
                                            "{subject}.")
                              .arg(match.captured(0))});
        }
    }
    for (const QString& path : input.attachments) {
        const QFileInfo file(path);
        QFile readable(path);
        if (!file.exists())
            found.append(
                {Kind::MissingAttachment, LocalizedStringNS("The attachment \"%1\" is missing.")
                                              .arg(QDir::toNativeSeparators(path))});
        else if (!file.isFile() || !readable.open(QIODevice::ReadOnly))
            found.append({Kind::UnreadableAttachment,
                          LocalizedStringNS("The attachment \"%1\" cannot be read.")
                              .arg(QDir::toNativeSeparators(path))});
    }
    // RFC 1870 4: a server that announced SIZE refuses a message larger than it.
    if (input.serverLimit > 0 && input.messageBytes > input.serverLimit)
        found.append({Kind::TooLargeForServer,
                      LocalizedStringNS("Each copy is %1 MB, more than the %2 MB that %3 accepts.")
                          .arg(megabytes(input.messageBytes, true),
                               megabytes(input.serverLimit, false), input.server)});
    else if (input.messageBytes > kCommonLimit)
        found.append({Kind::TooLarge,
                      LocalizedStringNS("Each copy is %1 MB, more than the 25 MB that many mail "
                                        "servers accept.")
                          .arg(megabytes(input.messageBytes, true))});
    if (!input.pageAddress.isEmpty())
        found.append(
            {Kind::PageNotAnswering, LocalizedStringNS("The web page %1 does not answer: %2")
                                         .arg(input.pageAddress, input.pageError)});
    return found;
}
