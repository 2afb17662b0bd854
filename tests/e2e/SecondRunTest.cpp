#include "E2eSupport.h"

#include "controller/ControllerFixture.h"

#include "addressbook/ContactsFile.h"
#include "controller/SentRecipients.h"

#include <QTextDocument>

namespace {

// The whole controller with its real SMTP client against aiosmtpd: a group mailed once is
// skipped by a second run in the same process, and the server hears nothing more.
TEST_F(ControllerFixture, SecondRunSkipsEveryoneAlreadyMailed) {
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
    runUntilSettled(30000);
    EXPECT_EQ(server.records().size(), 3);
    EXPECT_EQ(controller->sentRecipients().rowCount(), 3);

    view.statuses.clear();
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(view.statuses.filter(QStringLiteral("Skipping")).size(), 3);
    runUntilSettled(30000);
    EXPECT_EQ(server.records().size(), 3);
    EXPECT_TRUE(view.statuses.last().startsWith(QLatin1String("[Mailing completed at ")));
}

} // namespace
