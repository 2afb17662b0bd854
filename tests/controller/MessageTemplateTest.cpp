#include "ControllerFixture.h"

#include "controller/MessageTemplate.h"
#include "smtp/HtmlCharset.h"
#include "util/PelmoException.h"

#include <QTextDocument>

namespace {

class Tags : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        set("senderEmail", QStringLiteral("me@example.org"));
        set("senderName", QStringLiteral("Me Myself"));
        view.toText = QStringLiteral("ada@example.org");
        view.nameText = QStringLiteral("Ada Lovelace");
        view.subjectText = QStringLiteral("News");
    }
    MessageTemplate& content() { return controller->messageTemplate(); }
    QString failureOf(const QString& text) {
        try {
            content().replaceTags(text);
        } catch (const PelmoException& failure) {
            return failure.name();
        }
        return QStringLiteral("none");
    }
};

TEST_F(Tags, ReplacedInAnyLetterCase) {
    EXPECT_EQ(content().replaceTags(QStringLiteral(
                  "Dear {toName} ({TO}), from {FromName} <{fRoM}> about {SUBJECT}; {toname}.")),
              QStringLiteral("Dear Ada Lovelace (ada@example.org), from Me Myself "
                             "<me@example.org> about News; Ada Lovelace."));
    // A tag at the very start, and tags that touch.
    EXPECT_EQ(content().replaceTags(QStringLiteral("{toName}{TO}")),
              QStringLiteral("Ada Lovelaceada@example.org"));
    controller->message()->setPlainText(QStringLiteral("Hello {toName},\nsee you.\n{fromName}"));
    EXPECT_EQ(content().getMessage(), QStringLiteral("Hello Ada Lovelace,\nsee you.\nMe Myself"));
}

// Every getter is asked for every copy, so a missing value stops a text without its tag.
TEST_F(Tags, EveryGetterIsAskedEveryTime) {
    EXPECT_TRUE(content().replaceTags(QString()).isNull());
    EXPECT_EQ(view.toReads + view.nameReads + view.subjectReads, 0);
    EXPECT_EQ(content().replaceTags(QStringLiteral("No tags.")), QStringLiteral("No tags."));
    EXPECT_EQ(view.toReads + view.nameReads + view.subjectReads, 3);
    set("senderName", QString(""));
    EXPECT_EQ(failureOf(QStringLiteral("No tags.")), QStringLiteral("NoSenderName"));
    set("senderName", QStringLiteral("Me"));
    set("senderEmail", QString(""));
    EXPECT_EQ(failureOf(QStringLiteral("{subject}")), QStringLiteral("NoSenderEmailAddress"));
    view.nameText.clear();
    EXPECT_EQ(failureOf(QStringLiteral("{subject}")), QStringLiteral("NoRecipientsName"));
    view.toText.clear();
    EXPECT_EQ(failureOf(QStringLiteral("{subject}")), QStringLiteral("NoRecipientsEmail"));
}

// Rows are replaced in table order: a tag inside a later row's value stays, a tag inside an
// earlier row's value is replaced by the later row.
TEST_F(Tags, ReplacedRowAfterRow) {
    view.subjectText = QStringLiteral("For {toName}");
    EXPECT_EQ(controller->getSubject(), QStringLiteral("For {toName}"));
    EXPECT_EQ(content().replaceTags(QStringLiteral("Re: {subject}")),
              QStringLiteral("Re: For {toName}"));
    view.toText = QStringLiteral("{subject}@example.org");
    EXPECT_EQ(content().replaceTags(QStringLiteral("{to}")),
              QStringLiteral("For {toName}@example.org"));
    // A value that closes a tag before a later row's turn completes that tag too.
    view.toText = QStringLiteral("a@b");
    view.subjectText = QStringLiteral("News");
    view.nameText = QStringLiteral("}");
    EXPECT_EQ(content().replaceTags(QStringLiteral("{subject{toName}")), QStringLiteral("News"));
}

TEST_F(Tags, HtmlInEachCharacterSet) {
    struct Row {
        int index;
        const char* declared;
        const char* body; // how "Grüße 日本 €" comes out
    };
    const Row rows[] = {
        {0, "utf-8", "Grüße 日本 €"},
        {1, "us-ascii", "Gr&#252;&#223;e &#26085;&#26412; &#8364;"},
        {2, "iso-8859-1", "Grüße &#26085;&#26412; &#8364;"},
        {3, "Shift_JIS", "Gr&#252;&#223;e 日本 &#8364;"},
        {4, "utf-8", "Grüße 日本 €"},
        {-1, "utf-8", "Grüße 日本 €"},
    };
    view.nameText = QString::fromUtf8("Zoë");
    controller->message()->setPlainText(QString::fromUtf8("Grüße 日本 € for {toName}"));
    for (const Row& row : rows) {
        SCOPED_TRACE(row.index);
        set("selectedCharacterSet", row.index);
        const QString html = content().getHTMLMessage();
        EXPECT_EQ(html.count(QStringLiteral("<meta charset=\"%1\" />").arg(row.declared)), 1);
        // The tag's value is escaped like the body's text.
        const QString name =
            row.index == 1 || row.index == 3 ? QStringLiteral("Zo&#235;") : view.nameText;
        EXPECT_TRUE(html.contains(QString::fromUtf8(row.body) + QStringLiteral(" for ") + name))
            << html.toStdString();
        const HtmlCharset charset = HtmlCharset::forIndex(row.index);
        EXPECT_EQ(charset.decode(charset.encode(html)), html); // nothing is lost
    }
    set("selectedCharacterSet", 3);
    EXPECT_TRUE(
        HtmlCharset::forIndex(3).encode(content().getHTMLMessage()).contains("\x93\xfa\x96\x7b"));
}

} // namespace
