#include "ControllerFixture.h"

#include "controller/MessageTemplate.h"
#include "util/PelmoException.h"

#include <QTextDocument>

#include <random>

namespace {

class Tags : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        set("senderEmail", QStringLiteral("me@example.org"));
        set("senderName", QStringLiteral("Me Myself"));
        view.nameText = QStringLiteral("Ada Lovelace");
    }
    MessageTemplate& content() { return controller->messageTemplate(); }
};

// Tags are replaced in any letter case, one table row after the other: a tag inside a later
// row's value stays, one inside an earlier row's value is replaced. Every getter is asked for
// every copy, so a missing value stops even a text without tags.
TEST_F(Tags, Replaced) {
    struct Row {
        const char *name, *text, *to, *subject, *senderName, *expected;
    };
    const Row rows[] = {
        {"any_case", "Dear {toName} ({TO}), from {FromName} <{fRoM}> about {SUBJECT}; {toname}.",
         "ada@example.org", "News", "Me Myself",
         "Dear Ada Lovelace (ada@example.org), from Me Myself <me@example.org> about News; Ada "
         "Lovelace."},
        {"touching_at_start", "{toName}{TO}", "ada@example.org", "", "Me",
         "Ada Lovelaceada@example.org"},
        {"brace_before_tag", "{{to}{x} {", "a@b", "", "Me", "{a@b{x} {"},
        {"later_row_stays", "Re: {subject}", "a@b", "For {toName}", "Me", "Re: For {toName}"},
        {"earlier_row_replaced", "{to}", "{subject}@b", "For {toName}", "Me", "For {toName}@b"},
        {"value_closes_a_tag", "{subject{fromName}", "a@b", "News", "}", "News"},
        {"value_is_a_later_tag", "{{to}}", "fromName", "", "Me", "Me"},
        {"value_and_text_make_a_later_tag", "{fr{to}}", "om", "", "Me", "me@example.org"},
        {"no_tags_still_asks", "No tags.", "a@b", "", "", "NoSenderName"},
        {"null_text_asks_nothing", nullptr, "a@b", "", "", "(null)"},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        view.toText = QString::fromUtf8(row.to);
        view.subjectText = QString::fromUtf8(row.subject);
        set("senderName", QString::fromUtf8(row.senderName));
        QString got;
        try {
            got = content().replaceTags(row.text ? QString::fromUtf8(row.text) : QString());
        } catch (const PelmoException& failure) {
            got = failure.name();
        }
        EXPECT_EQ(got.isNull() ? QStringLiteral("(null)") : got, QString::fromUtf8(row.expected));
    }
    set("senderName", QStringLiteral("Me"));
    controller->message()->setPlainText(QStringLiteral("Hello {toName},\nsee you.\n{fromName}"));
    EXPECT_EQ(content().getMessage(), QStringLiteral("Hello Ada Lovelace,\nsee you.\nMe"));
}

// Against the plain rule, a case-insensitive replace of each tag in turn, over texts and values
// made of tags, their pieces and stray braces: the scan for braces must give the same copies,
// and so must the tags' places, kept from one text to the next.
TEST_F(Tags, SameAsReplacingEachTagInTurn) {
    const QStringList pieces = {"{",        "}",      "{to}",       "{TO}",      "{toName}",
                                "{toname}", "{from}", "{fromName}", "{subject}", "{Subject}",
                                "to",       "Name",   "x",          " ",         "from",
                                "sub",      "ject"};
    std::mt19937 random(7);
    const auto made = [&](int size) {
        QString text;
        for (int i = 0; i < size; ++i)
            text += pieces[random() % pieces.size()];
        return text;
    };
    // Values without braces in every other round, which take the one-pass way.
    const auto field = [&](int round, int size) {
        return round % 2 ? made(size) : made(size).remove(QLatin1Char('{')).remove('}');
    };
    for (int round = 0; round < 300; ++round) {
        view.toText = "a" + field(round, 2);
        view.nameText = field(round, 3);
        view.subjectText = field(round, 3);
        set("senderName", "M" + field(round, 2));
        const QString text = made(12);
        QString expected = text;
        for (const auto& [tag, value] : {std::pair{"{to}", view.toText},
                                         {"{toName}", view.nameText},
                                         {"{from}", QStringLiteral("me@example.org")},
                                         {"{fromName}", settings().value("senderName").toString()},
                                         {"{subject}", view.subjectText}})
            expected.replace(QLatin1String(tag), value, Qt::CaseInsensitive);
        ASSERT_EQ(content().replaceTags(text), expected) << text.toStdString();
    }
}

// The tags' values come from the fields and settings, so they may hold characters the set
// cannot: they are escaped like the body's text, under the one declaration of the set.
TEST_F(Tags, HtmlInEachCharacterSet) {
    const struct {
        int index;
        const char *declared, *body;
    } rows[] = {
        {0, "utf-8", "Grüße 日本 € for Zoë"},
        {1, "us-ascii", "Gr&#252;&#223;e &#26085;&#26412; &#8364; for Zo&#235;"},
        {2, "iso-8859-1", "Grüße &#26085;&#26412; &#8364; for Zoë"},
        {3, "Shift_JIS", "Gr&#252;&#223;e 日本 &#8364; for Zo&#235;"},
        {4, "utf-8", "Grüße 日本 € for Zoë"},
        {-1, "utf-8", "Grüße 日本 € for Zoë"},
    };
    view.toText = QStringLiteral("zoe@example.org");
    view.nameText = QString::fromUtf8("Zoë");
    controller->message()->setPlainText(QString::fromUtf8("Grüße 日本 € for {toName}"));
    for (const auto& row : rows) {
        set("selectedCharacterSet", row.index);
        const QString html = content().getHTMLMessage();
        EXPECT_EQ(html.count(QStringLiteral("<meta charset=\"%1\" />").arg(row.declared)), 1);
        EXPECT_TRUE(html.contains(QString::fromUtf8(row.body))) << html.toStdString();
    }
}

} // namespace
