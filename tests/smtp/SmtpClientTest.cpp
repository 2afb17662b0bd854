// SmtpClient in whole conversations, driven as the delivery drives it: with a real server,
// aiosmtpd (smtp_server.py), plain and over TLS with a throw-away CA; and with servers that
// misbehave on purpose (scripted_server.py playing tests/data/smtp/conversations.txt).

#include "RowName.h"
#include "SessionDriver.h"
#include "e2e/E2eSupport.h"

#include <QFile>
#include <QHostInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QRegularExpression>

namespace {

const QString kAll = QStringLiteral("CRAM-MD5 LOGIN PLAIN");

struct Row {
    std::string name;
    Plan plan = {};
    QString signals = {};
    QByteArray last = {};
    QString error = {}; // a pattern; empty: no error at all
    QStringList mechanisms = {kAll};
    QList<QByteArray> arrives = {}; // what aiosmtpd accepted
    QString server = {};            // how aiosmtpd runs
    friend void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }
};

void expectOutcome(const Outcome& out, const Row& row) {
    EXPECT_EQ(out.signals.toStdString(), row.signals.toStdString());
    EXPECT_EQ(out.lastResponse.toStdString(), row.last.toStdString());
    EXPECT_TRUE(row.error.isEmpty() ? out.error.isEmpty()
                                    : QRegularExpression(row.error).match(out.error).hasMatch())
        << out.error.toStdString();
    const QByteArray plain = ('\0' + row.plan.user + '\0' + row.plan.password).toUtf8().toBase64();
    EXPECT_FALSE(out.error.contains('\n') || out.error.contains("tanstaafl") ||
                 (!row.plan.password.isEmpty() && out.error.contains(row.plan.password)) ||
                 out.error.contains(QString::fromLatin1(plain)));
    EXPECT_EQ(out.mechanisms.join('|').toStdString(), row.mechanisms.join('|').toStdString());
    EXPECT_EQ(out.ssl, row.server.startsWith("implicit") || row.mechanisms.size() == 2);
}

bool setVariable(const char* name, const QString& value) {
    return value.isEmpty() ? qunsetenv(name) : qputenv(name, value.toLocal8Bit());
}

// The server is "plain", "starttls" or "implicit", then maybe "untrusted" (its CA is not),
// "ca-folder" (trusted through SSL_CERT_DIR), "wrong-host" (it shows its CA's certificate), and
// options of smtp_server.py.
class Aiosmtpd : public ::testing::TestWithParam<Row> {};

TEST_P(Aiosmtpd, Conversation) {
    const Row& row = GetParam();
    const QTemporaryDir folder;
    const Certificates pki(folder.path());
    ASSERT_TRUE(pki.ok);
    const QStringList words = row.server.split(' ');
    const bool wrongHost = words.contains("wrong-host"), caFolder = words.contains("ca-folder");
    const qsizetype dashes = words.indexOf(QRegularExpression("--.*"));
    QStringList options = dashes < 0 ? QStringList() : words.mid(dashes);
    options += {"--password", "s3cret-pa55",
                "--tls",      words[0] == "plain" ? "none" : words[0],
                "--cert",     wrongHost ? pki.ca : pki.cert,
                "--key",      wrongHost ? folder.filePath("ca.key") : pki.key};
    if (words[0] == "starttls")
        options += "--require-starttls";
    ServerProcess server(QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py"), options);
    ASSERT_NE(server.port(), 0);
    setVariable("SSL_CERT_FILE", words.contains("untrusted") || caFolder ? "" : pki.ca);
    setVariable("SSL_CERT_DIR", caFolder ? "/none:" + folder.path() : "");
    Plan plan = row.plan;
    plan.implicitTls = words[0] == "implicit";
    plan.startTls = words[0] == "starttls";
    expectOutcome(drive(server.port(), plan), row);

    const QList<QByteArray> records = server.records();
    ASSERT_EQ(records.size(), row.arrives.size());
    for (qsizetype i = 0; i < records.size(); ++i) {
        const QJsonObject record = QJsonDocument::fromJson(records[i]).object();
        EXPECT_EQ(messageOf(records[i]), row.arrives[i]);
        EXPECT_EQ(record["mail_from"].toString(), plan.sender);
        EXPECT_EQ(record["rcpt_tos"].toVariant().toStringList(), plan.recipients);
        EXPECT_EQ(record["mail_options"].toVariant().toStringList(),
                  QStringList{"SIZE=" + QString::number(row.arrives[i].size())});
    }
}

const QByteArray kMessage = "Subject: hello\r\n\r\nHello.\r\n";
const QByteArray kAccepted = "250 2.0.0 Message accepted\r\n";
const QByteArray kTls = "220 Ready to start TLS\r\n";
const QByteArray k535 = "535 5.7.8 Authentication credentials invalid\r\n";
const QString kUntrusted = QStringLiteral("^TLS handshake with 127.0.0.1 failed: (?!.*host name)");
const QString kWrongHost = QStringLiteral("^TLS handshake with 127.0.0.1 failed: .*host name");
const QString kAuthSent = QStringLiteral("connected ready authenticated sent terminated");
const QString kAuthFailed = QStringLiteral("connected ready authFailed terminated");
const Plan kSendOne = {.messages = {kMessage}};

Plan login(const char* mechanism, const QString& password = QStringLiteral("s3cret-pa55")) {
    return {.mechanism = mechanism, .password = password, .messages = {kMessage}};
}

// Dots opening a line are doubled on the wire and undone by the server; lone CR and LF become
// CRLF, and the end gets a line end. The server's SIZE limit is 100: 101 bytes are not sent.
const QByteArray kDots = ".hi\r\na\r\n.\r\n..\r\na.b\r\n x.\r\none\ntwo\rthree\r\n.four\ntext\r\n.";
const QByteArray kDotsArrive =
    ".hi\r\na\r\n.\r\n..\r\na.b\r\n x.\r\none\r\ntwo\r\nthree\r\n.four\r\ntext\r\n.\r\n";
const QByteArray kX = QByteArray(98, 'x');

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, Aiosmtpd,
    ::testing::Values(
        Row("plain_PLAIN", login("plain"), kAuthSent, kAccepted, "", {kAll}, {kMessage}, "plain"),
        Row("starttls_LOGIN", login("LOGIN"), "connected ready ready authenticated sent terminated",
            kAccepted, "", {"", kAll}, {kMessage}, "starttls"),
        Row("implicit_CRAM_MD5", login("CRAM-MD5"), kAuthSent, kAccepted, "", {kAll}, {kMessage},
            "implicit"),
        Row("implicit_bad_PLAIN", login("PLAIN", "bad"), kAuthFailed, k535, "535", {kAll}, {},
            "implicit"),
        Row("plain_bad_LOGIN", login("LOGIN", "bad"), kAuthFailed, k535, "535", {kAll}, {},
            "plain"),
        Row("starttls_bad_CRAM_MD5", login("CRAM-MD5", "bad"),
            "connected ready ready authFailed terminated", k535, "535", {"", kAll}, {}, "starttls"),
        Row("dots_and_sizes", {.messages = {kDots, "", kX + '\n', kX + "x\n"}},
            "connected ready sent sent sent notSent terminated", "", "101.*100", {kAll},
            {kDotsArrive, "", kX + "\r\n"}, "plain --size 100"),
        Row("refused_recipient",
            {.recipients = {"a@example.org", "gone@example.org"}, .messages = {kMessage}},
            "connected ready notSent terminated",
            "550 5.1.1 <gone@example.org>: Recipient address rejected\r\n", "550 5.1.1", {kAll}, {},
            "plain --refuse-recipient gone@example.org"),
        Row("implicit_unstarted", {.startSsl = false, .timeout = std::chrono::seconds(1)},
            "connected timedOut", "", "did not answer", {}, {}, "implicit"),
        Row("starttls_untrusted", kSendOne, "connected ready timedOut", kTls, kUntrusted, {""}, {},
            "starttls untrusted"),
        Row("implicit_untrusted", kSendOne, "connected timedOut", "", kUntrusted, {}, {},
            "implicit untrusted"),
        Row("starttls_wrong_host", kSendOne, "connected ready timedOut", kTls, kWrongHost, {""}, {},
            "starttls wrong-host"),
        Row("implicit_wrong_host", kSendOne, "connected timedOut", "", kWrongHost, {}, {},
            "implicit wrong-host"),
        Row("starttls_ca_folder", kSendOne, "connected ready ready sent terminated", kAccepted, "",
            {"", kAll}, {kMessage}, "starttls ca-folder")),
    RowName());

// The server plays the conversation of tests/data/smtp/conversations.txt named as the row.
class Scripted : public ::testing::TestWithParam<Row> {};

TEST_P(Scripted, Conversation) {
    const Row& row = GetParam();
    const QString conversations = QStringLiteral(PELMO_TEST_DATA "/smtp/conversations.txt");
    const QString name = QString::fromStdString(row.name);
    ServerProcess server(QStringLiteral(PELMO_TEST_DIR "/smtp/scripted_server.py"),
                         {conversations, name});
    ASSERT_NE(server.port(), 0);
    expectOutcome(drive(server.port(), row.plan), row);

    QList<QByteArray> lines = server.records();
    for (const QDeadlineTimer guard(std::chrono::seconds(5));
         !lines.contains("END") && !guard.hasExpired();)
        lines = server.records();
    EXPECT_EQ(lines.removeAll("END"), 1) << "the client stayed";
    // RFC 5321 4.1.4: the client names itself by its domain name, or else its address literal.
    const QString host = QHostInfo::localHostName();
    QStringList received, expected;
    for (const QByteArray& line : lines) {
        received += QJsonDocument::fromJson('[' + line + ']').array().at(0).toString();
        if (received.last().startsWith("EHLO ") || received.last().startsWith("HELO ")) {
            EXPECT_EQ(received.last().mid(5), host.contains('.') ? host : "[127.0.0.1]");
            received.last().truncate(4);
        }
    }
    QFile file(conversations);
    EXPECT_TRUE(file.open(QIODevice::ReadOnly));
    const QString script = QString::fromUtf8(file.readAll()).section("\n== " + name + '\n', 1);
    for (const QString& line : script.section("\n== ", 0, 0).split('\n'))
        expected += line.startsWith("C:") ? QStringList{line.mid(3)} : QStringList();
    EXPECT_EQ(received.join('\n').toStdString(), expected.join('\n').toStdString());
}

const QByteArray kQueued = "250 2.0.0 queued\r\n";
const QString kSent = QStringLiteral("connected ready sent terminated");
const QString kNotSent = QStringLiteral("connected ready notSent terminated");
const Plan kSendTwo = {.recipients = {"a@example.org", "b@example.org"}, .messages = {kMessage}};

// RFC 4616's example user "tim", whose password "tanstaafl" must never show in an error.
Plan tim(const char* mechanism, const QString& password = "tanstaafl",
         const QString& user = "tim") {
    return {.mechanism = mechanism, .user = user, .password = password};
}

Plan envelope(const QString& sender, const QStringList& recipients) {
    return {.sender = sender, .recipients = recipients, .messages = {kMessage}};
}

// Refused before anything is sent, so that no reply belongs to the failure.
Row refusedHere(std::string name, const Plan& plan) {
    return Row(std::move(name), plan,
               plan.mechanism.isEmpty() ? kNotSent : "connected ready authFailed terminated", "",
               ".");
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, Scripted,
    ::testing::Values(
        Row("split_replies", kSendOne, kSent, "250-2.0.0 queued\r\n250 2.0.0 as 1234\r\n", "",
            {"LOGIN PLAIN CRAM-MD5"}),
        Row("helo_fallback", kSendOne, kSent, kQueued, "", {""}),
        Row("ehlo_deferred", {}, "connected lost", "421 4.3.2 Shutting down\r\n", "421 4.3.2", {}),
        Row("greeting_refused", {}, "connected lost", "554 5.3.2 No SMTP service here\r\n",
            "554 5.3.2 No SMTP service here", {}),
        Row("malformed_reply", {}, "connected lost", "", "malformed", {}),
        Row("silent", {.timeout = std::chrono::seconds(1)}, "connected timedOut", "",
            "did not answer within 1 s", {}),
        Row("unreachable", {}, "timedOut", "", "Could not connect", {}),
        Row("closed_first", {.closeFirst = true}, "terminated", "", "", {}),
        Row("dropped_in_data", kSendOne, "connected ready lost", "354 Go ahead\r\n", "."),
        Row("idle_421", {}, "connected ready lost", "421 4.4.2 Idle too long\r\n", "closed"),
        Row("quit_unanswered", kSendOne, kSent, kQueued),
        Row("starttls_refused", {.startTls = true}, "connected ready timedOut",
            "454 4.7.0 TLS not available\r\n", "454 4.7.0"),
        Row("unexpected_challenge", tim("PLAIN"), "connected ready authFailed terminated",
            "501 5.7.0 Aborted\r\n", "501 5.7.0 Aborted"),
        Row("mail_refused", kSendTwo, kNotSent, "553 5.1.8 Sender rejected\r\n",
            "553 5.1.8 Sender rejected", {""}),
        Row("mail_deferred", kSendTwo, kNotSent, "451 4.3.0 Try later\r\n", "451 4.3.0 Try later",
            {""}),
        Row("second_rcpt_refused", kSendTwo, kNotSent,
            "550 5.1.1 <b@example.org>: no such user\r\n", "550 5.1.1 <b@example.org>", {""}),
        Row("data_refused", kSendTwo, kNotSent, "554 5.5.1 No valid recipients\r\n",
            "554 5.5.1 No valid recipients", {""}),
        Row("end_of_data_refused", kSendTwo, kNotSent,
            "552-5.3.4 Message too big\r\n552 5.3.4 for this mailbox\r\n",
            "552-5.3.4 Message too big 552 5.3.4 for this mailbox", {""}),
        Row("end_of_data_deferred", kSendTwo, kNotSent, "451 4.3.0 Try later\r\n",
            "451 4.3.0 Try later", {""}),
        refusedHere("crlf_in_user", tim("LOGIN", "tanstaafl", "tim\r\nMAIL FROM:<x@y.org>")),
        refusedHere("lf_in_password", tim("LOGIN", "tanstaafl\n&3")),
        refusedHere("cr_in_password", tim("CRAM-MD5", "tanstaafl\r&3")),
        refusedHere("nul_in_password", tim("PLAIN", "tanstaafl" + QString(QChar(0)))),
        refusedHere("crlf_in_mechanism", tim("PLAIN\r\nRSET")),
        refusedHere("unknown_mechanism", tim("XOAUTH2")),
        refusedHere("crlf_in_sender", envelope("a@x.org>\r\nRCPT TO:<e@x.org", {"b@x.org"})),
        refusedHere("lf_in_recipient", envelope("a@x.org", {"b@x.org", "c@x.org\nDATA"})),
        refusedHere("nul_in_recipient", envelope("a@x.org", {"b@x.org" + QString(QChar(0))})),
        refusedHere("bracket_in_recipient", envelope("a@x.org", {"b@x.org> NOTIFY=NEVER"})),
        refusedHere("bracket_in_sender", envelope("<a@x.org", {"b@x.org"})),
        refusedHere("no_recipient", envelope("a@x.org", {}))),
    RowName());

TEST(SmtpClient, ImplicitTlsOnPort465) {
    EXPECT_TRUE(SmtpClient(QStringLiteral("smtp.example.org"), 465).isSSL());
    EXPECT_FALSE(SmtpClient(QStringLiteral("smtp.example.org"), 587).isSSL());
}

TEST(SmtpClient, TrustedCertificatesAddToTheSystemStore) {
    const QTemporaryDir folder;
    const Certificates pki(folder.path());
    ASSERT_TRUE(pki.ok);
    setVariable("SSL_CERT_DIR", {});
    setVariable("SSL_CERT_FILE", pki.ca);
    const QList<QSslCertificate> trusted = SmtpClient::tlsConfiguration().caCertificates();
    EXPECT_TRUE(trusted.contains(QSslCertificate::fromPath(pki.ca).value(0)));
    for (const QSslCertificate& system : QSslConfiguration::systemCaCertificates())
        ASSERT_TRUE(trusted.contains(system)) << system.subjectDisplayName().toStdString();
    setVariable("SSL_CERT_FILE", {});
    EXPECT_EQ(SmtpClient::tlsConfiguration().caCertificates(),
              QSslConfiguration::defaultConfiguration().caCertificates());
}

} // namespace
