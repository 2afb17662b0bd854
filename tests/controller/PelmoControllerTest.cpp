#include "ControllerFixture.h"

#include "RowName.h"

#include "smtp/HtmlCharset.h"
#include "util/CLog.h"
#include "util/PelmoException.h"

#include <QFile>
#include <QStandardPaths>
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

    QString failureOf(const QString& text) {
        try {
            controller->replaceTags(text);
        } catch (const PelmoException& failure) {
            return failure.name();
        }
        return QStringLiteral("none");
    }
};

TEST_F(Tags, ReplacedInAnyLetterCase) {
    EXPECT_EQ(controller->replaceTags(QStringLiteral(
                  "Dear {toName} ({TO}), from {FromName} <{fRoM}> about {SUBJECT}; {toname}.")),
              QStringLiteral("Dear Ada Lovelace (ada@example.org), from Me Myself "
                             "<me@example.org> about News; Ada Lovelace."));
}

TEST_F(Tags, EveryGetterIsCalledForEveryCopy) {
    EXPECT_EQ(controller->replaceTags(QStringLiteral("No tags at all.")),
              QStringLiteral("No tags at all."));
    EXPECT_EQ(view.toReads, 1);
    EXPECT_EQ(view.nameReads, 1);
    EXPECT_EQ(view.subjectReads, 1);
    controller->replaceTags(QStringLiteral("{to}"));
    EXPECT_EQ(view.toReads, 2);
    EXPECT_EQ(view.nameReads, 2);
    EXPECT_EQ(view.subjectReads, 2);
}

TEST_F(Tags, AFailingGetterStopsATextWithoutItsTag) {
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

TEST_F(Tags, NullTextIsNullAndAsksNothing) {
    EXPECT_TRUE(controller->replaceTags(QString()).isNull());
    EXPECT_EQ(view.toReads, 0);
}

TEST_F(Tags, SubjectKeepsItsOwnTags) {
    view.subjectText = QStringLiteral("For {toName}");
    EXPECT_EQ(controller->getSubject(), QStringLiteral("For {toName}"));
    // In the body, {subject} gives the subject as it stands: rows are replaced in table order,
    // so a tag inside a later row's value stays.
    EXPECT_EQ(controller->replaceTags(QStringLiteral("Re: {subject}")),
              QStringLiteral("Re: For {toName}"));
    // A tag in an earlier row's value is replaced by the later row.
    view.toText = QStringLiteral("{subject}@example.org");
    EXPECT_EQ(controller->replaceTags(QStringLiteral("{to}")),
              QStringLiteral("For {toName}@example.org"));
}

TEST_F(Tags, PlainMessageIsTheBodyWithTagsReplaced) {
    controller->message()->setPlainText(QStringLiteral("Hello {toName},\nsee you.\n{fromName}"));
    EXPECT_EQ(controller->getMessage(), QStringLiteral("Hello Ada Lovelace,\nsee you.\nMe Myself"));
}

struct CharsetCase {
    const char* name;
    int index;
    const char* declared;
    const char* body; // how "Grüße 日本 €" comes out
};

void PrintTo(const CharsetCase& row, std::ostream* out) {
    *out << row.name;
}

class Charsets : public Tags, public ::testing::WithParamInterface<CharsetCase> {};

TEST_P(Charsets, HtmlDeclaresTheSetAndEscapesWhatItCannotHold) {
    const CharsetCase& row = GetParam();
    set("selectedCharacterSet", row.index);
    controller->message()->setPlainText(QString::fromUtf8("Grüße 日本 € for {toName}"));
    const QString html = controller->getHTMLMessage();
    EXPECT_TRUE(
        html.contains(QStringLiteral("<meta charset=\"%1\" />").arg(QLatin1String(row.declared))))
        << html.toStdString();
    EXPECT_EQ(html.count(QStringLiteral("<meta charset=")), 1);
    EXPECT_TRUE(html.contains(QString::fromUtf8(row.body) + QStringLiteral(" for Ada Lovelace")))
        << html.toStdString();
    // What is left encodes and decodes without loss in the declared set.
    const HtmlCharset charset = HtmlCharset::forIndex(row.index);
    EXPECT_EQ(charset.decode(charset.encode(html)), html);
}

INSTANTIATE_TEST_SUITE_P(
    Table, Charsets,
    ::testing::Values(CharsetCase{"Utf8", 0, "utf-8", "Grüße 日本 €"},
                      CharsetCase{"Ascii", 1, "us-ascii",
                                  "Gr&#252;&#223;e &#26085;&#26412; &#8364;"},
                      CharsetCase{"Latin1", 2, "iso-8859-1", "Grüße &#26085;&#26412; &#8364;"},
                      CharsetCase{"ShiftJis", 3, "Shift_JIS", "Gr&#252;&#223;e 日本 &#8364;"},
                      CharsetCase{"OutOfRangeIsUtf8", 4, "utf-8", "Grüße 日本 €"},
                      CharsetCase{"NegativeIsUtf8", -1, "utf-8", "Grüße 日本 €"}),
    RowName());

TEST_F(Tags, TagValuesTheSetCannotHoldAreEscapedToo) {
    set("selectedCharacterSet", 1);
    view.nameText = QString::fromUtf8("Zoë");
    controller->message()->setPlainText(QStringLiteral("Hi {toname}"));
    EXPECT_TRUE(controller->getHTMLMessage().contains(QStringLiteral("Hi Zo&#235;")));
}

TEST_F(Tags, ShiftJisHtmlIsReadBackAsShiftJis) {
    set("selectedCharacterSet", 3);
    controller->message()->setPlainText(QString::fromUtf8("日本語 \\ ~"));
    const QString html = controller->getHTMLMessage();
    const QByteArray bytes = HtmlCharset::forIndex(3).encode(html);
    EXPECT_TRUE(bytes.contains("\x93\xfa\x96\x7b\x8c\xea")); // 日本語 in Shift_JIS
    EXPECT_TRUE(html.contains(QString::fromUtf8("日本語 \\ ~")));
}

TEST_F(ControllerFixture, StatusLinesGoToTheViewAndTheLog) {
    const QString data = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    QFile::remove(data + QStringLiteral("/Orvale Software/Pelmo/Pelmo.log"));
    controller->applicationWillFinishLaunching();
    controller->statusMsg(QString::fromUtf8("Connecting to the smtp.example.org server. ✓"));
    controller->applicationWillTerminate();
    EXPECT_EQ(view.statuses.last(),
              QString::fromUtf8("Connecting to the smtp.example.org server. ✓"));
    QFile log(data + QStringLiteral("/Orvale Software/Pelmo/Pelmo.log"));
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    const QList<QByteArray> lines = log.readAll().split('\r');
    ASSERT_EQ(lines.size(), 4); // start, the line, stop, and nothing after the last CR
    EXPECT_EQ(lines.at(1), QByteArray("Connecting to the smtp.example.org server. \xe2\x9c\x93"));
}

TEST_F(ControllerFixture, RecipientsTableShowsIndexAndAddress) {
    int changes = 0;
    QObject::connect(controller.get(), &PelmoController::recipientsChanged, [&] { ++changes; });
    controller->addRecipient(QStringLiteral("ada@example.org"));
    controller->addRecipient(QStringLiteral("alan@example.org"));
    EXPECT_EQ(changes, 2);
    EXPECT_EQ(view.reloads, 2);
    EXPECT_EQ(controller->numberOfRows(), 2);
    EXPECT_EQ(controller->valueFor(QStringLiteral("index"), 1), QVariant(2));
    EXPECT_EQ(controller->valueFor(QStringLiteral("email"), 0),
              QVariant(QStringLiteral("ada@example.org")));
    EXPECT_FALSE(controller->valueFor(QStringLiteral("name"), 0).isValid());
    EXPECT_FALSE(controller->valueFor(QStringLiteral("email"), 2).isValid());
    EXPECT_FALSE(controller->valueFor(QStringLiteral("email"), -1).isValid());
    controller->resetRecipients();
    EXPECT_EQ(changes, 3);
    EXPECT_EQ(view.reloads, 3);
    EXPECT_EQ(controller->numberOfRows(), 0);
    EXPECT_FALSE(controller->recipientsContains(QStringLiteral("ada@example.org")));
}

TEST_F(ControllerFixture, RecipientsContainsIgnoresCaseOnly) {
    controller->addRecipient(QStringLiteral("Ada.Lovelace@Example.ORG"));
    EXPECT_TRUE(controller->recipientsContains(QStringLiteral("ada.lovelace@example.org")));
    EXPECT_TRUE(controller->recipientsContains(QStringLiteral("ADA.LOVELACE@EXAMPLE.ORG")));
    EXPECT_FALSE(controller->recipientsContains(QStringLiteral(" ada.lovelace@example.org")));
    EXPECT_FALSE(controller->recipientsContains(QStringLiteral("ada.lovelace@example.org ")));
    EXPECT_FALSE(controller->recipientsContains(QStringLiteral("ada.lovelace@example.or")));
    controller->addRecipient(QString::fromUtf8("JÜRGEN@example.de"));
    EXPECT_TRUE(controller->recipientsContains(QString::fromUtf8("jürgen@EXAMPLE.de")));
}

} // namespace
