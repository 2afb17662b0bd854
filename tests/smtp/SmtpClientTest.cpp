// SmtpClient in whole conversations, driven as the delivery drives it: with a real server,
// aiosmtpd (smtp_server.py), plain and over TLS with a throw-away CA; and with servers that
// misbehave on purpose (scripted_server.py). Each row is a section of tests/data/smtp/
// aiosmtpd.txt or conversations.txt, whose head tells how its lines read.

#include "RowName.h"
#include "SessionDriver.h"
#include "SmtpData.h"
#include "e2e/E2eSupport.h"

#include <QHostInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <ranges>

namespace {

struct Row {
    std::string name;
    Plan plan = {};
    QString server = {}, trust = {}, signals = {}, error = {}, mechanisms = {};
    QByteArray last = {};
    QList<QByteArray> arrives = {};
    QStringList unread = {}; // lines of no known kind
    friend void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }
};

std::vector<Row> rowsOf(const QStringList& files) {
    std::vector<Row> rows;
    for (const QString& text : files | std::views::transform(smtpData))
        for (const std::string& name : sectionNames(text)) {
            Row& row = rows.emplace_back(Row{name});
            Plan& plan = row.plan;
            const QHash<QString, QString*> texts = {
                {"aiosmtpd", &row.server},      {"mechanism", &plan.mechanism},
                {"user", &plan.user},           {"password", &plan.password},
                {"sender", &plan.sender},       {"signals", &row.signals},
                {"error", &row.error},          {"trust", &row.trust},
                {"mechanisms", &row.mechanisms}};
            const QHash<QString, bool*> flags = {{"starttls", &plan.startTls},
                                                 {"implicit tls", &plan.implicitTls},
                                                 {"close first", &plan.closeFirst},
                                                 {"no handshake", &plan.startSsl},
                                                 {"plain only", &plan.plainOnly}};
            for (const QString& line : sectionOf(text, name).split('\n')) {
                const QString key = line.mid(2).section(':', 0, 0);
                const QByteArray raw = unescape(line.section(':', 1).trimmed().toUtf8());
                if (!line.startsWith("> "))
                    continue;
                else if (QString* field = texts.value(key))
                    *field = QString::fromUtf8(raw);
                else if (bool* flag = flags.value(key))
                    *flag = key != "no handshake";
                else if (key == "recipients")
                    plan.recipients = QString::fromUtf8(raw).split('|', Qt::SkipEmptyParts);
                else if (key == "send" || key == "arrives")
                    (key == "send" ? plan.messages : row.arrives) += raw;
                else if (key == "last")
                    row.last = raw;
                else if (key == "timeout")
                    plan.timeout = std::chrono::seconds(raw.toInt());
                else
                    row.unread += line;
            }
        }
    return rows;
}

void expectOutcome(const Outcome& out, const Row& row) {
    EXPECT_EQ(row.unread.join('\n').toStdString(), "");
    EXPECT_EQ(out.signals.toStdString(), row.signals.toStdString());
    EXPECT_EQ(out.lastResponse.toStdString(), row.last.toStdString());
    EXPECT_TRUE(row.error.isEmpty() ? out.error.isEmpty()
                                    : QRegularExpression(row.error).match(out.error).hasMatch())
        << out.error.toStdString();
    const QByteArray plain = ('\0' + row.plan.user + '\0' + row.plan.password).toUtf8().toBase64();
    EXPECT_FALSE(out.error.contains('\n') || out.error.contains("tanstaafl") ||
                 (!row.plan.password.isEmpty() && out.error.contains(row.plan.password)) ||
                 out.error.contains(QString::fromLatin1(plain)));
    EXPECT_EQ(out.mechanisms.join('|').toStdString(), row.mechanisms.toStdString());
    EXPECT_EQ(out.ssl, row.plan.implicitTls || row.mechanisms.contains('|'));
}

bool setVariable(const char* name, const QString& value) {
    return value.isEmpty() ? qunsetenv(name) : qputenv(name, value.toLocal8Bit());
}

// With aiosmtpd: what arrives is what was sent, from and to whom it was sent.
void withAiosmtpd(const Row& row) {
    const QTemporaryDir folder;
    const Certificates pki(folder.path());
    ASSERT_TRUE(pki.ok);
    const QStringList options = QStringList{"--password", "s3cret-pa55"} +
                                QString(row.server).replace("PKI/", folder.path() + '/').split(' ');
    ServerProcess server(QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py"), options);
    ASSERT_NE(server.port(), 0);
    setVariable("SSL_CERT_FILE", row.trust == "file" ? pki.ca : "");
    setVariable("SSL_CERT_DIR", row.trust == "folder" ? "/none:" + folder.path() : "");
    const Plan& plan = row.plan;
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

class Conversation : public ::testing::TestWithParam<Row> {};

// With the scripted server: the client says what it is to say, and then leaves.
TEST_P(Conversation, Ends) {
    const Row& row = GetParam();
    if (!row.server.isEmpty())
        return withAiosmtpd(row);
    ServerProcess server(
        QStringLiteral(PELMO_TEST_DIR "/smtp/scripted_server.py"),
        {PELMO_TEST_DATA "/smtp/conversations.txt", QString::fromStdString(row.name)});
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
    for (const QString& line : sectionOf(smtpData("conversations.txt"), row.name).split('\n'))
        expected += line.startsWith("C:") ? QStringList{line.mid(3)} : QStringList();
    EXPECT_EQ(received.join('\n').toStdString(), expected.join('\n').toStdString());
}

INSTANTIATE_TEST_SUITE_P(SmtpClient, Conversation,
                         ::testing::ValuesIn(rowsOf({"aiosmtpd.txt", "conversations.txt"})),
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
