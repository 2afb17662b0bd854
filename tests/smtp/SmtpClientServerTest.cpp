// SmtpClient against a real SMTP server (aiosmtpd through tests/smtp/smtp_server.py) on
// 127.0.0.1: plain, STARTTLS and implicit TLS with a throw-away certificate authority, the three
// authentication mechanisms, and what arrives at the server.

#include "AiosmtpdServer.h"
#include "RowName.h"
#include "SignalRecorder.h"
#include "ThrowAwayPki.h"
#include "smtp/SmtpClient.h"

#include <QJsonArray>
#include <gtest/gtest.h>

#include <optional>

namespace {

using namespace std::chrono_literals;

const QByteArray message = "From: sender@example.org\r\nSubject: dots\r\n\r\n"
                           ".a line that starts with a dot\r\n.\r\n..\r\nend\r\n";
const QString sender = QStringLiteral("sender@example.org");
const QString password = QStringLiteral("s3cret-pa55");

const ThrowAwayPki& pki() {
    static const ThrowAwayPki made;
    return made;
}

// Sets (or, with a null value, removes) an environment variable for one scope.
class ScopedEnvironment {
public:
    ScopedEnvironment(const char* name, const QString& value)
        : m_name(name), m_had(qEnvironmentVariableIsSet(name)), m_old(qgetenv(name)) {
        if (value.isNull())
            qunsetenv(name);
        else
            qputenv(name, value.toLocal8Bit());
    }
    ~ScopedEnvironment() {
        if (m_had)
            qputenv(m_name, m_old);
        else
            qunsetenv(m_name);
    }
    ScopedEnvironment(const ScopedEnvironment&) = delete;
    ScopedEnvironment& operator=(const ScopedEnvironment&) = delete;

private:
    const char* m_name;
    bool m_had;
    QByteArray m_old;
};

enum class Transport { Plain, StartTLS, Implicit };

QStringList serverOptions(Transport transport, const QString& certificate = "server") {
    QStringList options = {QStringLiteral("--password"), password, QStringLiteral("--tls"),
                           transport == Transport::Plain      ? QStringLiteral("none")
                           : transport == Transport::StartTLS ? QStringLiteral("starttls")
                                                              : QStringLiteral("implicit")};
    if (transport != Transport::Plain)
        options += {QStringLiteral("--cert"), pki().certificate(certificate),
                    QStringLiteral("--key"), pki().key(certificate)};
    return options;
}

class SmtpClientServerTest : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(pki().ok()) << pki().error().toStdString(); }

    // Starts the server and a client for it; false (with the reason recorded) on failure.
    ::testing::AssertionResult start(Transport transport, const QStringList& extra = {},
                                     std::chrono::seconds timeout = 10s,
                                     const QString& certificate = QStringLiteral("server")) {
        server.emplace(serverOptions(transport, certificate) + extra);
        if (server->port() == 0)
            return ::testing::AssertionFailure() << server->failure().toStdString();
        client.emplace(QStringLiteral("127.0.0.1"), server->port(), timeout);
        client->setImplicitTLS(transport == Transport::Implicit);
        recorder.emplace(*client);
        client->setMessage(message, sender, {QStringLiteral("rcpt@example.org")});
        return ::testing::AssertionSuccess();
    }

    // Connects and goes as far as the service on the wanted transport, as the driver does.
    ::testing::AssertionResult serviceUp(Transport transport) {
        client->connectInBackgroundAndNotify();
        if (auto established = recorder->arrived("connectionEstablished"); !established)
            return established;
        if (transport == Transport::Implicit)
            client->startSSL();
        if (auto initialized = recorder->arrived("serviceInitialized"); !initialized)
            return initialized;
        if (transport != Transport::StartTLS)
            return ::testing::AssertionSuccess();
        client->startTLS();
        return recorder->arrived("serviceInitialized", 2);
    }

    ScopedEnvironment trustFile{"SSL_CERT_FILE", pki().caCertificate()};
    ScopedEnvironment noTrustFolder{"SSL_CERT_DIR", QString()};
    std::optional<AiosmtpdServer> server;
    std::optional<SmtpClient> client;
    std::optional<SignalRecorder> recorder;
};

struct SendRow {
    std::string name;
    Transport transport;
    QString mechanism;
};

class AuthenticatedSendTest : public SmtpClientServerTest,
                              public ::testing::WithParamInterface<SendRow> {};

TEST_P(AuthenticatedSendTest, MessageArrivesWhole) {
    const SendRow& row = GetParam();
    ASSERT_TRUE(start(row.transport));
    EXPECT_EQ(client->isSSL(), row.transport == Transport::Implicit);
    ASSERT_TRUE(serviceUp(row.transport));
    EXPECT_EQ(client->isSSL(), row.transport != Transport::Plain);
    EXPECT_TRUE(client->supportedMechanisms().contains(row.mechanism));

    client->authenticate(QStringLiteral("user"), password, row.mechanism);
    ASSERT_TRUE(recorder->arrived("authenticationCompleted"));
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageSent"));
    EXPECT_TRUE(client->lastResponse().startsWith("250 2.0.0 Message accepted"));
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));

    const auto received = server->nextMessage();
    ASSERT_TRUE(received.has_value());
    EXPECT_EQ(received->value("mail_from").toString(), sender);
    EXPECT_EQ(received->value("rcpt_tos").toArray(), QJsonArray{"rcpt@example.org"});
    EXPECT_EQ(received->value("mail_options").toArray(),
              QJsonArray{QStringLiteral("SIZE=%1").arg(message.size())});
    EXPECT_EQ(QByteArray::fromBase64(received->value("data").toString().toLatin1()), message);
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, AuthenticatedSendTest,
    ::testing::Values(SendRow{"PLAIN_plain", Transport::Plain, QStringLiteral("PLAIN")},
                      SendRow{"LOGIN_plain", Transport::Plain, QStringLiteral("LOGIN")},
                      SendRow{"CRAM_MD5_plain", Transport::Plain, QStringLiteral("CRAM-MD5")},
                      SendRow{"PLAIN_starttls", Transport::StartTLS, QStringLiteral("PLAIN")},
                      SendRow{"LOGIN_starttls", Transport::StartTLS, QStringLiteral("LOGIN")},
                      SendRow{"CRAM_MD5_starttls", Transport::StartTLS, QStringLiteral("CRAM-MD5")},
                      SendRow{"PLAIN_implicit", Transport::Implicit, QStringLiteral("PLAIN")},
                      SendRow{"LOGIN_implicit", Transport::Implicit, QStringLiteral("LOGIN")},
                      SendRow{"CRAM_MD5_implicit", Transport::Implicit,
                              QStringLiteral("CRAM-MD5")}),
    RowName());

class WrongPasswordTest : public SmtpClientServerTest,
                          public ::testing::WithParamInterface<SendRow> {};

TEST_P(WrongPasswordTest, FailsWithoutShowingThePassword) {
    const SendRow& row = GetParam();
    ASSERT_TRUE(start(row.transport));
    ASSERT_TRUE(serviceUp(row.transport));
    client->authenticate(QStringLiteral("user"), QStringLiteral("wrong-pa55"), row.mechanism);
    ASSERT_TRUE(recorder->arrived("authenticationFailed"));
    EXPECT_TRUE(client->lastResponse().startsWith("535 "));
    EXPECT_TRUE(client->errorString().contains(QStringLiteral("535")));
    EXPECT_FALSE(client->errorString().contains(QStringLiteral("wrong-pa55")));
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    EXPECT_TRUE(server->stopAndCheckIdle());
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, WrongPasswordTest,
    ::testing::Values(SendRow{"PLAIN", Transport::Plain, QStringLiteral("PLAIN")},
                      SendRow{"LOGIN", Transport::StartTLS, QStringLiteral("LOGIN")},
                      SendRow{"CRAM_MD5", Transport::Implicit, QStringLiteral("CRAM-MD5")}),
    RowName());

TEST_F(SmtpClientServerTest, StartTlsForgetsWhatWasAnnouncedInTheClear) {
    ASSERT_TRUE(start(Transport::StartTLS, {QStringLiteral("--require-starttls")}));
    client->connectInBackgroundAndNotify();
    ASSERT_TRUE(recorder->arrived("serviceInitialized"));
    EXPECT_FALSE(client->isSSL());
    // This server offers AUTH only over TLS, so only a second EHLO can reveal it.
    EXPECT_TRUE(client->supportedMechanisms().isEmpty());

    client->startTLS();
    ASSERT_TRUE(recorder->arrived("serviceInitialized", 2));
    EXPECT_TRUE(client->isSSL());
    EXPECT_EQ(client->supportedMechanisms(),
              QStringList(
                  {QStringLiteral("CRAM-MD5"), QStringLiteral("LOGIN"), QStringLiteral("PLAIN")}));
    // A server requiring STARTTLS takes mail only after it.
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageSent"));
    EXPECT_TRUE(server->nextMessage().has_value());
}

TEST_F(SmtpClientServerTest, RefusedRecipientStopsTheMessage) {
    ASSERT_TRUE(start(Transport::Plain,
                      {QStringLiteral("--refuse-recipient"), QStringLiteral("gone@example.org")}));
    client->setMessage(message, sender,
                       {QStringLiteral("rcpt@example.org"), QStringLiteral("gone@example.org")});
    ASSERT_TRUE(serviceUp(Transport::Plain));
    client->sendMessage();
    ASSERT_TRUE(recorder->arrived("messageNotSent"));
    EXPECT_EQ(client->lastResponse(),
              "550 5.1.1 <gone@example.org>: Recipient address rejected\r\n");
    client->close();
    ASSERT_TRUE(recorder->arrived("connectionTerminated"));
    EXPECT_TRUE(server->stopAndCheckIdle());
}

TEST_F(SmtpClientServerTest, ImplicitTlsWaitsForStartSslUntilTheTimeout) {
    ASSERT_TRUE(start(Transport::Implicit, {}, 1s));
    client->connectInBackgroundAndNotify();
    ASSERT_TRUE(recorder->arrived("connectionTimedOut"));
    EXPECT_EQ(recorder->joined(), QStringLiteral("connectionEstablished,connectionTimedOut"));
}

struct HandshakeRow {
    std::string name;
    Transport transport;
    bool trustTheCa;
    QString certificate;
};

class FailedHandshakeTest : public SmtpClientServerTest,
                            public ::testing::WithParamInterface<HandshakeRow> {};

TEST_P(FailedHandshakeTest, EndsLikeATimeoutWithTheReason) {
    const HandshakeRow& row = GetParam();
    ScopedEnvironment trust("SSL_CERT_FILE", row.trustTheCa ? pki().caCertificate() : QString());
    ASSERT_TRUE(start(row.transport, {}, 10s, row.certificate));
    client->connectInBackgroundAndNotify();
    ASSERT_TRUE(recorder->arrived("connectionEstablished"));
    if (row.transport == Transport::Implicit) {
        client->startSSL();
    } else {
        ASSERT_TRUE(recorder->arrived("serviceInitialized"));
        client->startTLS();
    }
    ASSERT_TRUE(recorder->arrived("connectionTimedOut"));
    recorder->settle();

    EXPECT_EQ(recorder->count(QStringLiteral("connectionTimedOut")), 1);
    EXPECT_EQ(recorder->count(QStringLiteral("serviceInitialized")),
              row.transport == Transport::Implicit ? 0 : 1);
    EXPECT_TRUE(client->errorString().startsWith(QStringLiteral("TLS handshake with 127.0.0.1")))
        << client->errorString().toStdString();
    EXPECT_FALSE(client->isSSL() && row.transport == Transport::StartTLS);
    EXPECT_TRUE(server->stopAndCheckIdle());
}

INSTANTIATE_TEST_SUITE_P(
    SmtpClient, FailedHandshakeTest,
    ::testing::Values(
        HandshakeRow{"untrusted_starttls", Transport::StartTLS, false, "server"},
        HandshakeRow{"untrusted_implicit", Transport::Implicit, false, "server"},
        HandshakeRow{"wrong_host_name_starttls", Transport::StartTLS, true, "stranger"},
        HandshakeRow{"wrong_host_name_implicit", Transport::Implicit, true, "stranger"}),
    RowName());

TEST_F(SmtpClientServerTest, CertificateFolderIsTrustedToo) {
    ScopedEnvironment noFile("SSL_CERT_FILE", QString());
    ScopedEnvironment folder("SSL_CERT_DIR", QStringLiteral("/nonexistent:") + pki().folder());
    ASSERT_TRUE(start(Transport::StartTLS));
    ASSERT_TRUE(serviceUp(Transport::StartTLS));
    EXPECT_TRUE(client->isSSL());
}

TEST_F(SmtpClientServerTest, TrustedCertificatesAddToTheSystemStore) {
    const QList<QSslCertificate> ca = QSslCertificate::fromPath(pki().caCertificate());
    ASSERT_EQ(ca.size(), 1);
    const QList<QSslCertificate> trusted = SmtpClient::tlsConfiguration().caCertificates();
    EXPECT_TRUE(trusted.contains(ca.first()));
    for (const QSslCertificate& system : QSslConfiguration::systemCaCertificates())
        ASSERT_TRUE(trusted.contains(system)) << system.subjectDisplayName().toStdString();

    ScopedEnvironment noFile("SSL_CERT_FILE", QString());
    EXPECT_EQ(SmtpClient::tlsConfiguration().caCertificates(),
              QSslConfiguration::defaultConfiguration().caCertificates());
}

} // namespace
