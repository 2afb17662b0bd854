#include "E2eSupport.h"

#include <QDir>
#include <QFile>
#include <gtest/gtest.h>

namespace {

inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}

const QString kServer = QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py");
const QString kBadServer = QStringLiteral(PELMO_TEST_DIR "/e2e/bad_smtp_server.py");

// pelmo send as a user runs it: an address book imported from a vCard file, settings given for
// the run, every status line printed, one copy per friend through a real server.
class SendRun : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(home.isValid());
        environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("XDG_DATA_HOME"), home.filePath(QStringLiteral("data")));
        environment.insert(QStringLiteral("XDG_CONFIG_HOME"),
                           home.filePath(QStringLiteral("config")));
        environment.remove(QStringLiteral("SSL_CERT_FILE"));
        const PelmoRun imported =
            runPelmo({QStringLiteral("contacts"), QStringLiteral("import"),
                      QStringLiteral(PELMO_SOURCE_DIR "/samples/friends.vcf")},
                     environment);
        ASSERT_EQ(imported.status, 0) << imported.err.toStdString();
        QFile body(home.filePath(QStringLiteral("body.txt")));
        ASSERT_TRUE(body.open(QIODevice::WriteOnly));
        body.write("Dear {toName},\nthe club meets on Friday. {fromName} <{from}>\n");
    }

    QStringList sendTo(int port, const QStringList& extra) const {
        return QStringList{QStringLiteral("send"),
                           QStringLiteral("--subject"),
                           QStringLiteral("Club news"),
                           QStringLiteral("--message"),
                           home.filePath(QStringLiteral("body.txt")),
                           QStringLiteral("--set"),
                           QStringLiteral("serverAddress=localhost"),
                           QStringLiteral("--set"),
                           QStringLiteral("serverPort=%1").arg(port),
                           QStringLiteral("--set"),
                           QStringLiteral("senderEmail=club@example.org"),
                           QStringLiteral("--set"),
                           QStringLiteral("senderName=The Club"),
                           QStringLiteral("--set"),
                           QStringLiteral("selectedContentType=1"),
                           QStringLiteral("--set"),
                           QStringLiteral("smtpTimeout=3")} +
               extra;
    }

    QStringList logLines() const {
        QFile log(home.filePath(QStringLiteral("data/Orvale Software/Pelmo/Pelmo.log")));
        if (!log.open(QIODevice::ReadOnly))
            return {};
        const QByteArray bytes = log.readAll();
        EXPECT_FALSE(bytes.contains('\n')) << "log lines end in a carriage return";
        return QString::fromUtf8(bytes).split(QLatin1Char('\r'), Qt::SkipEmptyParts);
    }

    static QStringList withoutDates(const QString& out) {
        QStringList lines;
        for (QString line : out.split(QLatin1Char('\n'), Qt::SkipEmptyParts)) {
            if (line.startsWith(QLatin1String("[Mailing")))
                line = line.left(line.indexOf(QLatin1String(" at ")) + 4) + QLatin1String("...]");
            else if (line.startsWith(QLatin1Char('[')))
                line = QLatin1String("[...]") + line.mid(line.indexOf(QLatin1Char(']')) + 1);
            lines << line;
        }
        return lines;
    }

    QTemporaryDir home;
    QProcessEnvironment environment;
};

TEST_F(SendRun, AGroupOfThreeGetsThreePersonalCopies) {
    ServerProcess server(kServer, {});
    ASSERT_NE(server.port(), 0);
    const PelmoRun run = runPelmo(
        sendTo(server.port(), {QStringLiteral("--group"), QStringLiteral("Friends")}), environment);
    ASSERT_EQ(run.status, 0) << run.out.toStdString() << run.err.toStdString();

    const QStringList names = {QStringLiteral("Ada Lovelace"), QStringLiteral("Charles Babbage"),
                               QStringLiteral("Alan Turing")};
    const QStringList addresses = {QStringLiteral("ada@example.org"),
                                   QStringLiteral("charles@example.org"),
                                   QStringLiteral("alan@example.org")};
    QStringList expected = {QStringLiteral("Sending mail.")};
    for (int i = 0; i < 3; ++i)
        expected << QStringLiteral("[Mailing started at ...]")
                 << QStringLiteral("[...] Mail to: %1 <%2>").arg(names[i], addresses[i])
                 << QStringLiteral("Connecting to the localhost server.")
                 << QStringLiteral("Connected to the localhost server.")
                 << QStringLiteral("Sending the message.")
                 << QStringLiteral("Message sent. Closing the connection.")
                 << QStringLiteral("Connection closed. Done.");
    expected << QStringLiteral("[Mailing completed at ...]");
    const QStringList printed = withoutDates(run.out);
    EXPECT_EQ(printed.mid(printed.indexOf(QStringLiteral("Sending mail."))), expected);
    // The log holds the same lines, framed by its start and stop markers.
    const QStringList log = logLines();
    ASSERT_GE(log.size(), 2);
    EXPECT_TRUE(log.first().startsWith(QLatin1String("[Logging starting at ")));
    EXPECT_TRUE(log.last().startsWith(QLatin1String("[Logging stopping at ")));
    EXPECT_EQ(withoutDates(log.mid(1, expected.size()).join(QLatin1Char('\n'))), expected);

    const QList<QByteArray> records = server.records();
    ASSERT_EQ(records.size(), 3);
    for (int i = 0; i < 3; ++i) {
        const ReceivedMessage message = parseMessage(messageOf(records[i]));
        EXPECT_EQ(message.subject,
                  QStringLiteral("Club news")); // tags are the body's, not the subject's
        EXPECT_EQ(message.to, QStringLiteral("%1 <%2>").arg(names[i], addresses[i]));
        EXPECT_EQ(message.from, QStringLiteral("The Club <club@example.org>"));
        EXPECT_EQ(message.topType, QStringLiteral("multipart/mixed"));
        EXPECT_FALSE(message.date.isEmpty());
        EXPECT_FALSE(message.messageId.isEmpty());
        EXPECT_EQ(message.mimeVersion, QStringLiteral("1.0"));
        EXPECT_FALSE(message.bareLineFeed);
        ASSERT_EQ(message.parts.size(), 1);
        EXPECT_EQ(message.parts[0].mimeType, QStringLiteral("text/plain"));
        EXPECT_EQ(message.parts[0].charset, QStringLiteral("utf-8"));
        EXPECT_EQ(message.parts[0].encoding, QStringLiteral("base64"));
        EXPECT_EQ(
            QString::fromUtf8(message.parts[0].content),
            QStringLiteral("Dear %1,\r\nthe club meets on Friday. The Club <club@example.org>\r\n")
                .arg(names[i]));
    }
}

TEST_F(SendRun, TlsAndEveryLoginMechanism) {
    const Certificates certificates(home.path());
    ASSERT_TRUE(certificates.ok);
    environment.insert(QStringLiteral("SSL_CERT_FILE"), certificates.ca);
    struct Row {
        const char* name;
        const char* tls;
        int mechanism;
    };
    const Row rows[] = {{"starttls plain", "starttls", 1},
                        {"starttls login", "starttls", 2},
                        {"starttls cram-md5", "starttls", 3},
                        {"implicit tls login", "implicit", 2}};
    for (const Row& row : rows) {
        ServerProcess server(kServer,
                             {QStringLiteral("--tls"), QLatin1String(row.tls),
                              QStringLiteral("--cert"), certificates.cert, QStringLiteral("--key"),
                              certificates.key, QStringLiteral("--user"), QStringLiteral("club"),
                              QStringLiteral("--password"), QStringLiteral("s3cret pass")});
        ASSERT_NE(server.port(), 0) << row.name;
        const bool implicit = QLatin1String(row.tls) == QLatin1String("implicit");
        const PelmoRun run = runPelmo(
            sendTo(server.port(),
                   {QStringLiteral("--to"), QStringLiteral("ada@example.org"),
                    QStringLiteral("--name"), QStringLiteral("Ada"), QStringLiteral("--set"),
                    QStringLiteral("useSSL=true"), QStringLiteral("--set"),
                    QStringLiteral("implicitTLS=%1").arg(implicit), QStringLiteral("--set"),
                    QStringLiteral("selectedAuthentication=%1").arg(row.mechanism),
                    QStringLiteral("--set"), QStringLiteral("loginUsername=club"),
                    QStringLiteral("--set"), QStringLiteral("loginPassword=s3cret pass")}),
            environment);
        EXPECT_EQ(run.status, 0) << row.name << run.out.toStdString();
        EXPECT_TRUE(
            run.out.contains(QLatin1String(implicit ? "Starting SSL.\n" : "SSL handshaking...\n")))
            << row.name;
        EXPECT_TRUE(
            run.out.contains(QLatin1String("Authentication completed. Sending the message.\n")))
            << row.name;
        EXPECT_FALSE(run.out.contains(QLatin1String("s3cret")) ||
                     run.err.contains(QLatin1String("s3cret")))
            << row.name;
        const QList<QByteArray> records = server.records();
        ASSERT_EQ(records.size(), 1) << row.name;
        EXPECT_TRUE(
            parseMessage(messageOf(records[0])).parts.value(0).content.startsWith("Dear Ada,"))
            << row.name;
    }
}

TEST_F(SendRun, FailuresEndTheRunAndSayWhy) {
    struct Row {
        const char* name;
        QStringList serverArguments;
        bool badServer;
        QStringList sendArguments;
        QStringList expectedLines;
    };
    const QStringList toAda = {QStringLiteral("--to"), QStringLiteral("ada@example.org"),
                               QStringLiteral("--name"), QStringLiteral("Ada")};
    const QStringList login = {QStringLiteral("--set"), QStringLiteral("selectedAuthentication=1"),
                               QStringLiteral("--set"), QStringLiteral("loginUsername=user"),
                               QStringLiteral("--set"), QStringLiteral("loginPassword=wrong")};
    const Row rows[] = {
        {"refused recipient",
         {QStringLiteral("--refuse-recipient"), QStringLiteral("ada@example.org")},
         false,
         toAda,
         {QStringLiteral(
             "Message not sent: 550 5.1.1 <ada@example.org>: Recipient address rejected")}},
        {"refused password",
         {},
         false,
         toAda + login,
         {QStringLiteral("Authentication failed. Closing the connection."),
          QStringLiteral("Connection closed. Done.")}},
        {"dropped in the middle of the message",
         {QStringLiteral("--mode"), QStringLiteral("drop-in-data")},
         true,
         toAda,
         {QStringLiteral("Connection closed. Done.")}},
        {"never answers",
         {QStringLiteral("--mode"), QStringLiteral("silent")},
         true,
         toAda,
         {QStringLiteral("Connection lost.")}},
    };
    for (const Row& row : rows) {
        ServerProcess server(row.badServer ? kBadServer : kServer, row.serverArguments);
        ASSERT_NE(server.port(), 0) << row.name;
        const PelmoRun run = runPelmo(sendTo(server.port(), row.sendArguments), environment);
        EXPECT_EQ(run.status, 1) << row.name << run.out.toStdString();
        for (const QString& line : row.expectedLines)
            EXPECT_TRUE(run.out.split(QLatin1Char('\n')).contains(line))
                << row.name << ": " << line.toStdString() << "\n"
                << run.out.toStdString();
        EXPECT_FALSE(run.out.contains(QLatin1String("Message sent."))) << row.name;
        EXPECT_TRUE(server.records().isEmpty()) << row.name;
    }
}

TEST_F(SendRun, AnUntrustedCertificateIsReportedAndNothingIsSent) {
    const Certificates certificates(home.path());
    ASSERT_TRUE(certificates.ok);
    ServerProcess server(kServer, {QStringLiteral("--tls"), QStringLiteral("starttls"),
                                   QStringLiteral("--cert"), certificates.cert,
                                   QStringLiteral("--key"), certificates.key});
    const PelmoRun run =
        runPelmo(sendTo(server.port(), {QStringLiteral("--to"), QStringLiteral("ada@example.org"),
                                        QStringLiteral("--name"), QStringLiteral("Ada"),
                                        QStringLiteral("--set"), QStringLiteral("useSSL=true")}),
                 environment);
    EXPECT_EQ(run.status, 1);
    const QStringList lines = run.out.split(QLatin1Char('\n'), Qt::SkipEmptyParts);
    ASSERT_TRUE(lines.contains(QStringLiteral("Connection lost."))) << run.out.toStdString();
    EXPECT_FALSE(
        lines.at(lines.indexOf(QStringLiteral("Connection lost.")) + 1).isEmpty()); // and why
    EXPECT_TRUE(server.records().isEmpty());
}

TEST_F(SendRun, ADryRunWritesEveryCopyAndUsageErrorsSayHow) {
    const QString copies = home.filePath(QStringLiteral("copies"));
    const PelmoRun run = runPelmo(sendTo(1, {QStringLiteral("--group"), QStringLiteral("Friends"),
                                             QStringLiteral("--dry-run"), copies}),
                                  environment);
    ASSERT_EQ(run.status, 0) << run.out.toStdString();
    const QStringList files = QDir(copies).entryList(QDir::Files, QDir::Name);
    EXPECT_EQ(files, (QStringList{QStringLiteral("0001.eml"), QStringLiteral("0002.eml"),
                                  QStringLiteral("0003.eml")}));
    QFile third(QDir(copies).filePath(QStringLiteral("0003.eml")));
    ASSERT_TRUE(third.open(QIODevice::ReadOnly));
    EXPECT_TRUE(
        parseMessage(third.readAll()).parts.value(0).content.startsWith("Dear Alan Turing,"));

    for (const QStringList& wrong :
         {QStringList{QStringLiteral("send"), QStringLiteral("--bogus")},
          QStringList{QStringLiteral("send"), QStringLiteral("--set"), QStringLiteral("port=1")},
          QStringList{QStringLiteral("send"), QStringLiteral("--group"), QStringLiteral("A"),
                      QStringLiteral("--to"), QStringLiteral("b@c")},
          QStringList{QStringLiteral("send"), QStringLiteral("--subject")}}) {
        const PelmoRun usage = runPelmo(wrong, environment);
        EXPECT_EQ(usage.status, 2) << wrong.join(QLatin1Char(' ')).toStdString();
        EXPECT_TRUE(usage.err.contains(QLatin1String("usage: pelmo send")))
            << usage.err.toStdString();
    }
    const PelmoRun missing = runPelmo(
        {QStringLiteral("send"), QStringLiteral("--attach"), QStringLiteral("/no/such/file")},
        environment);
    EXPECT_EQ(missing.status, 1);
    EXPECT_TRUE(missing.err.contains(QLatin1String("cannot read the attachment /no/such/file")));
}

} // namespace
