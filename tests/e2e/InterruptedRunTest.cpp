// Whole pelmo send runs that do not go as planned: one killed in the middle and resumed, and
// one whose refused members are mailed again through the group it makes of them.

#include "E2eSupport.h"

#include <QDir>
#include <QElapsedTimer>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QThread>
#include <gtest/gtest.h>

#include <csignal>

namespace {

class Home {
public:
    Home() {
        environment.insert("XDG_DATA_HOME", home.filePath("data"));
        environment.insert("XDG_CONFIG_HOME", home.filePath("config"));
        environment.insert("XDG_RUNTIME_DIR", home.path());
    }
    PelmoRun pelmo(const QStringList& arguments) { return runPelmo(arguments, environment); }
    QStringList send(int port, const QString& more) {
        return QProcess::splitCommand(
            QStringLiteral("send --set serverAddress=localhost --set serverPort=%1 --set "
                           "senderEmail=club@example.org --set senderName=Club --set "
                           "selectedContentType=1 --set smtpTimeout=10 --subject News %2")
                .arg(port)
                .arg(more));
    }
    QString folder() const { return home.filePath("data/Orvale Software/Pelmo"); }

    QTemporaryDir home;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
};

QStringList recipientsOf(ServerProcess& server) {
    QStringList all;
    for (const QByteArray& record : server.records())
        for (const QJsonValue& to : QJsonDocument::fromJson(record)["rcpt_tos"].toArray())
            all << to.toString();
    return all;
}

int ledgerCopies(const QString& folder) {
    int copies = 0;
    for (const QString& name : QDir(folder).entryList({"Sent-*.ledger"}, QDir::Files)) {
        QFile file(QDir(folder).filePath(name));
        if (file.open(QIODevice::ReadOnly))
            copies += static_cast<int>(file.readAll().count("\nsent\t"));
    }
    return copies;
}

// Killed while the second copy waits for the server's answer to DATA (none of its text has
// gone), the run resumes with the members not yet mailed: each gets exactly one copy.
TEST(InterruptedRun, KilledThenResumedMailsEveryMemberOnce) {
    Home home;
    ASSERT_EQ(
        home.pelmo({"contacts", "import", PELMO_TEST_DATA "/../../samples/friends.vcf"}).status, 0);
    ServerProcess server(PELMO_TEST_DATA "/../smtp/smtp_server.py", {"--data-delay", "1"});
    ASSERT_NE(server.port(), 0);
    QProcess killed;
    killed.setProcessEnvironment(home.environment);
    killed.start(PELMO_EXECUTABLE, home.send(server.port(), "--group Friends"));
    killed.closeWriteChannel();
    QElapsedTimer waited;
    waited.start();
    while (ledgerCopies(home.folder()) < 1 && waited.elapsed() < 20000)
        QThread::msleep(20);
    ASSERT_EQ(::kill(static_cast<pid_t>(killed.processId()), SIGKILL), 0);
    killed.waitForFinished();
    ASSERT_EQ(recipientsOf(server), QStringList{"ada@example.org"});

    const PelmoRun resumed = home.pelmo(home.send(server.port(), "--group Friends --resume"));
    EXPECT_EQ(resumed.status, 0) << resumed.out.toStdString() << resumed.err.toStdString();
    EXPECT_TRUE(resumed.out.contains("Restored 1 recipient mailed before Pelmo stopped "
                                     "unexpectedly; it is not mailed again.\n"
                                     "Filtering people by sent recipients...\n"
                                     "Skipping ada@example.org\n"))
        << resumed.out.toStdString();
    EXPECT_EQ(recipientsOf(server),
              QStringList({"ada@example.org", "charles@example.org", "alan@example.org"}));
    EXPECT_EQ(QDir(home.folder()).entryList({"Sent-*"}, QDir::Files), QStringList())
        << "a clean quit leaves no ledger";
    const PelmoRun again = home.pelmo(home.send(server.port(), "--group Friends --resume"));
    EXPECT_EQ(again.err, "pelmo send: no run was left unfinished; mailing everyone\n");
}

// The refused member goes into a group of their own, and a send to that group mails only them.
TEST(InterruptedRun, RefusedMembersAreGroupedForTheRetry) {
    Home home;
    ASSERT_EQ(
        home.pelmo({"contacts", "import", PELMO_TEST_DATA "/../../samples/friends.vcf"}).status, 0);
    QString group;
    {
        ServerProcess refusing(PELMO_TEST_DATA "/../smtp/smtp_server.py",
                               {"--refuse-recipient", "charles@example.org"});
        const PelmoRun run = home.pelmo(
            home.send(refusing.port(), "--group Friends --set continueAfterRefusal=true"));
        EXPECT_EQ(run.status, 1);
        EXPECT_EQ(recipientsOf(refusing), QStringList({"ada@example.org", "alan@example.org"}));
        for (const QString& line : home.pelmo({"contacts", "groups"}).out.split('\n'))
            if (line.startsWith("Not delivered "))
                group = line.section('\t', 0, 0);
    }
    ASSERT_FALSE(group.isEmpty());
    EXPECT_EQ(home.pelmo({"contacts", "list", "--group", group}).out,
              "Charles Babbage <charles@example.org>\n");
    ServerProcess server(PELMO_TEST_DATA "/../smtp/smtp_server.py", {});
    const PelmoRun retry = home.pelmo(home.send(server.port(), "--group \"" + group + '"'));
    EXPECT_EQ(retry.status, 0) << retry.out.toStdString();
    EXPECT_EQ(recipientsOf(server), QStringList{"charles@example.org"});
}

} // namespace
