#include "Transcript.h"

// pelmo send as a user runs it, against aiosmtpd and servers that misbehave on purpose.
PELMO_SESSIONS(Send, "send.txt");

#include "E2eSupport.h"

#include <QRegularExpression>
#include <QTemporaryDir>

namespace {

// A message with what changes from one making to the next (its date, its Message-ID, its
// boundaries) made placeholders, and without the line end that ends DATA.
QString comparable(const QByteArray& message) {
    QString text = QString::fromUtf8(message).trimmed();
    static const QRegularExpression boundary("boundary=\"?([^\";\r\n]+)");
    for (const QRegularExpressionMatch& match : boundary.globalMatch(text))
        text.replace(match.captured(1), "{boundary}");
    static const QRegularExpression changing("^(Date|Message-ID): [^\r]*(\r\n[ \t][^\r]*)*",
                                             QRegularExpression::MultilineOption |
                                                 QRegularExpression::CaseInsensitiveOption);
    return text.replace(changing, "\\1: {changes}");
}

// pelmo send --preview 2 prints the second member's copy exactly as the server then receives
// it: rich text, a tag in the subject's place, an attachment.
TEST(SendPreview, IsTheCopyTheServerReceives) {
    ServerProcess server(PELMO_TEST_DATA "/../smtp/smtp_server.py", {});
    QTemporaryDir home;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("XDG_DATA_HOME", home.filePath("data"));
    environment.insert("XDG_CONFIG_HOME", home.filePath("config"));
    environment.insert("XDG_RUNTIME_DIR", home.path());
    ASSERT_EQ(
        runPelmo({"contacts", "import", PELMO_TEST_DATA "/../../samples/friends.vcf"}, environment)
            .status,
        0);
    const QStringList send = {"send",
                              "--set",
                              "serverAddress=127.0.0.1",
                              "--set",
                              QString("serverPort=%1").arg(server.port()),
                              "--set",
                              "senderEmail=club@example.org",
                              "--set",
                              "senderName=The Club",
                              "--subject",
                              "Friday",
                              "--message",
                              PELMO_TEST_DATA "/cli/body.html",
                              "--attach",
                              PELMO_TEST_DATA "/cli/body.txt",
                              "--group",
                              "Friends"};
    const PelmoRun preview = runPelmo(send + QStringList{"--preview", "2"}, environment);
    ASSERT_EQ(preview.status, 0) << preview.err.toStdString();
    EXPECT_EQ(preview.err, "");
    const PelmoRun run = runPelmo(send, environment);
    ASSERT_EQ(run.status, 0) << run.err.toStdString();
    const QString received = comparable(messageOf(server.records().value(1)));
    EXPECT_TRUE(received.contains("To: Charles Babbage <charles@example.org>"));
    EXPECT_EQ(comparable(preview.out.toUtf8()).toStdString(), received.toStdString());
}

} // namespace
