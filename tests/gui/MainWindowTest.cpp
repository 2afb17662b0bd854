#include "GuiFixture.h"
#include "QtTestMain.h"
#include "e2e/E2eSupport.h"
#include "gui/LogWindow.h"
#include "gui/PreferencesDialog.h"
#include "gui/PreviewDialog.h"
#include "gui/RecipientsWindow.h"
#include "gui/SoftwareUpdateWindow.h"
#include "update/SoftwareUpdateController.h"

#include <QComboBox>
#include <QLabel>
#include <QMetaProperty>
#include <QPlainTextEdit>
#include <QProgressBar>
#include <QTableView>
#include <QTcpServer>
#include <QTextBrowser>
#include <QTextEdit>

namespace {

// A mailing run from the window to aiosmtpd, Ann typed as the recipient: the widgets pressed
// as a user presses them.
class WindowRun : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        set("senderName", "Me");
        set("senderEmail", "me@example.org");
        set("serverPort", server.port());
        set("selectedContentType", 1);
        pelmo->message()->setPlainText("Hello {toName}");
        QObject::connect(pelmo.get(), &PelmoController::runSettled, [this] { idle = true; });
        QTest::keyClicks(child<QLineEdit>("to"), "ann@example.org");
        QTest::keyClicks(child<QLineEdit>("name"), "Ann");
    }
    void press(bool settle = true) {
        idle = false;
        QTest::mouseClick(child<QPushButton>("sendButton"), Qt::LeftButton);
        ASSERT_TRUE(!settle || waitUntil([this] { return idle; })) << "the run never settled";
        QCoreApplication::processEvents();
    }
    // The send button, the bar as "value of maximum" (-1 when hidden), the recipients table.
    QString shown() const {
        const auto* bar = child<QProgressBar>("spinner");
        QString text =
            child<QPushButton>("sendButton")->text() +
            QString(" %1 of %2 /").arg(bar->isHidden() ? -1 : bar->value()).arg(bar->maximum());
        const QAbstractItemModel* model = window->recipientsWindow().table().model();
        for (int row = 0; row < model->rowCount(); ++row)
            text += ' ' + model->headerData(row, Qt::Vertical).toString() + ' ' +
                    model->index(row, 0).data().toString();
        return text;
    }
    QString status() const { return child<QLabel>("status")->text(); }
    // A port of 127.0.0.1 that nobody listens on, the same one each time.
    int closedPort() {
        if (!m_closedPort) {
            QTcpServer listener;
            listener.listen(QHostAddress::LocalHost);
            m_closedPort = listener.serverPort();
        }
        return m_closedPort;
    }
    int m_closedPort = 0;
    // Answers the question on the window (Cancel being its default) with the button named so.
    void answer(const QString& question, const QString& button) {
        auto* box = asked<QMessageBox>();
        ASSERT_NE(box, nullptr) << "no question";
        EXPECT_EQ(box->text(), question);
        EXPECT_EQ(box->defaultButton(), box->button(QMessageBox::Cancel));
        for (QAbstractButton* choice : box->buttons())
            if (choice->text() == button)
                return QTest::mouseClick(choice, Qt::LeftButton);
        ADD_FAILURE() << "no button " << button.toStdString();
    }
    // Each copy's acceptance takes a moment, so that the bar can be seen while one is on its
    // way, however fast the rest goes.
    ServerProcess server{PELMO_TEST_DIR "/smtp/smtp_server.py", {"--data-delay", "0.2"}};
    bool idle = false;
};

// Message ▸ Preview… renders the copy of the member chosen.
TEST_F(GuiFixture, PreviewShowsTheChosenMembersCopy) {
    for (auto [key, value] : QVariantMap{
             {"senderEmail", "me@example.org"},
             {"senderName", "Me"},
             {"serverAddress",
              "127.0.0.1"}}.asKeyValueRange())
        set(key.toLatin1().constData(), value);
    pelmo->message()->setPlainText("Hello {toName}");
    for (const char* first : {"Ann", "Bob"})
        addPerson(first, "Test", "Club");
    pelmo->abGroupSelected({book->groupNamed("Club")->id}, true);
    child<QAction>("previewAction")->trigger();
    auto* dialog = window->findChild<PreviewDialog*>();
    ASSERT_NE(dialog, nullptr);
    child<QComboBox>("previewMember", dialog)->setCurrentIndex(1);
    const auto* body = child<QTextBrowser>("previewBody", dialog);
    EXPECT_TRUE(waitUntil([body] { return body->toPlainText() == "Hello Bob Test"; }))
        << body->toPlainText().toStdString();
}

TEST_F(WindowRun, SendMailsTheTypedRecipientThenAGroup) {
    // An empty subject is asked about; a setting that fails stops the run before it starts.
    press(false);
    answer("Send without a subject?", "Send");
    ASSERT_TRUE(waitUntil([this] { return idle; }));
    EXPECT_TRUE(status().startsWith("Error (NoServer): ")) << status().toStdString();
    EXPECT_EQ(shown(), "Send -1 of 1 /");
    set("serverAddress", "127.0.0.1");
    QTest::keyClicks(child<QLineEdit>("subject"), "News");
    press(false);
    // One message, not a list: the bar is busy while it goes, and hidden after.
    EXPECT_EQ(shown(), "Stop 0 of 0 /");
    ASSERT_TRUE(waitUntil([this] { return idle; }));
    EXPECT_TRUE(status().startsWith("[Mailing completed at ")) << status().toStdString();
    const ReceivedMessage message = parseMessage(messageOf(server.records().value(0)));
    EXPECT_EQ(message.to + " / " + message.subject + " / " + message.parts.value(0).content,
              "Ann <ann@example.org> / News / Hello Ann");
    EXPECT_TRUE(window->recipientsWindow().isVisible());
    EXPECT_EQ(shown(), "Send -1 of 1 / 1 ann@example.org");
    // Ann again is asked about first; Cancel sends nothing.
    press(false);
    answer("ann@example.org was already mailed in this session. Send again?", "Cancel");
    EXPECT_EQ(server.records().size(), 1);
    QTest::mouseClick(child<QPushButton>("resetButton", &window->recipientsWindow()),
                      Qt::LeftButton);
    answer("Forget the 1 sent recipient? They may be mailed again.", "Forget");
    EXPECT_EQ(shown(), "Send -1 of 1 /");

    // A group counts on the bar, and Stop lets the copy on its way finish.
    for (const char* first : {"Ann", "Bob", "Cy"})
        addPerson(first, "Test", "Club");
    picker().reload();
    picker().show();
    clickRow(child<QListWidget>("groups", &picker()), "Club");
    press(false);
    // The check before a group's run comes first; the run starts once it found nothing.
    ASSERT_TRUE(waitUntil([this] { return shown() == "Stop 1 of 3 /"; })) << shown().toStdString();
    press(); // Stop while Ann's copy is on its way: the bar goes idle
    EXPECT_EQ(shown(), "Send -1 of 1 / 1 ann@example.org");
    press(); // goes on with those not yet mailed
    EXPECT_EQ(shown(), "Send -1 of 1 / 1 ann@example.org 2 bob@example.org 3 cy@example.org");

    // Nobody listens on the port: the run waits on Ann with Stop showing; after Stop she is
    // listed as not mailed with why, and Put Back mails her first at the next Send. Club, still
    // highlighted in the picker, is chosen by a click all the same.
    pelmo->resetRecipients();
    set("serverPort", closedPort());
    clickRow(child<QListWidget>("groups", &picker()), "Club");
    EXPECT_EQ(child<QLabel>("selectionSummary")->text(), "Group Club: 3 members, 0 already mailed");
    press();
    press();
    const QAbstractItemModel* notMailed = window->recipientsWindow().notMailedTable().model();
    EXPECT_EQ(notMailed->index(0, 1).data().toString() + " / " +
                  notMailed->index(0, 2).data().toString(),
              QString("ann@example.org / Could not connect to 127.0.0.1:%1: Connection refused")
                  .arg(closedPort()));
    EXPECT_EQ(shown(), "Send -1 of 1 /");
    set("serverPort", server.port());
    QTest::mouseClick(child<QPushButton>("putBackButton", &window->recipientsWindow()),
                      Qt::LeftButton);
    press();
    EXPECT_EQ(shown(), "Send -1 of 1 / 1 ann@example.org 2 bob@example.org 3 cy@example.org");
    EXPECT_EQ(notMailed->rowCount(), 0);

    // A group's name left in To is no address: an alert, and no connection.
    child<QLineEdit>("to")->setText("Club");
    press(false);
    ASSERT_NE(asked<QMessageBox>(), nullptr);
    EXPECT_EQ(asked<QMessageBox>()->text(), "The recipient address is not an e-mail address");
    asked<QMessageBox>()->accept();
    EXPECT_EQ(server.records().size(), 7);
}

// Quitting with unsent text asks first; a long status line ends in "…" with the whole of it in
// the tooltip; Console shows the log in Pelmo's own window, following lines written after.
TEST_F(WindowRun, QuitAsksForUnsentTextLongStatusElidedLogWindowFollows) {
    pelmo->applicationWillFinishLaunching();
    child<QAction>("consoleAction")->trigger();
    auto* log = child<QPlainTextEdit>("logText", window->findChild<LogWindow*>());
    EXPECT_TRUE(log->toPlainText().startsWith("[Logging starting at "))
        << log->toPlainText().toStdString();
    pelmo->statusMsg("Written after the window opened");
    EXPECT_TRUE(waitUntil(
        [log] { return log->toPlainText().contains("\nWritten after the window opened\n"); }));
    // A click on the status line selects its latest occurrence in the log.
    for (const char* line : {"Sending mail.", "Other", "Sending mail."})
        pelmo->statusMsg(line);
    QTest::mouseClick(child<QLabel>("status"), Qt::LeftButton);
    EXPECT_EQ(log->textCursor().selectedText(), "Sending mail.");
    EXPECT_GT(log->textCursor().blockNumber(), log->document()->find("Other").blockNumber());
    pelmo->applicationWillTerminate();
    const QString longText = QString("Error (NoServer): ") + QString(300, 'x');
    window->setStatus(longText);
    EXPECT_TRUE(status().endsWith(QChar(0x2026)) && status().size() < longText.size());
    EXPECT_EQ(child<QLabel>("status")->toolTip(), longText);
    QTest::keyClicks(child<QLineEdit>("subject"), "Draft");
    child<QAction>("quitAction")->trigger();
    answer("Discard this message?", "Cancel");
    EXPECT_TRUE(window->isVisible());
}

// File ▸ Software Update… opens the window, whose Check Now shows what the site publishes; the
// automatic check's news comes as the alert.
TEST_F(GuiFixture, SoftwareUpdateWindowChecksAndTheStartUpCheckAlerts) {
    ServerProcess site{PELMO_TEST_DIR "/controller/page_server.py",
                       {PELMO_TEST_DIR "/data/update"}};
    set("softwareUpdateVersionURL", QString("http://127.0.0.1:%1/newer.plist").arg(site.port()));
    SoftwareUpdateController updates;
    window->setSoftwareUpdate(updates);
    child<QAction>("softwareUpdateAction")->trigger();
    auto* updateWindow = window->findChild<SoftwareUpdateWindow*>();
    ASSERT_TRUE(updateWindow && updateWindow->isVisible());
    QTest::mouseClick(child<QPushButton>("checkVersionButton", updateWindow), Qt::LeftButton);
    auto* status = child<QLabel>("softwareUpdateStatus", updateWindow);
    EXPECT_TRUE(waitUntil([&] { return status->text() == "An update is available for Pelmo."; }))
        << status->text().toStdString();
    EXPECT_EQ(child<QLabel>("currentVersion", updateWindow)->text(), "0.1.1");
    updates.checkForSoftwareUpdate();
    ASSERT_TRUE(waitUntil([] { return asked<QMessageBox>() != nullptr; }));
    EXPECT_EQ(asked<QMessageBox>()->text() + ' ' + asked<QMessageBox>()->informativeText(),
              "An update is available for Pelmo (version 0.1.1.) Use Software Update in the Pelmo "
              "menu to download it. (You can turn off automatic software update checks in "
              "Preferences.)");
    asked<QMessageBox>()->accept();
}

TEST_F(GuiFixture, BoldFormatsTheSelectionOrWhatIsTypedNext) {
    auto* editor = child<QTextEdit>("message");
    QAction* bold = nullptr;
    for (QAction* action : child<QWidget>("formatting")->actions())
        bold = action->text() == "Bold" ? action : bold;
    ASSERT_NE(bold, nullptr);
    QTest::keyClicks(editor, "on ");
    bold->trigger();
    QTest::keyClicks(editor, "Saturday");
    bold->trigger();
    QTest::keyClicks(editor, " at");
    EXPECT_EQ(pelmo->message()->toMarkdown(), "on **Saturday** at\n\n");
    // The button shows the style where the cursor stands.
    for (const int at : {5, 1}) {
        QTextCursor cursor = editor->textCursor();
        cursor.setPosition(at);
        editor->setTextCursor(cursor);
        EXPECT_EQ(bold->isChecked(), at == 5) << at;
    }
    editor->selectAll();
    bold->trigger();
    EXPECT_EQ(pelmo->message()->toMarkdown(), "**on Saturday at**\n\n");
}

// Each field is named after its setting and shown as the settings file writes it: a line's
// text, a port, a box's check, a choice's item (stored as its index).
TEST_F(GuiFixture, PreferencesShowWhatIsStoredAndOkStoresWhatIsEntered) {
    const auto open = [this] {
        child<QAction>("preferencesAction")->trigger();
        return asked<PreferencesDialog>();
    };
    const auto stored = [](const char* key) {
        return settings().sync(), settings().value(key).toString();
    };
    // Enters password and presses OK, the keyring answering in the background. Expected: what
    // the field and the note show, the note after, and the keyring's and the file's copy.
    const auto enter = [&](const QString& password, const QStringList& expected) {
        auto* field = child<QLineEdit>("loginPassword", open());
        auto* note = child<QLabel>("passwordNote", field->window());
        EXPECT_EQ(field->echoMode(), QLineEdit::Password);
        const auto told = [&] {
            return QStringList{field->text(), note->text(), keyring.stored,
                               mailSettings.string(MailSettings::Key::LoginPassword)};
        };
        EXPECT_TRUE(waitUntil([&] { return told().mid(0, 2) == expected.mid(0, 2); }))
            << told().join(" | ").toStdString();
        field->setText(password);
        asked<QDialog>()->accept();
        EXPECT_TRUE(waitUntil([&] { return told().mid(1) == expected.mid(2); }))
            << told().join(" | ").toStdString();
    };
    const struct {
        const char* key;
        QString before, shown, entered, after;
    } fields[] = {
        {"senderName", "Me", "Me", " You ", "You"},
        {"senderEmail", {}, "", "me@example.org", "me@example.org"},
        {"loginUsername", {}, "", "me", "me"},
        // Ports above 65365 are the controller's to refuse, with a message that says so.
        {"serverPort", "587", "587", "65366", "65366"},
        {"useSSL", "true", "true", "false", "false"},
        {"selectedAuthentication", "3", "CRAM-MD5", "LOGIN", "2"},
        {"completionAction", {}, "Do nothing", "Clear the message", "2"},
        // A stored choice without an item shows blank and is kept as it was.
        {"selectedCharacterSet", "9", "", {}, "9"},
        {"delayBetweenMessages", "1.5", "1.5", "2.5", "2.5"},
        {"maxMessagesPerHour", {}, "0", "100", "100"},
        {"retryTemporaryFailures", {}, "false", "true", "true"},
    };
    for (const auto& field : fields)
        set(field.key, field.before);
    PreferencesDialog* dialog = open();
    for (const auto& field : fields) {
        QWidget* widget = child<QWidget>(field.key, dialog);
        const char* property = widget->metaObject()->userProperty().name();
        EXPECT_EQ(widget->property(property).toString(), field.shown) << field.key;
        if (!field.entered.isNull())
            widget->setProperty(property, field.entered);
    }
    dialog->accept();
    for (const auto& field : fields)
        EXPECT_EQ(stored(field.key), field.after) << field.key;
    child<QLineEdit>("senderName", open())->setText("Somebody else");
    dialog->reject(); // stores nothing
    EXPECT_EQ(stored("senderName"), "You");

    // The row names the application that takes mailto: links; its button makes it Pelmo.
    const QString apps = qEnvironmentVariable("XDG_DATA_HOME") + "/applications/";
    QDir().mkpath(apps);
    for (const char* name : {"Thunderbird", "Pelmo"}) {
        QFile entry(apps + QString(name).toLower() + ".desktop");
        ASSERT_TRUE(entry.open(QIODevice::WriteOnly));
        entry.write("[Desktop Entry]\nName=" + QByteArray(name) +
                    "\nMimeType=x-scheme-handler/mailto;\n");
    }
    QFile list(qEnvironmentVariable("XDG_CONFIG_HOME") + "/mimeapps.list");
    ASSERT_TRUE(
        list.open(QIODevice::WriteOnly) &&
        list.write("[Default Applications]\nx-scheme-handler/mailto=thunderbird.desktop\n"));
    list.close();
    auto* row = child<QLabel>("defaultMailClient", open());
    EXPECT_EQ(row->text(), "Links to e-mail addresses open in Thunderbird.");
    QTest::mouseClick(child<QPushButton>("makeDefaultMailClient", row->window()), Qt::LeftButton);
    EXPECT_EQ(row->text(), "Pelmo is your default mail client.");
    dialog->reject();

    // The password goes to the keyring when one answers, leaving no copy in the settings file,
    // and to the settings file otherwise; the note tells which.
    const QString file = "the settings file " + settings().fileName() + ".";
    const QString inKeyring = "The password is kept in the system keyring.";
    set("loginPassword", "plain");
    enter("s3cret", {"plain", "The password is kept in " + file, inKeyring, "s3cret", ""});
    enter("", {"s3cret", inKeyring, "A password entered here will be kept in the system keyring.",
               "", ""});
    keyring.answers = false;
    enter("s3cret", {"", "No keyring answered: a password entered here will be kept in " + file,
                     "No keyring answered: the password is kept in " + file, "", "s3cret"});
}

} // namespace

int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv);
}
