#include "GuiFixture.h"
#include "controller/RecipientSelection.h"
#include "controller/ScriptedSession.h"
#include "controller/SentRecipients.h"
#include "e2e/E2eSupport.h"
#include "gui/RecipientsWindow.h"

#include <QAction>
#include <QLabel>
#include <QLineEdit>
#include <QMessageBox>
#include <QProgressBar>
#include <QPushButton>
#include <QTableView>
#include <QTextCursor>
#include <QTextDocument>
#include <QTextEdit>

namespace {

// A mailing run from the window: real widgets pressed like a user presses them, the server's
// part played by scripted sessions.
class WindowRun : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        set("senderEmail", QStringLiteral("me@example.org"));
        set("senderName", QStringLiteral("Me"));
        set("serverAddress", QStringLiteral("mail.example.org"));
        set("serverPort", 25);
        set("selectedContentType", 1);
        controller().message()->setPlainText(QStringLiteral("Hello {toName}"));
        controller().setSessionFactory([this](const QString&, int) -> SmtpSession* {
            return new ScriptedSession(script, calls);
        });
        QObject::connect(&controller(), &PelmoController::runSettled, [this] { idle = true; });
        sendButton = child<QPushButton>("sendButton");
        spinner = child<QProgressBar>("spinner");
    }

    void press(QPushButton* button) { QTest::mouseClick(button, Qt::LeftButton); }

    void pressSendAndWait() {
        idle = false;
        press(sendButton);
        ASSERT_TRUE(waitUntil([this] { return idle; })) << "the run never became idle";
        QCoreApplication::processEvents();
    }

    // The table as shown: the row's number, then the address.
    QStringList table() const {
        const QAbstractItemModel* model = window->recipientsWindow().table().model();
        QStringList rows;
        for (int row = 0; row < model->rowCount(); ++row)
            rows << model->headerData(row, Qt::Vertical).toString() + QLatin1Char(' ') +
                        model->index(row, 0).data().toString();
        return rows;
    }

    ScriptedSession::Script script;
    QStringList calls;
    bool idle = false;
    QPushButton* sendButton = nullptr;
    QProgressBar* spinner = nullptr;
};

TEST_F(WindowRun, SendMailsTheTypedRecipientAndFillsTheTable) {
    QTest::keyClicks(child<QLineEdit>("to"), QStringLiteral("ann@example.org"));
    QTest::keyClicks(child<QLineEdit>("name"), QStringLiteral("Ann"));
    idle = false;
    press(sendButton);
    // One message, not a list: the bar is busy while the delivery runs.
    EXPECT_EQ(sendButton->text(), QStringLiteral("Stop"));
    EXPECT_EQ(spinner->minimum(), 0);
    EXPECT_EQ(spinner->maximum(), 0);
    ASSERT_TRUE(waitUntil([this] { return idle; }));

    EXPECT_EQ(table(), QStringList{QStringLiteral("1 ann@example.org")});
    EXPECT_TRUE(window->recipientsWindow().isVisible());
    EXPECT_EQ(sendButton->text(), QStringLiteral("Send"));
    EXPECT_NE(spinner->maximum(), 0) << "still spinning after the run";
    EXPECT_TRUE(
        child<QLabel>("status")->text().startsWith(QStringLiteral("[Mailing completed at ")));
    EXPECT_EQ(calls.filter(QStringLiteral("smtp: message")),
              QStringList{QStringLiteral("smtp: message from me@example.org to ann@example.org")});
}

TEST_F(WindowRun, SendThroughARealServerFillsTheTable) {
    ServerProcess server(QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py"), {});
    ASSERT_NE(server.port(), 0);
    controller().setSessionFactory({}); // the real SMTP client
    set("serverAddress", QStringLiteral("127.0.0.1"));
    set("serverPort", server.port());
    QTest::keyClicks(child<QLineEdit>("to"), QStringLiteral("ann@example.org"));
    QTest::keyClicks(child<QLineEdit>("name"), QStringLiteral("Ann"));
    pressSendAndWait();
    EXPECT_EQ(table(), QStringList{QStringLiteral("1 ann@example.org")});
    const QList<QByteArray> records = server.records();
    ASSERT_EQ(records.size(), 1);
    const ReceivedMessage message = parseMessage(messageOf(records[0]));
    EXPECT_EQ(message.to, QStringLiteral("Ann <ann@example.org>"));
    ASSERT_EQ(message.parts.size(), 1);
    EXPECT_EQ(message.parts[0].content, QByteArray("Hello Ann"));
}

TEST_F(WindowRun, AGroupCountsOnTheBarAndStopLetsTheCurrentCopyFinish) {
    for (const char* first : {"Ann", "Bob", "Cy"})
        addPerson(first, "Test", {QString::fromLatin1(first).toLower() + "@example.org"},
                  {QStringLiteral("Club")});
    picker().reload();
    ASSERT_TRUE(activate(&picker()));
    clickRow(child<QListWidget>("groups", &picker()), QStringLiteral("Club"));
    ASSERT_EQ(controller().getPeople()->size(), 3);

    idle = false;
    press(sendButton);
    EXPECT_EQ(spinner->maximum(), 3);
    EXPECT_EQ(spinner->value(), 1);
    ASSERT_EQ(sendButton->text(), QStringLiteral("Stop"));
    press(sendButton); // Stop while Ann's copy is on its way
    EXPECT_EQ(sendButton->text(), QStringLiteral("Send"));
    ASSERT_TRUE(waitUntil([this] { return idle; }));
    QCoreApplication::processEvents();
    EXPECT_EQ(table(), QStringList{QStringLiteral("1 ann@example.org")});
    EXPECT_EQ(controller().getPeople()->size(), 2);

    // The next Send goes on with those not yet mailed.
    pressSendAndWait();
    EXPECT_EQ(table(),
              (QStringList{QStringLiteral("1 ann@example.org"), QStringLiteral("2 bob@example.org"),
                           QStringLiteral("3 cy@example.org")}));
    EXPECT_FALSE(controller().getPeople().has_value());
    EXPECT_EQ(sendButton->text(), QStringLiteral("Send"));
}

TEST_F(WindowRun, ResetEmptiesTheRecipientsTable) {
    QTest::keyClicks(child<QLineEdit>("to"), QStringLiteral("ann@example.org"));
    QTest::keyClicks(child<QLineEdit>("name"), QStringLiteral("Ann"));
    pressSendAndWait();
    ASSERT_EQ(table().size(), 1);
    press(child<QPushButton>("resetButton", &window->recipientsWindow()));
    EXPECT_TRUE(table().isEmpty());
    EXPECT_FALSE(controller().recipientsContains(QStringLiteral("ann@example.org")));
}

TEST_F(WindowRun, ASettingFailureShowsOnTheStatusLineAndFreesTheButton) {
    settings().remove(QStringLiteral("serverAddress"));
    settings().sync();
    QTest::keyClicks(child<QLineEdit>("to"), QStringLiteral("ann@example.org"));
    QTest::keyClicks(child<QLineEdit>("name"), QStringLiteral("Ann"));
    pressSendAndWait();
    EXPECT_TRUE(child<QLabel>("status")->text().startsWith(QStringLiteral("Error (NoServer): ")))
        << child<QLabel>("status")->text().toStdString();
    EXPECT_EQ(sendButton->text(), QStringLiteral("Send"));
    EXPECT_TRUE(table().isEmpty());
}

using Window = GuiFixture;

TEST_F(Window, StartsReadyWithTheDefaultRecipient) {
    set("defaultRecipientEmail", QStringLiteral("team@example.org"));
    set("defaultRecipientName", QStringLiteral("Team"));
    controller().startUp();
    EXPECT_EQ(child<QLineEdit>("to")->text(), QStringLiteral("team@example.org"));
    EXPECT_EQ(child<QLineEdit>("name")->text(), QStringLiteral("Team"));
    EXPECT_EQ(child<QLabel>("status")->text(), QStringLiteral("Ready."));
    EXPECT_EQ(child<QPushButton>("sendButton")->text(), QStringLiteral("Send"));
}

TEST_F(Window, TheEditorSharesTheControllersDocument) {
    auto* editor = child<QTextEdit>("message");
    EXPECT_EQ(editor->document(), controller().message());
    QTest::keyClicks(editor, QStringLiteral("Dear {toName}"));
    EXPECT_EQ(controller().message()->toPlainText(), QStringLiteral("Dear {toName}"));
}

QAction* formattingAction(QWidget* toolBar, const QString& text) {
    for (QAction* action : toolBar->actions())
        if (action->text() == text)
            return action;
    return nullptr;
}

QFont::Weight weightAt(QTextDocument* document, int position) {
    QTextCursor cursor(document);
    cursor.setPosition(position);
    return static_cast<QFont::Weight>(cursor.charFormat().fontWeight());
}

TEST_F(Window, BoldFromTheToolBarReachesTheSelection) {
    auto* editor = child<QTextEdit>("message");
    QTest::keyClicks(editor, QStringLiteral("Hello"));
    editor->selectAll();
    QAction* bold = formattingAction(child<QWidget>("formatting"), QStringLiteral("Bold"));
    ASSERT_NE(bold, nullptr);
    bold->trigger();
    EXPECT_EQ(weightAt(controller().message(), 2), QFont::Bold);
    EXPECT_TRUE(bold->isChecked());
}

TEST_F(Window, BoldSwitchedOnAndOffWhileTypingFormatsOnlyWhatWasTypedBetween) {
    auto* editor = child<QTextEdit>("message");
    QAction* bold = formattingAction(child<QWidget>("formatting"), QStringLiteral("Bold"));
    ASSERT_NE(bold, nullptr);
    QTest::keyClicks(editor, QStringLiteral("on "));
    bold->trigger();
    QTest::keyClicks(editor, QStringLiteral("Saturday"));
    bold->trigger();
    QTest::keyClicks(editor, QStringLiteral(" at"));
    QTextDocument* message = controller().message();
    EXPECT_EQ(message->toPlainText(), QStringLiteral("on Saturday at"));
    EXPECT_EQ(weightAt(message, 2), QFont::Normal);  // "on"
    EXPECT_EQ(weightAt(message, 11), QFont::Bold);   // the "y" of "Saturday"
    EXPECT_EQ(weightAt(message, 14), QFont::Normal); // "at"
}

TEST_F(Window, OnlyTheUsersEditsOfToAndNameDropAGroupSelection) {
    addPerson("Ann", "Test", {"ann@example.org"}, {QStringLiteral("Club")});
    controller().selection().setPeople(
        book->members(book->groupNamed(QStringLiteral("Club"))->id).value());
    window->setTo(QStringLiteral("set by the controller"));
    window->setName(QStringLiteral("set by the controller"));
    QTest::keyClicks(child<QLineEdit>("subject"), QStringLiteral("News"));
    QTest::keyClicks(child<QLineEdit>("webPageOrFile"), QStringLiteral("https://example.org/"));
    EXPECT_TRUE(controller().getPeople().has_value());
    QTest::keyClicks(child<QLineEdit>("name"), QStringLiteral("x"));
    EXPECT_FALSE(controller().getPeople().has_value());

    controller().selection().setPeople(
        book->members(book->groupNamed(QStringLiteral("Club"))->id).value());
    QTest::keyClicks(child<QLineEdit>("to"), QStringLiteral("x"));
    EXPECT_FALSE(controller().getPeople().has_value());
}

TEST_F(Window, TheFieldsAreTheViewsFields) {
    window->setSubject(QStringLiteral("S"));
    window->setWebPageOrFile(QStringLiteral("https://example.org/page"));
    EXPECT_EQ(child<QLineEdit>("subject")->text(), QStringLiteral("S"));
    EXPECT_EQ(window->webPageOrFile(), QStringLiteral("https://example.org/page"));
    window->setStatus(QStringLiteral("Downloading"));
    EXPECT_EQ(child<QLabel>("status")->text(), QStringLiteral("Downloading"));
}

TEST_F(Window, TheProgressBarCountsOrIsBusy) {
    auto* spinner = child<QProgressBar>("spinner");
    window->setProgressCounting(0, 4, 0);
    window->setProgressValue(2);
    EXPECT_EQ(spinner->maximum(), 4);
    EXPECT_EQ(spinner->value(), 2);
    EXPECT_EQ(window->progressMaximum(), 4.0);
    window->setProgressBusy();
    window->startProgressAnimation();
    EXPECT_EQ(spinner->maximum(), 0); // Qt's busy indicator
    window->stopProgressAnimation();
    EXPECT_NE(spinner->maximum(), 0);
}

TEST_F(Window, AnAlertIsAWindowModalBoxOnTheMainWindow) {
    controller().doAlert(QStringLiteral("The front browser web page could not be retreived"),
                         QStringLiteral("Please make sure your browser is running."));
    QMessageBox* box = nullptr;
    ASSERT_TRUE(waitUntil([&] {
        box = window->findChild<QMessageBox*>();
        return box && box->isVisible();
    }));
    EXPECT_EQ(box->parentWidget(), window.get());
    EXPECT_EQ(box->windowModality(), Qt::WindowModal);
    EXPECT_EQ(box->text(), QStringLiteral("The front browser web page could not be retreived"));
    EXPECT_EQ(box->informativeText(), QStringLiteral("Please make sure your browser is running."));
    EXPECT_EQ(box->standardButtons(), QMessageBox::Ok);
    box->accept();
}

TEST_F(Window, TheAddressesButtonBringsThePickerToTheFront) {
    child<QAction>("addressesAction")->trigger();
    EXPECT_TRUE(picker().isVisible());
    EXPECT_TRUE(waitUntil([this] { return picker().isActiveWindow(); }));
}

} // namespace
