#include "ControllerFixture.h"

#include "attachments/AttachmentsController.h"
#include "controller/MailingRun.h"
#include "controller/MessageTemplate.h"
#include "smtp/SMTP.h"
#include "util/PelmoException.h"

#include <QCryptographicHash>
#include <QFile>
#include <QFont>
#include <QRegularExpression>
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

// Every copy byte for byte as a run sends it, but for its date, Message-ID and boundaries: tags
// in subject, body and page, names with markup characters, quotes and letters beyond ASCII, in
// each character set and format, with files and List-Unsubscribe. tests/data/smtp/copies.txt
// keeps a digest of each row's copy; a row whose copy differs is printed whole.
TEST_F(Tags, CopiesByteForByte) {
    struct Row {
        const char* name;
        int format, charset;
        bool alternative, page, files;
        const char *toName, *to, *unsubscribe;
    };
    const Row rows[] = {
        {"plain_utf8", 1, 0, false, false, false, "Zoë O'Brien <& \"Co\">", "zoe@example.org", ""},
        {"plain_ascii", 1, 1, false, false, false, "José Müller", "jose@example.org", ""},
        {"plain_latin1", 1, 2, false, true, false, "山田 太郎", "taro@example.jp", ""},
        {"plain_shift_jis", 1, 3, false, false, true, "山田 太郎", "taro@example.jp", ""},
        {"plain_index_4", 1, 4, false, false, false, "Ann", "ann@example.org", ""},
        {"plain_no_set", 1, -1, false, false, false, "José Müller", "jose@example.org", ""},
        {"rich_utf8", 0, 0, false, true, false, "Zoë O'Brien <& \"Co\">", "zoe@example.org", ""},
        {"rich_ascii", 0, 1, true, true, false, "José Müller", "jose@example.org",
         "mailto:leave@example.org"},
        {"rich_latin1", 0, 2, true, false, true, "Zoë O'Brien <& \"Co\">", "zoe@example.org",
         "https://example.org/leave?who=1&list=2"},
        {"rich_shift_jis", 0, 3, false, true, false, "山田 太郎", "taro@example.jp", ""},
        {"rich_index_4", 0, 4, true, false, false, "José Müller", "jose@example.org", ""},
        {"rich_no_set", 0, -1, false, true, true, "Ann", "ann@example.org", ""},
        // Headers long enough to be folded, with encoded words and without.
        {"long_headers", 0, 0, true, false, false,
         "Maximiliane Theodora Wilhelmine von Hohenzollern-Sigmaringen, née Zoë", "max@example.org",
         "mailto:leave-this-very-long-list-of-a-club-that-has-many-members@example.org"},
    };
    set("senderName", QString::fromUtf8("Ada “the Countess” Lovelace"));
    view.subjectText = QString::fromUtf8("News for {toName} & <friends>, from {FROMNAME} ✓");
    QTextDocument& body = *controller->message();
    body.setDefaultFont(QFont(QStringLiteral("Pelmo Test"), 12));
    body.setHtml(QString::fromUtf8(
        "<p>Dear <b>{toName}</b> &lt;{to}&gt;,</p><p>from {fromName} ({from}) about "
        "<i>{subject}</i>: é ü 日本 € &amp; \" ' {x}</p><p>Line\r\nafter CRLF</p>"));
    QFile text(folder.filePath(QStringLiteral("notes.txt"))),
        binary(folder.filePath(QStringLiteral("data.bin")));
    ASSERT_TRUE(text.open(QIODevice::WriteOnly) && binary.open(QIODevice::WriteOnly));
    text.write("Notes for you\nand a line\r\n.\n");
    for (int value = 0; value < 256; ++value)
        binary.putChar(char(value));
    text.close(), binary.close();

    QFile digests(QStringLiteral(PELMO_TEST_DATA "/smtp/copies.txt"));
    const bool writing = qEnvironmentVariableIsSet("PELMO_WRITE_TRANSCRIPTS");
    ASSERT_TRUE(digests.open(writing ? QIODevice::WriteOnly : QIODevice::ReadOnly));
    const QList<QByteArray> expected =
        writing ? QList<QByteArray>() : digests.readAll().split('\n');
    for (const Row& row : rows) {
        SCOPED_TRACE(row.name);
        set("selectedContentType", row.format);
        set("selectedCharacterSet", row.charset);
        set("addPlainTextAlternative", row.alternative);
        set("listUnsubscribe", QString::fromUtf8(row.unsubscribe));
        set("serverAddress", "mail.example.org");
        set("serverPort", 25);
        if (row.name == std::string("long_headers"))
            view.subjectText = QString::fromUtf8(
                "A subject that goes on for longer than one line of a header may hold, with a "
                "word or two in Ελληνικά and ✓ marks, for {toName}");
        view.nameText = QString::fromUtf8(row.toName);
        view.toText = QString::fromUtf8(row.to);
        content().setPage(row.page ? QString::fromUtf8("<html><body><h1>For {toName}</h1>"
                                                       "<a href=\"mailto:{to}\">{TO}</a> ✓"
                                                       "</body></html>")
                                   : QString());
        controller->getAttachments().deleteButtonClicked({});
        if (row.files)
            controller->getAttachments().addFiles({text.fileName(), binary.fileName()});
        const DeliveryRequest request =
            MailingRun::requestFor(content(), controller->settings(), controller->getAttachments(),
                                   [](const DeliveryRequest&) {});
        const SMTP::Built built = SMTP::build(request);
        ASSERT_FALSE(built.failure);
        QString wire = QString::fromLatin1(built.bytes);
        const auto lines = QRegularExpression::MultilineOption;
        wire.replace(QRegularExpression(QStringLiteral("^Date: .+$"), lines), "Date: DATE");
        wire.replace(QRegularExpression(QStringLiteral("^Message-Id: <[^@]+@"), lines),
                     "Message-Id: <ID@");
        for (const QRegularExpressionMatch& boundary :
             QRegularExpression(QStringLiteral("boundary=\"([^\"]+)\"")).globalMatch(wire))
            wire.replace(boundary.captured(1), QStringLiteral("BOUNDARY"));
        const QByteArray line =
            row.name + QByteArray(" ") +
            QCryptographicHash::hash(wire.toLatin1(), QCryptographicHash::Sha256).toHex().left(32);
        if (writing)
            digests.write(line + '\n');
        else
            EXPECT_TRUE(expected.contains(line)) << wire.toStdString();
    }
}

} // namespace
