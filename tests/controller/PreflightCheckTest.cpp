#include "ControllerFixture.h"

#include "RowName.h"
#include "controller/CopyPreview.h"
#include "controller/NotMailedRecipients.h"
#include "controller/PreflightCheck.h"
#include "controller/SentRecipients.h"
#include "e2e/E2eSupport.h"

#include <QTemporaryDir>
#include <QTextDocument>

namespace {

using Input = PreflightCheck::Input;

const char kTags[] = "is not a tag and goes out as written; the tags are {to}, {toName}, {from}, "
                     "{fromName} and {subject}.";

struct Case {
    std::string name;
    Input input;
    QStringList findings;
};
void PrintTo(const Case& row, std::ostream* out) {
    *out << row.name;
}

QString folder() {
    static QTemporaryDir dir;
    return dir.path();
}

Input with(std::function<void(Input&)> change) {
    Input input;
    input.subject = "News";
    change(input);
    return input;
}

const Case kCases[] = {
    {"FiveTagsInAnyCaseAreTags",
     with([](Input& in) {
         in.subject = "{SUBJECT} for {toname}";
         in.body = "Dear {toName} <{to}>, from {fromName} <{From}>";
     }),
     {}},
    {"UnknownTagOnceInAnyCase",
     with([](Input& in) { in.body = "Dear {firstName},\n{FIRSTNAME} {{lastName}}"; }),
     {QString("\"{firstName}\" ") + kTags, QString("\"{lastName}\" ") + kTags}},
    // Braces that are no word, and what a page's styles, scripts and comments hold, are no tag.
    {"BracesThatAreNoTag",
     with([](Input& in) {
         in.body = "a { } b {} {1st} {first name} {to-do}";
         in.page = "<style>p {color: red} .a{margin}</style><SCRIPT>if (a) {return}</SCRIPT>"
                   "<!-- {draft} --><p style=\"x\">{ }</p>";
     }),
     {}},
    {"TagLikeWordInPageText",
     with([](Input& in) { in.page = "<style>b{}</style><p>Hi {name}</p>"; }),
     {QString("\"{name}\" ") + kTags}},
    {"EmptySubject", with([](Input& in) { in.subject = " "; }), {"The subject is empty."}},
    {"MissingAndUnreadableAttachments",
     with([](Input& in) {
         in.attachments = {folder() + "/gone.pdf", folder()};
     }),
     {"The attachment \"" + folder() + "/gone.pdf\" is missing.",
      "The attachment \"" + folder() + "\" cannot be read."}},
    {"AtTheServersSize",
     with([](Input& in) {
         in.messageBytes = in.serverLimit = 10485760;
         in.server = "mail.example.org";
     }),
     {}},
    {"AboveTheServersSize",
     with([](Input& in) {
         in.messageBytes = 10485761;
         in.serverLimit = 10485760;
         in.server = "mail.example.org";
     }),
     {"Each copy is 10.1 MB, more than the 10 MB that mail.example.org accepts."}},
    {"AtTwentyFiveMegabytes", with([](Input& in) { in.messageBytes = 26214400; }), {}},
    {"AboveTwentyFiveMegabytes",
     with([](Input& in) { in.messageBytes = 26214401; }),
     {"Each copy is 25.1 MB, more than the 25 MB that many mail servers accept."}},
    {"PageNotAnswering",
     with([](Input& in) {
         in.pageAddress = "http://127.0.0.1:9/news";
         in.pageError = "Connection refused";
     }),
     {"The web page http://127.0.0.1:9/news does not answer: Connection refused"}},
};

class Preflight : public ::testing::TestWithParam<Case> {};

TEST_P(Preflight, Findings) {
    QStringList texts;
    for (const PreflightCheck::Finding& finding : PreflightCheck::check(GetParam().input))
        texts << finding.text;
    EXPECT_EQ(texts, GetParam().findings);
}

INSTANTIATE_TEST_SUITE_P(Rows, Preflight, ::testing::ValuesIn(kCases), RowName());

// A test copy goes to aiosmtpd as a run's copy would, for the member chosen, to the sender;
// the server's SIZE is remembered, and the sent list, the not-mailed list and the members still to
// be mailed are left alone.
TEST_F(ControllerFixture, TestCopyGoesToTheSenderAndMailsNobody) {
    ServerProcess server(PELMO_TEST_DIR "/smtp/smtp_server.py", {"--size", "2000000"});
    for (auto [key, value] : QVariantMap{
             {"senderEmail", "club@example.org"},
             {"senderName", "The Club"},
             {"serverAddress", "127.0.0.1"},
             {"serverPort", server.port()},
             {"selectedContentType",
              1}}.asKeyValueRange())
        set(key.toLatin1().constData(), value);
    const qint64 group = book->addGroup("Club");
    for (const char* first : {"Ann", "Bob"})
        book->addMember(
            group, book->addPerson({0, first, "Test", {QString(first).toLower() + "@x.org"}, 0}));
    controller->abGroupSelected({group}, true);
    controller->message()->setPlainText("Dear {toName}");
    view.subjectText = "News";
    std::optional<bool> accepted;
    QObject::connect(controller.get(), &PelmoController::testSettled,
                     [&accepted](bool answer) { accepted = answer; });
    controller->sendTest(2);
    ASSERT_TRUE(waitUntil([&accepted] { return accepted.has_value(); }));
    EXPECT_TRUE(*accepted);
    const ReceivedMessage copy = parseMessage(messageOf(server.records().value(0)));
    EXPECT_EQ(copy.to + " / " + copy.subject + " / " + copy.parts.value(0).content,
              "The Club <club@example.org> / [Test] News / Dear Bob Test");
    // aiosmtpd's SIZE, kept for the check before the next group run.
    EXPECT_EQ(mailSettings.sizeLimit("127.0.0.1", server.port()), 2000000);
    EXPECT_EQ(controller->sentRecipients().rowCount(), 0);
    EXPECT_EQ(controller->notMailedRecipients().rowCount(), 0);
    EXPECT_EQ(controller->copyChoices(),
              QStringList({"Ann Test <ann@x.org>", "Bob Test <bob@x.org>"}));
}

} // namespace
