// SmtpClient against a scripted server in this process: the wire format byte for byte, and
// the servers that misbehave (silent, refusing, dropping, splitting replies).

#include "RowName.h"
#include "ScriptedServer.h"
#include "SignalRecorder.h"
#include "smtp/SmtpClient.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QHostInfo>
#include <QPointer>
#include <QTcpServer>
#include <gtest/gtest.h>

#include <functional>
#include <memory>

namespace {

using namespace std::chrono_literals;

const QString sender = QStringLiteral("sender@example.org");
const QStringList recipients = {QStringLiteral("a@example.org"), QStringLiteral("b@example.org")};
const QByteArray message = "Subject: hello\r\n\r\nHello.\r\n";

class SmtpClientProtocolTest : public ::testing::Test {
protected:
    void open(std::chrono::seconds timeout = 10s) {
        client = std::make_unique<SmtpClient>(QStringLiteral("127.0.0.1"), server.port(), timeout);
        recorder = std::make_unique<SignalRecorder>(*client);
        client->setMessage(message, sender, recipients);
        client->connectInBackgroundAndNotify();
    }

    ::testing::AssertionResult ready() {
        open();
        return recorder->arrived("serviceInitialized");
    }

    QStringList names(std::initializer_list<const char*> list) {
        QStringList out;
        for (const char* name : list)
            out += QString::fromLatin1(name);
        return out;
    }

    ScriptedServer server;
    std::unique_ptr<SmtpClient> client;
    std::unique_ptr<SignalRecorder> recorder;
};

TEST(SmtpClientTransport, Port465IsImplicitTlsFromTheStart) {
    EXPECT_TRUE(SmtpClient(QStringLiteral("smtp.example.org"), 465).isSSL());
    EXPECT_FALSE(SmtpClient(QStringLiteral("smtp.example.org"), 587).isSSL());
    EXPECT_FALSE(SmtpClient(QStringLiteral("smtp.example.org"), 25).isSSL());
}

TEST_F(SmtpClientProtocolTest, MultiLineRepliesSplitAcrossReadsAreReadWhole) {
    server.pieceSize = 7;
    server.greeting = "220-smtp.example.org ESMTP\r\n220-second line\r\n220 ready\r\n";
    server.ehloReply = "250-smtp.example.org greets you\r\n250-AUTH=LOGIN\r\n"
                       "250-AUTH PLAIN CRAM-MD5 LOGIN\r\n250-SIZE 35882577\r\n250 8BITMIME\r\n";

    ASSERT_TRUE(ready());
    recorder->settle();

    EXPECT_EQ(recorder->names(), names({"connectionEstablished", "serviceInitialized"}));
    ASSERT_EQ(server.commands().size(), 1);
    EXPECT_TRUE(server.commands()[0].startsWith("EHLO "));
    EXPECT_EQ(client->lastResponse(), server.ehloReply);
    EXPECT_EQ(client->supportedMechanisms(),
              QStringList(
                  {QStringLiteral("LOGIN"), QStringLiteral("PLAIN"), QStringLiteral("CRAM-MD5")}));
}

TEST_F(SmtpClientProtocolTest, RefusedEhloFallsBackToHeloWithTheSameDomain) {
    server.answer("EHLO", "502 5.5.1 EHLO not implemented\r\n");
    ASSERT_TRUE(ready());
    ASSERT_EQ(server.commands().size(), 2);
    const QByteArray domain = server.commands()[0].mid(5);
    EXPECT_EQ(server.commands()[1], "HELO " + domain);
    // RFC 5321 4.1.4: a domain name, or else an address literal.
    const QString expected = QHostInfo::localHostName().contains(QLatin1Char('.'))
                                 ? QHostInfo::localHostName()
                                 : QStringLiteral("[127.0.0.1]");
    EXPECT_EQ(QString::fromLatin1(domain), expected);
    EXPECT_TRUE(client->supportedMechanisms().isEmpty());

    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageSent"));
    // Without the SIZE extension, MAIL carries no SIZE parameter.
    EXPECT_EQ(server.commands()[2], "MAIL FROM:<sender@example.org>");
}

TEST_F(SmtpClientProtocolTest, EhloRefusedOtherwiseLosesTheConnection) {
    server.answer("EHLO", "421 4.3.2 Shutting down\r\n");
    open();
    ASSERT_TRUE(recorder->arrived("connectionLost"));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("421 4.3.2 Shutting down")));
}

TEST_F(SmtpClientProtocolTest, RefusingGreetingIsAnsweredWithQuitAndLosesTheConnection) {
    server.greeting = "554 5.3.2 No SMTP service here\r\n";
    open();
    ASSERT_TRUE(recorder->arrived("connectionLost"));
    recorder->settle();

    EXPECT_EQ(recorder->names(), names({"connectionEstablished", "connectionLost"}));
    EXPECT_EQ(server.commands(), QList<QByteArray>{"QUIT"});
    EXPECT_EQ(client->lastResponse(), server.greeting);
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("554 5.3.2 No SMTP service here")));
}

TEST_F(SmtpClientProtocolTest, MalformedReplyLosesTheConnection) {
    server.greeting = "Welcome, friend\r\n";
    open();
    ASSERT_TRUE(recorder->arrived("connectionLost"));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("malformed")));
}

TEST_F(SmtpClientProtocolTest, SilentServerTimesOutOnce) {
    server.greeting.clear();
    open(1s);
    ASSERT_TRUE(recorder->arrived("connectionTimedOut"));
    recorder->settle();

    EXPECT_EQ(recorder->names(), names({"connectionEstablished", "connectionTimedOut"}));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("did not answer")));
    EXPECT_TRUE(server.clientDisconnected());
}

TEST_F(SmtpClientProtocolTest, UnreachableServerEndsLikeATimeout) {
    quint16 closedPort = 0;
    {
        QTcpServer probe;
        ASSERT_TRUE(probe.listen(QHostAddress::LocalHost));
        closedPort = probe.serverPort();
    }
    client = std::make_unique<SmtpClient>(QStringLiteral("127.0.0.1"), closedPort, 10s);
    recorder = std::make_unique<SignalRecorder>(*client);
    client->connectInBackgroundAndNotify();

    ASSERT_TRUE(recorder->arrived("connectionTimedOut"));
    EXPECT_EQ(recorder->names(), names({"connectionTimedOut"}));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("Could not connect")));
}

TEST_F(SmtpClientProtocolTest, ConnectionDroppedDuringDataIsLostAndNothingElse) {
    server.dropWhenDataArrives = true;
    ASSERT_TRUE(ready());
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("connectionLost"));
    client->close();
    client->sendMessage();
    recorder->settle();

    EXPECT_EQ(recorder->names(),
              names({"connectionEstablished", "serviceInitialized", "connectionLost"}));
    EXPECT_FALSE(client->errorString().isEmpty());
}

TEST_F(SmtpClientProtocolTest, ServerClosingWhileIdleIsLostWithItsLastWord) {
    server.responder = [](ScriptedServer& s, const QByteArray& line) {
        if (!line.startsWith("EHLO"))
            return false;
        s.standardReply(line);
        s.reply("421 4.4.2 Idle for too long\r\n");
        s.hangUp();
        return true;
    };
    open();
    ASSERT_TRUE(recorder->arrived("connectionLost"));
    EXPECT_EQ(client->lastResponse(), "421 4.4.2 Idle for too long\r\n");
}

TEST_F(SmtpClientProtocolTest, CloseSendsQuitAndTerminatesOnce) {
    ASSERT_TRUE(ready());
    client->close();
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    recorder->settle();

    EXPECT_EQ(recorder->names(),
              names({"connectionEstablished", "serviceInitialized", "connectionTerminated"}));
    EXPECT_EQ(server.commands().last(), "QUIT");
    EXPECT_EQ(server.commands().count("QUIT"), 1);
}

TEST_F(SmtpClientProtocolTest, ServerClosingInsteadOfAnsweringQuitStillTerminates) {
    server.responder = [](ScriptedServer& s, const QByteArray& line) {
        if (line != "QUIT")
            return false;
        s.hangUp();
        return true;
    };
    ASSERT_TRUE(ready());
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    recorder->settle();
    EXPECT_EQ(recorder->names(),
              names({"connectionEstablished", "serviceInitialized", "connectionTerminated"}));
}

TEST_F(SmtpClientProtocolTest, CloseBeforeConnectingTerminates) {
    client = std::make_unique<SmtpClient>(QStringLiteral("127.0.0.1"), server.port(), 10s);
    recorder = std::make_unique<SignalRecorder>(*client);
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    client->connectInBackgroundAndNotify();
    recorder->settle();
    EXPECT_EQ(recorder->names(), names({"connectionTerminated"}));
}

TEST_F(SmtpClientProtocolTest, MessageAboveTheAnnouncedSizeIsRefusedBeforeMail) {
    server.ehloReply = "250-localhost\r\n250 SIZE 100\r\n";
    ASSERT_TRUE(ready());
    client->setMessage(QByteArray(99, 'x') + '\n', sender, recipients); // 101 bytes with CRLF
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageNotSent"));
    recorder->settle();

    EXPECT_EQ(server.commands().size(), 1);
    EXPECT_TRUE(client->lastResponse().isEmpty());
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("101")));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("100")));
}

TEST_F(SmtpClientProtocolTest, MessageWithinTheAnnouncedSizeDeclaresItsSize) {
    server.ehloReply = "250-localhost\r\n250 SIZE 100\r\n";
    ASSERT_TRUE(ready());
    client->setMessage(QByteArray(98, 'x') + '\n', sender, recipients); // 100 bytes with CRLF
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageSent"));
    EXPECT_EQ(server.commands()[1], "MAIL FROM:<sender@example.org> SIZE=100");
    EXPECT_EQ(server.commands()[2], "RCPT TO:<a@example.org>");
    EXPECT_EQ(server.commands()[3], "RCPT TO:<b@example.org>");
    EXPECT_EQ(server.commands()[4], "DATA");
}

struct DataRow {
    std::string name;
    QByteArray message;
    QByteArray onTheWire;
};

class DotStuffingTest : public SmtpClientProtocolTest,
                        public ::testing::WithParamInterface<DataRow> {};

TEST_P(DotStuffingTest, MessageReachesTheWireByteForByte) {
    ASSERT_TRUE(ready());
    client->setMessage(GetParam().message, sender, recipients);
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageSent"));
    EXPECT_EQ(server.data(), GetParam().onTheWire);
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, DotStuffingTest,
    ::testing::Values(
        DataRow{"leading_dot", ".hidden\r\nvisible\r\n", "..hidden\r\nvisible\r\n.\r\n"},
        DataRow{"lone_dot_line", "a\r\n.\r\nb\r\n", "a\r\n..\r\nb\r\n.\r\n"},
        DataRow{"double_dot_line", "..\r\n", "...\r\n.\r\n"},
        DataRow{"dots_inside_lines_untouched", "a.b\r\n x.\r\n", "a.b\r\n x.\r\n.\r\n"},
        DataRow{"bare_lf_and_cr_become_crlf", "one\ntwo\rthree\r\n.four\n",
                "one\r\ntwo\r\nthree\r\n..four\r\n.\r\n"},
        DataRow{"missing_final_line_end", "last line", "last line\r\n.\r\n"},
        DataRow{"ends_with_a_dot_line", "text\r\n.", "text\r\n..\r\n.\r\n"},
        DataRow{"empty_message", "", ".\r\n"}),
    RowName());

struct RefusalRow {
    std::string name;
    QByteArray verb; // empty: the end-of-data reply
    int occurrence;
    QByteArray reply;
};

class ServerRefusalTest : public SmtpClientProtocolTest,
                          public ::testing::WithParamInterface<RefusalRow> {};

TEST_P(ServerRefusalTest, RefusalIsMessageNotSentWithTheReplyAndNothingMoreIsSent) {
    const RefusalRow& row = GetParam();
    int seen = 0;
    server.responder = [&row, &seen](ScriptedServer& s, const QByteArray& line) {
        if (row.verb.isEmpty() || !line.startsWith(row.verb) || ++seen != row.occurrence)
            return false;
        s.reply(row.reply);
        return true;
    };
    if (row.verb.isEmpty())
        server.endOfDataReply = row.reply;
    ASSERT_TRUE(ready());
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageNotSent"));
    const qsizetype commandsAtRefusal = server.commands().size();
    EXPECT_EQ(client->lastResponse(), row.reply);
    EXPECT_TRUE(client->errorString().contains(QString::fromLatin1(row.reply).simplified()));

    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    EXPECT_EQ(server.commands().size(), commandsAtRefusal + 1);
    EXPECT_EQ(server.commands().last(), "QUIT");
    EXPECT_EQ(recorder->count(QStringLiteral("messageSent")), 0);
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, ServerRefusalTest,
    ::testing::Values(RefusalRow{"mail_from_refused", "MAIL", 1,
                                 "553 5.1.8 Sender address rejected\r\n"},
                      RefusalRow{"mail_from_deferred", "MAIL", 1, "451 4.3.0 Try again later\r\n"},
                      RefusalRow{"second_recipient_refused", "RCPT", 2,
                                 "550 5.1.1 <b@example.org>: Recipient address rejected\r\n"},
                      RefusalRow{"data_refused", "DATA", 1, "554 5.5.1 No valid recipients\r\n"},
                      RefusalRow{"end_of_data_refused", "", 0,
                                 "552-5.3.4 Message too big\r\n552 5.3.4 for this mailbox\r\n"}),
    RowName());

struct AuthStep {
    QByteArray client;
    QByteArray server;
};

struct AuthRow {
    std::string name;
    QString mechanism;
    QString password;
    QList<AuthStep> steps;
};

class AuthenticationExchangeTest : public SmtpClientProtocolTest,
                                   public ::testing::WithParamInterface<AuthRow> {};

// CRAM-MD5 uses the example of RFC 2195 2, whose answer the RFC gives.
TEST_P(AuthenticationExchangeTest, ClientSaysExactlyWhatTheMechanismPrescribes) {
    const AuthRow& row = GetParam();
    qsizetype step = 0;
    server.responder = [&row, &step](ScriptedServer& s, const QByteArray& line) {
        if (line.startsWith("EHLO") || line == "QUIT")
            return false;
        const bool expected = step < row.steps.size() && line == row.steps[step].client;
        s.reply(expected ? row.steps[step++].server : "535 5.7.8 Unexpected\r\n");
        return true;
    };
    ASSERT_TRUE(ready());
    client->authenticate(QStringLiteral("tim"), row.password, row.mechanism);
    ASSERT_TRUE(recorder->arrived("authenticationCompleted"))
        << server.commands().last().toStdString();
    EXPECT_EQ(step, row.steps.size());
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, AuthenticationExchangeTest,
    ::testing::Values(AuthRow{"PLAIN",
                              QStringLiteral("PLAIN"),
                              QStringLiteral("tanstaafl"),
                              {{"AUTH PLAIN AHRpbQB0YW5zdGFhZmw=", "235 2.7.0 Accepted\r\n"}}},
                      AuthRow{"plain_in_lower_case",
                              QStringLiteral("plain"),
                              QStringLiteral("tanstaafl"),
                              {{"AUTH PLAIN AHRpbQB0YW5zdGFhZmw=", "235 2.7.0 Accepted\r\n"}}},
                      AuthRow{"LOGIN",
                              QStringLiteral("LOGIN"),
                              QStringLiteral("tanstaafl"),
                              {{"AUTH LOGIN", "334 VXNlcm5hbWU6\r\n"},
                               {"dGlt", "334 UGFzc3dvcmQ6\r\n"},
                               {"dGFuc3RhYWZs", "235 2.7.0 Accepted\r\n"}}},
                      AuthRow{"CRAM_MD5",
                              QStringLiteral("CRAM-MD5"),
                              QStringLiteral("tanstaaftanstaaf"),
                              {{"AUTH CRAM-MD5",
                                "334 PDE4OTYuNjk3MTcwOTUyQHBvc3RvZmZpY2UucmVzdG9uLm1jaS5uZXQ+\r\n"},
                               {"dGltIGI5MTNhNjAyYzdlZGE3YTQ5NWI0ZTZlNzMzNGQzODkw",
                                "235 2.7.0 Accepted\r\n"}}}),
    RowName());

TEST_F(SmtpClientProtocolTest, UnexpectedChallengeIsCancelledAndFails) {
    server.responder = [](ScriptedServer& s, const QByteArray& line) {
        if (line.startsWith("AUTH")) {
            s.reply("334 \r\n");
            return true;
        }
        if (line == "*") {
            s.reply("501 5.7.0 Authentication aborted\r\n");
            return true;
        }
        return false;
    };
    ASSERT_TRUE(ready());
    client->authenticate(QStringLiteral("tim"), QStringLiteral("tanstaafl"),
                         QStringLiteral("PLAIN"));
    ASSERT_TRUE(recorder->arrived("authenticationFailed"));
    EXPECT_EQ(server.commands().last(), "*");
    EXPECT_EQ(client->lastResponse(), "501 5.7.0 Authentication aborted\r\n");
}

TEST_F(SmtpClientProtocolTest, RefusedAuthenticationIsReportedWithoutThePassword) {
    server.answer("AUTH", "535 5.7.8 Authentication credentials invalid\r\n");
    ASSERT_TRUE(ready());
    client->authenticate(QStringLiteral("tim"), QStringLiteral("tanstaafl"),
                         QStringLiteral("PLAIN"));
    ASSERT_TRUE(recorder->arrived("authenticationFailed"));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("535 5.7.8")));
    EXPECT_FALSE(client->errorString().contains(QStringLiteral("tanstaafl")));
    EXPECT_FALSE(client->errorString().contains(QStringLiteral("AHRpbQB0YW5zdGFhZmw=")));
}

struct LocalRefusalRow {
    std::string name;
    std::function<void(SmtpClient&)> operation;
    const char* failure;
};

LocalRefusalRow credentials(std::string name, const QString& user, const QString& password,
                            const QString& mechanism) {
    return {std::move(name),
            [=](SmtpClient& client) { client.authenticate(user, password, mechanism); },
            "authenticationFailed"};
}

LocalRefusalRow envelope(std::string name, const QString& from, const QStringList& to) {
    return {std::move(name),
            [=](SmtpClient& client) {
                client.setMessage(message, from, to);
                client.sendMessage();
            },
            "messageNotSent"};
}

class RefusedBeforeSendingTest : public SmtpClientProtocolTest,
                                 public ::testing::WithParamInterface<LocalRefusalRow> {};

TEST_P(RefusedBeforeSendingTest, NothingReachesTheServer) {
    ASSERT_TRUE(ready());
    GetParam().operation(*client);
    ASSERT_TRUE(recorder->arrived(GetParam().failure));
    recorder->settle();

    EXPECT_EQ(server.commands().size(), 1) << server.commands().last().toStdString();
    EXPECT_TRUE(client->lastResponse().isEmpty());
    EXPECT_FALSE(client->errorString().isEmpty());
    EXPECT_FALSE(client->errorString().contains(QStringLiteral("Tr0ub4dor")));
    EXPECT_FALSE(client->errorString().contains(QLatin1Char('\n')));
}

const QString tim = QStringLiteral("tim");
const QString goodPassword = QStringLiteral("Tr0ub4dor");
const QString from = QStringLiteral("a@example.org");
const QString to = QStringLiteral("b@example.org");

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, RefusedBeforeSendingTest,
    ::testing::Values(
        credentials("crlf_in_user", QStringLiteral("tim\r\nMAIL FROM:<x@example.org>"),
                    goodPassword, QStringLiteral("LOGIN")),
        credentials("lf_in_password", tim, QStringLiteral("Tr0ub4dor\n&3"),
                    QStringLiteral("LOGIN")),
        credentials("cr_in_password", tim, QStringLiteral("Tr0ub4dor\r&3"),
                    QStringLiteral("CRAM-MD5")),
        credentials("nul_in_password", tim, goodPassword + QChar(0) + QStringLiteral("&3"),
                    QStringLiteral("PLAIN")),
        credentials("crlf_in_mechanism", tim, goodPassword, QStringLiteral("PLAIN\r\nRSET")),
        credentials("unknown_mechanism", tim, goodPassword, QStringLiteral("XOAUTH2")),
        envelope("crlf_in_sender", QStringLiteral("a@example.org>\r\nRCPT TO:<evil@example.org"),
                 {to}),
        envelope("lf_in_recipient", from, {to, QStringLiteral("c@example.org\nDATA")}),
        envelope("nul_in_recipient", from, {to + QChar(0)}),
        envelope("angle_bracket_in_recipient", from,
                 {QStringLiteral("b@example.org> NOTIFY=NEVER")}),
        envelope("angle_bracket_in_sender", QStringLiteral("<a@example.org"), {to}),
        envelope("no_recipient", from, {})),
    RowName());

TEST_F(SmtpClientProtocolTest, RefusedStartTlsEndsLikeATimeout) {
    server.answer("STARTTLS", "454 4.7.0 TLS not available\r\n");
    ASSERT_TRUE(ready());
    client->startTLS();
    ASSERT_TRUE(recorder->arrived("connectionTimedOut"));
    EXPECT_FALSE(client->isSSL());
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("454 4.7.0")));
}

// Every operation is called from a slot, as the delivery driver does; a signal emitted from
// inside the call would arrive while `inCall` is set.
TEST_F(SmtpClientProtocolTest, SignalsNeverArriveFromInsideTheCallThatCausedThem) {
    server.ehloReply = "250-localhost\r\n250 SIZE 20\r\n";
    client = std::make_unique<SmtpClient>(QStringLiteral("127.0.0.1"), server.port(), 10s);
    recorder = std::make_unique<SignalRecorder>(*client);
    bool inCall = false;
    int signalsDuringCalls = 0;
    const auto call = [&inCall](auto&& operation) {
        inCall = true;
        operation();
        inCall = false;
    };
    recorder->onSignal = [&](const QString& name) {
        signalsDuringCalls += inCall ? 1 : 0;
        SmtpClient& c = *client;
        if (name == QLatin1String("serviceInitialized")) {
            call([&c] {
                c.authenticate(QStringLiteral("tim\n"), QString(), QStringLiteral("PLAIN"));
            });
        } else if (name == QLatin1String("authenticationFailed")) {
            call([&c] {
                c.setMessage(message, sender, {QStringLiteral("x@example.org\r\n")});
                c.sendMessage();
            });
        } else if (name == QLatin1String("messageNotSent") && recorder->count(name) == 1) {
            call([&c] {
                c.setMessage(QByteArray(40, 'x'), sender, recipients); // above SIZE 20
                c.sendMessage();
            });
        } else if (name == QLatin1String("messageNotSent")) {
            call([&c] { c.close(); });
        }
    };
    call([this] { client->connectInBackgroundAndNotify(); });
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));

    EXPECT_EQ(signalsDuringCalls, 0);
    EXPECT_EQ(recorder->names(),
              names({"connectionEstablished", "serviceInitialized", "authenticationFailed",
                     "messageNotSent", "messageNotSent", "connectionTerminated"}));
}

TEST_F(SmtpClientProtocolTest, DriverMayCloseAndDeleteTheSessionFromItsSlots) {
    QPointer<SmtpClient> session =
        new SmtpClient(QStringLiteral("127.0.0.1"), server.port(), std::chrono::seconds(10));
    SmtpClient* raw = session.data();
    QObject::connect(raw, &SmtpSession::serviceInitialized, raw, [raw] {
        raw->setMessage(message, sender, recipients);
        raw->sendMessage();
    });
    QObject::connect(raw, &SmtpSession::messageSent, raw, [raw] { raw->close(); });
    QObject::connect(raw, &SmtpSession::connectionTerminated, raw, [raw] { raw->deleteLater(); });
    raw->connectInBackgroundAndNotify();

    const QDeadlineTimer guard(20s);
    while (session && !guard.hasExpired())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
    ASSERT_TRUE(session.isNull());
    EXPECT_EQ(server.data(), message + ".\r\n");
    EXPECT_EQ(server.commands().last(), "QUIT");
}

} // namespace
