#include "controller/MessageTemplate.h"

#include "controller/MailSettings.h"
#include "controller/PelmoView.h"
#include "smtp/HtmlCharset.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QTextCursor>
#include <QTextDocument>

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

QString replaceInOnePass(const QString& text, const QStringList& values) {
    QString result;
    result.reserve(text.size() + text.size() / 8);
    qsizetype done = 0;
    for (qsizetype at = text.indexOf(QLatin1Char('{')); at >= 0;
         at = text.indexOf(QLatin1Char('{'), at + 1)) {
        for (size_t i = 0; i < std::size(kTags); ++i) {
            const QLatin1String tag(kTags[i].text);
            if (values[i].isNull() ||
                QStringView(text).mid(at, tag.size()).compare(tag, Qt::CaseInsensitive) != 0)
                continue;
            result += QStringView(text).mid(done, at - done);
            result += values[i];
            done = at + tag.size();
            at = done - 1;
            break;
        }
    }
    result += QStringView(text).mid(done);
    return result;
}

QString requiredField(const QString& value, const char* failure, const char* reason) {
    if (value.isEmpty())
        throw PelmoException(QString::fromLatin1(failure), LocalizedStringNS(reason));
    return value;
}

} // namespace

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
    bool braced = false;
    for (const Tag& tag : kTags) {
        values << (this->*tag.getter)();
        braced = braced || values.last().contains(QLatin1Char('{')) ||
                 values.last().contains(QLatin1Char('}'));
    }
    // Tag after tag is the rule; when no value holds a brace, no value can take part in
    // another tag, and one pass over the text gives the same result.
    return braced ? replaceInTurn(text, values) : replaceInOnePass(text, values);
}

QString MessageTemplate::getWebPageOrFileContents() {
    return webPageOrFileContents.isNull() ? QString() : replaceTags(webPageOrFileContents);
}
