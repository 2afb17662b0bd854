#include "ControllerFixture.h"
#include "ScriptedSession.h"

#include "addressbook/ImportedContact.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QTextDocument>
#include <QTimer>

namespace {

// A run over scripted sessions: every session a delivery opens is recorded, and the test waits
// until the controller reports that nothing is in progress any more.
class MailingRun : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        set("senderEmail", QStringLiteral("me@example.org"));
        set("senderName", QStringLiteral("Me"));
        set("serverAddress", QStringLiteral("mail.example.org"));
        set("serverPort", 25);
        set("loginUsername", QStringLiteral("me"));
        set("loginPassword", QStringLiteral("secret"));
        set("selectedContentType", 1);
        controller->message()->setPlainText(QStringLiteral("Hello {toName}"));
        controller->setSessionFactory([this](const QString& host, int port) -> SmtpSession* {
            calls << QStringLiteral("open %1:%2").arg(host).arg(port);
            return new ScriptedSession(script, calls);
        });
        QObject::connect(controller.get(), &PelmoController::runIdle, [this] { idle = true; });
    }

    void runUntilIdle() {
        idle = false;
        controller->send();
        QEventLoop loop;
        QTimer deadline;
        QObject::connect(&deadline, &QTimer::timeout, &loop, &QEventLoop::quit);
        deadline.start(5000);
        while (!idle && deadline.isActive())
            loop.processEvents(QEventLoop::WaitForMoreEvents, 50);
        // Let deleteLater and queued signals settle before the test looks.
        QCoreApplication::processEvents();
        ASSERT_TRUE(idle) << "the run never became idle";
    }

    void selectGroupOf(const QList<QPair<QString, QString>>& people) {
        QList<ImportedContact> contacts;
        for (const auto& [name, address] : people) {
            ImportedContact contact;
            contact.person.firstName = name;
            contact.person.lastName = QStringLiteral("Test");
            if (!address.isEmpty())
                contact.person.emails << address;
            contact.person.primary = address.isEmpty() ? -1 : 0;
            contact.groups << QStringLiteral("Club");
            contacts << contact;
        }
        book->add(contacts);
        controller->abGroupSelected({book->groupNamed(QStringLiteral("Club"))->id}, true);
    }

    QStringList linesAfter(const QString& first) const {
        const qsizetype at = view.statuses.indexOf(first);
        return at < 0 ? QStringList() : view.statuses.mid(at);
    }

    static QString dateless(QString line) {
        // "[Mailing started at <date>]" and "[<date>] Mail to: ..." without their dates.
        if (line.startsWith(QLatin1String("[Mailing")))
            return line.left(line.indexOf(QLatin1String(" at ")) + 4) + QLatin1String("...]");
        if (line.startsWith(QLatin1Char('[')))
            return QLatin1String("[...]") + line.mid(line.indexOf(QLatin1Char(']')) + 1);
        return line;
    }

    QStringList datelessStatuses() const {
        QStringList out;
        for (const QString& line : view.statuses)
            out << dateless(line);
        return out;
    }

    ScriptedSession::Script script;
    QStringList calls;
    bool idle = false;
};

TEST_F(MailingRun, OneMessageToTheToFieldSpinsAndCompletes) {
    view.toText = QStringLiteral("ann@example.org");
    view.nameText = QStringLiteral("Ann");
    runUntilIdle();
    EXPECT_EQ(
        datelessStatuses().mid(datelessStatuses().indexOf(QStringLiteral("Sending mail."))),
        (QStringList{QStringLiteral("Sending mail."), QStringLiteral("[Mailing started at ...]"),
                     QStringLiteral("[...] Mail to: Ann <ann@example.org>"),
                     QStringLiteral("Connecting to the mail.example.org server."),
                     QStringLiteral("Connected to the mail.example.org server."),
                     QStringLiteral("Sending the message."),
                     QStringLiteral("Message sent. Closing the connection."),
                     QStringLiteral("Connection closed. Done."),
                     QStringLiteral("[Mailing completed at ...]")}));
    EXPECT_TRUE(view.busy);
    EXPECT_FALSE(view.animating);
    EXPECT_EQ(view.buttonTitle, QStringLiteral("Send"));
    EXPECT_TRUE(controller->recipientsContains(QStringLiteral("ANN@example.org")));
    EXPECT_EQ(calls,
              (QStringList{QStringLiteral("open mail.example.org:25"),
                           QStringLiteral("message to ann@example.org"), QStringLiteral("connect"),
                           QStringLiteral("send"), QStringLiteral("close")}));
    EXPECT_FALSE(controller->getPeople().has_value());
}

TEST_F(MailingRun, AGroupOfThreeCountsOneTwoThreeAndIsNotMailedTwice) {
    selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                   {QStringLiteral("Bob"), QStringLiteral("bob@example.org")},
                   {QStringLiteral("Cy"), QStringLiteral("cy@example.org")}});
    runUntilIdle();
    EXPECT_EQ(view.maximum, 3.0);
    EXPECT_EQ(view.values, (QList<double>{1.0, 2.0, 3.0}));
    EXPECT_EQ(controller->numberOfRows(), 3);
    EXPECT_EQ(view.statuses.last().left(21), QStringLiteral("[Mailing completed at"));
    EXPECT_EQ(calls.filter(QStringLiteral("message to")).size(), 3);

    // The same group again: everyone is skipped and the run ends without a connection.
    calls.clear();
    view.statuses.clear();
    controller->abGroupSelected({book->groupNamed(QStringLiteral("Club"))->id}, true);
    EXPECT_EQ(view.statuses.filter(QStringLiteral("Skipping")),
              (QStringList{QStringLiteral("Skipping ann@example.org"),
                           QStringLiteral("Skipping bob@example.org"),
                           QStringLiteral("Skipping cy@example.org")}));
    runUntilIdle();
    EXPECT_TRUE(calls.isEmpty());
    EXPECT_EQ(view.statuses.last().left(21), QStringLiteral("[Mailing completed at"));
}

TEST_F(MailingRun, APersonWithoutAnAddressHaltsTheRunWithStopShowing) {
    selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                   {QStringLiteral("Nobody"), QString()},
                   {QStringLiteral("Cy"), QStringLiteral("cy@example.org")}});
    runUntilIdle();
    EXPECT_EQ(view.buttonTitle, QStringLiteral("Stop"));
    EXPECT_EQ(calls.filter(QStringLiteral("message to")),
              QStringList{QStringLiteral("message to ann@example.org")});
    ASSERT_TRUE(controller->getPeople().has_value());
    EXPECT_EQ(controller->getPeople()->size(), 1); // Cy is still to be mailed
    EXPECT_EQ(view.nameText, QStringLiteral("Nobody Test"));
}

TEST_F(MailingRun, StopLetsTheCurrentCopyFinishAndSendResumes) {
    selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                   {QStringLiteral("Bob"), QStringLiteral("bob@example.org")}});
    // Press Stop as soon as the first copy is handed to its session.
    QObject::connect(controller.get(), &PelmoController::recipientsChanged, [this] {
        if (controller->numberOfRows() == 1)
            controller->send();
    });
    runUntilIdle();
    EXPECT_EQ(controller->numberOfRows(), 1);
    EXPECT_EQ(view.buttonTitle, QStringLiteral("Send"));
    ASSERT_TRUE(controller->getPeople().has_value());
    EXPECT_EQ(controller->getPeople()->size(), 1);

    runUntilIdle(); // Send again, no new selection: Bob is next
    EXPECT_EQ(controller->numberOfRows(), 2);
    EXPECT_EQ(controller->valueFor(QStringLiteral("email"), 1).toString(),
              QStringLiteral("bob@example.org"));
}

TEST_F(MailingRun, LoginMechanismsAndTls) {
    struct Row {
        const char* name;
        int mechanism;
        bool ssl;
        bool implicitTls;
        QStringList expectedCalls;
        const char* expectedLine;
    };
    const Row rows[] = {
        {"no login", 0, false, false, {"connect", "send", "close"}, "Sending the message."},
        {"plain",
         1,
         false,
         false,
         {"connect", "auth PLAIN me", "send", "close"},
         "Authentication completed. Sending the message."},
        {"cram-md5",
         3,
         false,
         false,
         {"connect", "auth CRAM-MD5 me", "send", "close"},
         "Available authentication mechanisms: (PLAIN, LOGIN)"},
        {"starttls once",
         2,
         true,
         false,
         {"connect", "startTLS", "auth LOGIN me", "send", "close"},
         "SSL handshaking..."},
        {"implicit tls", 0, true, true, {"connect", "startSSL", "send", "close"}, "Starting SSL."},
    };
    for (const Row& row : rows) {
        calls.clear();
        view.statuses.clear();
        script.implicitTls = row.implicitTls;
        set("selectedAuthentication", row.mechanism);
        set("useSSL", row.ssl);
        view.toText = QStringLiteral("ann@example.org");
        view.nameText = QStringLiteral("Ann");
        runUntilIdle();
        EXPECT_EQ(calls.mid(2), row.expectedCalls) << row.name;
        EXPECT_TRUE(view.statuses.contains(QLatin1String(row.expectedLine))) << row.name;
        EXPECT_EQ(view.statuses.count(QStringLiteral("SSL handshaking...")),
                  row.ssl && !row.implicitTls ? 1 : 0)
            << row.name;
    }
}

TEST_F(MailingRun, AnUnknownMechanismShowsTheListAndStops) {
    set("selectedAuthentication", 4);
    view.toText = QStringLiteral("ann@example.org");
    view.nameText = QStringLiteral("Ann");
    runUntilIdle();
    EXPECT_EQ(view.statuses.last(),
              QStringLiteral("Available authentication mechanisms: (PLAIN, LOGIN)"));
    EXPECT_FALSE(calls.contains(QStringLiteral("send")));
    EXPECT_FALSE(calls.contains(QStringLiteral("close"))); // the connection is left open
}

TEST_F(MailingRun, ARefusedLoginMovesOnAndSkipsTheCompletionAction) {
    set("selectedAuthentication", 2);
    set("completionAction", 2);
    script.acceptLogin = false;
    selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                   {QStringLiteral("Bob"), QStringLiteral("bob@example.org")}});
    view.subjectText = QStringLiteral("Kept");
    runUntilIdle();
    EXPECT_EQ(view.statuses.count(QStringLiteral("Authentication failed. Closing the connection.")),
              2);
    EXPECT_EQ(controller->numberOfRows(), 0);
    EXPECT_EQ(view.statuses.last().left(21), QStringLiteral("[Mailing completed at"));
    EXPECT_EQ(view.subjectText, QStringLiteral("Kept")); // no reset after a failed last copy
}

TEST_F(MailingRun, ASuccessfulLastCopyResetsTheFormWhenAsked) {
    set("completionAction", 2);
    view.toText = QStringLiteral("ann@example.org");
    view.nameText = QStringLiteral("Ann");
    view.subjectText = QStringLiteral("Gone after the run");
    runUntilIdle();
    EXPECT_EQ(view.subjectText, QString());
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Ready."));
    EXPECT_TRUE(controller->message()->isEmpty());
}

TEST_F(MailingRun, ARefusedMessageBeepsShowsTheReplyAndStopsTheRun) {
    struct Row {
        const char* name;
        QByteArray reply;
        bool lineShown;
    };
    const Row rows[] = {{"utf-8 reply", "550 5.1.1 <ann@example.org>: unknown user\r\n", true},
                        {"reply not utf-8", "550 \xff\xfe\r\n", false}};
    for (const Row& row : rows) {
        controller->resetRecipients();
        view.statuses.clear();
        view.events.clear();
        script.refusal = row.reply;
        selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                       {QStringLiteral("Bob"), QStringLiteral("bob@example.org")}});
        runUntilIdle();
        EXPECT_TRUE(view.events.contains(QStringLiteral("beep"))) << row.name;
        EXPECT_EQ(view.statuses.contains(QStringLiteral(
                      "Message not sent: 550 5.1.1 <ann@example.org>: unknown user")),
                  row.lineShown)
            << row.name;
        EXPECT_EQ(view.buttonTitle, QStringLiteral("Send")) << row.name;
        ASSERT_TRUE(controller->getPeople().has_value()) << row.name;
        EXPECT_GE(controller->getPeople()->size(), 1) << row.name; // Bob waits for the next Send
        EXPECT_EQ(controller->numberOfRows(), 0) << row.name;
    }
}

TEST_F(MailingRun, ATimeOutHaltsAndALostConnectionMovesOn) {
    script.timeOutOnConnect = true;
    selectGroupOf({{QStringLiteral("Ann"), QStringLiteral("ann@example.org")},
                   {QStringLiteral("Bob"), QStringLiteral("bob@example.org")}});
    runUntilIdle();
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Connection lost."));
    EXPECT_EQ(calls.filter(QStringLiteral("open")).size(), 1); // Bob is not started
    EXPECT_EQ(view.buttonTitle, QStringLiteral("Stop"));

    calls.clear();
    view.statuses.clear();
    script = {};
    script.loseConnectionOnSend = true;
    controller->abGroupSelected({book->groupNamed(QStringLiteral("Club"))->id}, true);
    view.buttonTitle = QStringLiteral("Send");
    runUntilIdle();
    EXPECT_EQ(calls.filter(QStringLiteral("open")).size(), 2); // the lost connection hands over
    EXPECT_EQ(view.statuses.count(QStringLiteral("The remote host closed the connection")), 2);
    EXPECT_EQ(controller->numberOfRows(), 0);
}

TEST_F(MailingRun, ASettingThatFailsHaltsWithItsNameAndReason) {
    struct Row {
        const char* name;
        const char* key;
        int mechanism;
        const char* line;
    };
    const Row rows[] = {
        {"no server", "serverAddress", 0,
         "Error (NoServer): The outgoing SMTP server 'Address:' preference value has not been "
         "specified."},
        {"no user name, while logging in", "loginUsername", 1,
         "Error (NoUsername): The outgoing SMTP server 'Username:' preference value has not been "
         "specified."},
    };
    for (const Row& row : rows) {
        view.statuses.clear();
        settings().remove(QLatin1String(row.key));
        settings().sync();
        set("selectedAuthentication", row.mechanism);
        view.toText = QStringLiteral("ann@example.org");
        view.nameText = QStringLiteral("Ann");
        runUntilIdle();
        EXPECT_EQ(view.statuses.last(), QLatin1String(row.line)) << row.name;
        EXPECT_EQ(view.buttonTitle, QStringLiteral("Send")) << row.name;
        EXPECT_FALSE(view.animating) << row.name;
        set(row.key, QStringLiteral("restored"));
    }
}

} // namespace
