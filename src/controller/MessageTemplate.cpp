#include "controller/MessageTemplate.h"

#include "controller/MailSettings.h"
#include "controller/PelmoView.h"
#include "smtp/HtmlCharset.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QTextCursor>
#include <QTextDocument>

#include <algorithm>
#include <cstring>
#include <iterator>

namespace {

// Each tag and the getter whose value replaces it. A row is all a new tag takes.
struct Tag {
    const char* text;
    QString (MessageTemplate::*getter)();
};

constexpr Tag kTags[] = {
    {"{to}", &MessageTemplate::getTo},           {"{toName}", &MessageTemplate::getToName},
    {"{from}", &MessageTemplate::getFrom},       {"{fromName}", &MessageTemplate::getFromName},
    {"{subject}", &MessageTemplate::getSubject},
};

// Every occurrence of tag, in any letter case, replaced by value; only the braces are searched
// for, which is much faster than a case-insensitive search for the whole tag.
QString replaceTag(const QString& text, QLatin1String tag, const QString& value) {
    QString result;
    qsizetype done = 0;
    for (qsizetype at = text.indexOf(QLatin1Char('{')); at >= 0;
         at = text.indexOf(QLatin1Char('{'), at + 1)) {
        if (QStringView(text).mid(at, tag.size()).compare(tag, Qt::CaseInsensitive) != 0)
            continue;
        if (result.isNull())
            result.reserve(text.size() + text.size() / 8);
        result += QStringView(text).mid(done, at - done);
        result += value;
        done = at + tag.size();
        at = done - 1;
    }
    if (result.isNull())
        return text;
    result += QStringView(text).mid(done);
    return result;
}

QString replaceInTurn(const QString& text, const QStringList& values) {
    QString copy = text;
    for (size_t i = 0; i < std::size(kTags); ++i) {
        if (!values[i].isNull())
            copy = replaceTag(copy, QLatin1String(kTags[i].text), values[i]);
    }
    return copy;
}

bool isTagCharacter(QChar c) {
    return c == u'{' || c == u'}' || c.isLetter();
}

// The copy is measured first and then written straight into place: a body has hundreds of tags,
// and appending piece by piece cost more than the copying itself.
QString replaceInOnePass(const QString& text, const QList<std::pair<qsizetype, int>>& tags,
                         const QStringList& values) {
    qsizetype size = text.size();
    for (const auto& [at, row] : tags)
        if (!values[row].isNull())
            size += values[row].size() - qsizetype(std::strlen(kTags[row].text));
    QString result(size, Qt::Uninitialized);
    QChar* to = result.data();
    const auto put = [&to](QStringView piece) {
        std::memcpy(static_cast<void*>(to), piece.data(), size_t(piece.size()) * sizeof(QChar));
        to += piece.size();
    };
    qsizetype done = 0;
    for (const auto& [at, row] : tags) {
        if (values[row].isNull())
            continue;
        put(QStringView(text).mid(done, at - done));
        put(values[row]);
        done = at + qsizetype(std::strlen(kTags[row].text));
    }
    put(QStringView(text).mid(done));
    return result;
}

QString requiredField(const QString& value, const char* failure, const char* reason) {
    if (value.isEmpty())
        throw PelmoException(QString::fromLatin1(failure), LocalizedStringNS(reason));
    return value;
}

} // namespace

// Where each tag stands in text, in order. Tags begin and end with a brace and hold no other,
// so no two overlap and where they stand does not depend on their values.
MessageTemplate::TagPositions MessageTemplate::findTags(const QString& text) {
    TagPositions found{text, {}, false};
    const qsizetype last = qsizetype(std::size(kTags)) - 1;
    for (qsizetype at = text.indexOf(QLatin1Char('{')); at >= 0;
         at = text.indexOf(QLatin1Char('{'), at + 1)) {
        for (qsizetype row = 0; row <= last; ++row) {
            const QLatin1String tag(kTags[row].text);
            if (QStringView(text).mid(at, tag.size()).compare(tag, Qt::CaseInsensitive) != 0)
                continue;
            found.tags.append({at, int(row)});
            const qsizetype end = at + tag.size();
            found.touching = found.touching ||
                             (row < last && ((at > 0 && isTagCharacter(text[at - 1])) ||
                                             (end < text.size() && isTagCharacter(text[end]))));
            break;
        }
    }
    return found;
}

MessageTemplate::MessageTemplate(PelmoView& pelmoView, MailSettings& mailSettings, QObject* parent)
    : QObject(parent), view(pelmoView), settings(mailSettings), document(new QTextDocument(this)) {
    connect(document, &QTextDocument::contentsChanged, this, [this] {
        plainBody = QString();
        htmlBody.reset();
    });
}

void MessageTemplate::clearBody() {
    QTextCursor cursor(document);
    cursor.select(QTextCursor::Document);
    cursor.removeSelectedText();
}

void MessageTemplate::setRecipient(const QString& name, const QString& address) {
    recipient = std::make_pair(name, address);
}

QString MessageTemplate::getTo() {
    return requiredField(recipient ? recipient->second : view.to(), "NoRecipientsEmail",
                         LocalizedKey("The 'Recipient Address:' value has not been specified."));
}

QString MessageTemplate::getToName() {
    return requiredField(recipient ? recipient->first : view.name(), "NoRecipientsName",
                         LocalizedKey("The 'Recipients Name:' value has not been specified."));
}

QString MessageTemplate::getSubject() {
    return view.subject();
}

QString MessageTemplate::getFrom() {
    return settings.required(MailSettings::Key::SenderEmail);
}

QString MessageTemplate::getFromName() {
    return settings.required(MailSettings::Key::SenderName);
}

QString MessageTemplate::getMessage() {
    // The body's text is exported once per change, not once per copy.
    if (plainBody.isNull())
        plainBody = document->toPlainText();
    return replaceTags(plainBody);
}

QString MessageTemplate::getHTMLMessage() {
    const int index = settings.integer(MailSettings::Key::SelectedCharacterSet);
    const HtmlCharset charset = HtmlCharset::forIndex(index);
    if (!htmlBody || htmlCharset != index) {
        const QByteArray exported = charset.exportDocument(*document);
        htmlBody = exported.isEmpty() ? QString() : charset.decode(exported);
        htmlCharset = index;
    }
    if (htmlBody->isNull())
        return {};
    // The tag values come from the fields and settings, so they may hold characters the set
    // cannot; they are escaped like those of the body.
    return charset.escapeUnencodable(replaceTags(*htmlBody));
}

QString MessageTemplate::replaceTags(const QString& text) {
    if (text.isNull())
        return {};
    // A null value (an empty field never set) leaves its tag in the text.
    QStringList values;
    for (const Tag& tag : kTags)
        values << (this->*tag.getter)();
    // Tag after tag is the rule. One pass over the text gives the same result unless a value
    // put in could complete a tag of a later row: one holding a brace, or one put next to
    // letters or braces. The last row has no later one.
    const bool braced = std::any_of(values.cbegin(), values.cend() - 1, [](const QString& value) {
        return value.contains(QLatin1Char('{')) || value.contains(QLatin1Char('}'));
    });
    const TagPositions& positions = tagPositionsIn(text);
    return braced || positions.touching ? replaceInTurn(text, values)
                                        : replaceInOnePass(text, positions.tags, values);
}

// Every copy asks for the same few texts (the body as HTML and as plain text, the page):
// where their tags stand is looked for once, not in every copy.
const MessageTemplate::TagPositions& MessageTemplate::tagPositionsIn(const QString& text) {
    constexpr qsizetype kTextsKept = 4;
    for (const TagPositions& known : tagPositions) {
        // The kept copy holds on to its characters, so one at the same address is that text.
        if (known.text.constData() == text.constData() && known.text.size() == text.size())
            return known;
    }
    if (tagPositions.size() >= kTextsKept)
        tagPositions.removeFirst();
    tagPositions.append(findTags(text));
    return tagPositions.last();
}

QString MessageTemplate::getWebPageOrFileContents() {
    return webPageOrFileContents.isNull() ? QString() : replaceTags(webPageOrFileContents);
}
