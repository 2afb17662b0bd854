#include "E2eSupport.h"

#include "controller/ControllerFixture.h"

#include "addressbook/ContactsFile.h"

#include <QEventLoop>
#include <QTextDocument>
#include <QTimer>

namespace {

// The whole controller with its real SMTP client against aiosmtpd: a group mailed once is
// skipped by a second run in the same process, and the server hears nothing more.
class SecondRun : public ControllerFixture {
protected:
    void runUntilIdle() {
        bool idle = false;
        const auto connection =
            QObject::connect(controller.get(), &PelmoController::runIdle, [&idle] { idle = true; });
        controller->send();
        QEventLoop loop;
        QTimer deadline;
        deadline.start(30000);
        while (!idle && deadline.isActive())
            loop.processEvents(QEventLoop::WaitForMoreEvents, 50);
        QObject::disconnect(connection);
        ASSERT_TRUE(idle);
    }
};

TEST_F(SecondRun, SkipsEveryoneAlreadyMailed) {
    ServerProcess server(QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py"), {});
    ASSERT_NE(server.port(), 0);
    set("serverAddress", QStringLiteral("127.0.0.1"));
    set("serverPort", server.port());
    set("senderEmail", QStringLiteral("club@example.org"));
    set("senderName", QStringLiteral("The Club"));
    set("selectedContentType", 1);
    controller->message()->setPlainText(QStringLiteral("Hello {toName}"));
    book->add(ContactsFile::read(QStringLiteral(PELMO_SOURCE_DIR "/samples/friends.vcf")));
    const qint64 friends = book->groupNamed(QStringLiteral("Friends"))->id;

    controller->abGroupSelected({friends}, true);
    runUntilIdle();
    EXPECT_EQ(server.records().size(), 3);
    EXPECT_EQ(controller->numberOfRows(), 3);

    view.statuses.clear();
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(view.statuses.filter(QStringLiteral("Skipping")).size(), 3);
    runUntilIdle();
    EXPECT_EQ(server.records().size(), 3);
    EXPECT_TRUE(view.statuses.last().startsWith(QLatin1String("[Mailing completed at ")));
}

} // namespace
