#include "ControllerFixture.h"

#include "controller/SentRecipients.h"
#include "util/CLog.h"
#include "util/PelmoException.h"

#include <QDateTime>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>
#include <QTextDocument>

#include <sys/stat.h>

namespace {

using Key = MailSettings::Key;

QString failureOf(const std::function<void()>& call) {
    try {
        call();
    } catch (const PelmoException& failure) {
        return failure.name() + QStringLiteral(": ") + failure.reason();
    }
    return QStringLiteral("none");
}

// Each value a copy cannot go without, and the failure its absence raises.
TEST_F(ControllerFixture, RequiredValues) {
    struct Row {
        const char* key; // null: the window field behind the getter
        QString RecordingView::*field;
        QString (PelmoController::*getter)();
        const char* failure;
    };
    const Row rows[] = {
        {nullptr, &RecordingView::toText, &PelmoController::getTo,
         "NoRecipientsEmail: The 'Recipient Address:' value has not been specified."},
        {nullptr, &RecordingView::nameText, &PelmoController::getToName,
         "NoRecipientsName: The 'Recipients Name:' value has not been specified."},
        {"senderEmail", nullptr, &PelmoController::getFrom,
         "NoSenderEmailAddress: The sender 'Email Address:' preference value has not been "
         "specified."},
        {"senderName", nullptr, &PelmoController::getFromName,
         "NoSenderName: The sender 'Name:' preference value has not been specified."},
        {"serverAddress", nullptr, &PelmoController::getServer,
         "NoServer: The outgoing SMTP server 'Address:' preference value has not been "
         "specified."},
        {"loginUsername", nullptr, &PelmoController::getUsername,
         "NoUsername: The outgoing SMTP server 'Username:' preference value has not been "
         "specified."},
    };
    for (const Row& row : rows) {
        SCOPED_TRACE(row.failure);
        const auto store = [&](const QString& value) {
            row.key ? set(row.key, value) : void(view.*row.field = value);
        };
        const auto get = [&] { return ((*controller).*row.getter)(); };
        EXPECT_EQ(failureOf(get), QLatin1String(row.failure)); // missing
        store(QString(""));
        EXPECT_EQ(failureOf(get), QLatin1String(row.failure)); // empty like missing
        store(QStringLiteral(" Value, with comma "));
        EXPECT_EQ(get(), QStringLiteral(" Value, with comma ")); // as it stands
    }
}

TEST_F(ControllerFixture, PortIsOneTo65365) {
    const QVariant valid[] = {1, 587, 65365, QStringLiteral("2525")};
    const QVariant invalid[] = {QVariant(), 0, 65366, 65535, -25, QStringLiteral("smtp")};
    for (const QVariant& port : valid) {
        set("serverPort", port);
        EXPECT_EQ(controller->getPort(), port.toInt());
    }
    for (const QVariant& port : invalid) {
        port.isValid() ? set("serverPort", port) : settings().remove(QStringLiteral("serverPort"));
        settings().sync();
        EXPECT_EQ(failureOf([&] { controller->getPort(); }),
                  QStringLiteral("BadPort: The outgoing SMTP server 'Port:' preference value is "
                                 "out of range."))
            << port.toString().toStdString();
    }
}

TEST_F(ControllerFixture, MissingValuesReadAsZeroFalseOrNull) {
    EXPECT_EQ(controller->getSelectedContentType() + controller->getSelectedCharacterSet() +
                  controller->getSelectedLoginMechanism() + controller->completionAction(),
              0);
    EXPECT_FALSE(controller->useSSL());
    EXPECT_TRUE(controller->getDefaultTo().isNull());
    set("defaultRecipientEmail", QString(""));
    set("selectedCharacterSet", 3);
    set("useSSL", true);
    EXPECT_FALSE(controller->getDefaultTo().isNull());
    EXPECT_EQ(controller->getSelectedCharacterSet(), 3);
    EXPECT_TRUE(controller->useSSL());
}

// The preferences of another process rewrite the file; the next read must see it.
TEST_F(ControllerFixture, EveryReadSyncsFirst) {
    set("serverAddress", QStringLiteral("old.example.org"));
    EXPECT_EQ(controller->getServer(), QStringLiteral("old.example.org"));
    QFile rewrite(settings().fileName());
    ASSERT_TRUE(rewrite.open(QIODevice::WriteOnly | QIODevice::Truncate));
    rewrite.write("[General]\nserverAddress=new.example.org\n");
    rewrite.close();
    ASSERT_TRUE(rewrite.open(QIODevice::ReadWrite));
    rewrite.setFileTime(QDateTime::currentDateTime().addSecs(5), QFileDevice::FileModificationTime);
    rewrite.close();
    EXPECT_EQ(controller->getServer(), QStringLiteral("new.example.org"));
}

// The file may hold the password: nobody else may read it, also after an older Pelmo or an
// editor left it readable, and also after a save replaced it.
TEST_F(ControllerFixture, SettingsArePrivate) {
    const QFileInfo file(settings().fileName());
    const auto mode = [](const QString& path) {
        struct stat status {};
        return ::stat(path.toLocal8Bit().constData(), &status) == 0 ? status.st_mode & 0777 : 0;
    };
    ::chmod(file.absolutePath().toLocal8Bit().constData(), 0755);
    ::chmod(file.absoluteFilePath().toLocal8Bit().constData(), 0644);
    MailSettings fresh;
    EXPECT_EQ(mode(file.absolutePath()), 0700u);
    EXPECT_EQ(mode(file.absoluteFilePath()), 0600u);
    fresh.setValue(Key::LoginPassword, QStringLiteral("s3cret"));
    EXPECT_EQ(mode(file.absoluteFilePath()), 0600u);
}

TEST_F(ControllerFixture, StartUpResetAndAlert) {
    set("defaultRecipientEmail", QStringLiteral("team@example.org"));
    controller->sentRecipients().addRecipient(QStringLiteral("earlier@example.org"));
    view.nameText = QStringLiteral("typed");
    controller->startUp();
    EXPECT_EQ(view.toText, QStringLiteral("team@example.org"));
    EXPECT_EQ(view.nameText, QStringLiteral("typed")); // no default name: left alone
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Ready."));
    EXPECT_EQ(controller->sentRecipients().rowCount(), 0);

    controller->message()->setPlainText(QStringLiteral("Old text"));
    view.subjectText = QStringLiteral("Old subject");
    set("defaultRecipientName", QStringLiteral("Team"));
    settings().remove(QStringLiteral("defaultRecipientEmail"));
    settings().sync();
    view.statuses.clear();
    controller->reset();
    EXPECT_TRUE(controller->message()->isEmpty());
    EXPECT_TRUE(view.subjectText.isEmpty() && view.toText.isEmpty());
    EXPECT_EQ(view.nameText, QStringLiteral("Team"));
    EXPECT_EQ(view.statuses, QStringList{QStringLiteral("Ready.")});

    controller->doAlert(QStringLiteral("Title"), QStringLiteral("Explanation"));
    EXPECT_EQ(view.events, QStringList({"beep", "alert: Title / Explanation"}));
}

TEST_F(ControllerFixture, StatusLinesGoToTheViewAndTheLog) {
    const QString path = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) +
                         QStringLiteral("/Orvale Software/Pelmo/Pelmo.log");
    QFile::remove(path);
    controller->applicationWillFinishLaunching();
    controller->statusMsg(QString::fromUtf8("Connected to the smtp.example.org server. ✓"));
    controller->applicationWillTerminate();
    EXPECT_EQ(view.statuses.last(),
              QString::fromUtf8("Connected to the smtp.example.org server. ✓"));
    QFile log(path);
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    const QList<QByteArray> lines = log.readAll().split('\r');
    ASSERT_EQ(lines.size(), 4); // start, the line, stop, and nothing after the last CR
    EXPECT_EQ(lines.at(1), QByteArray("Connected to the smtp.example.org server. \xe2\x9c\x93"));
}

TEST_F(ControllerFixture, SentRecipientsIgnoreCaseOnly) {
    SentRecipients& sent = controller->sentRecipients();
    int inserted = 0;
    QObject::connect(&sent, &SentRecipients::rowsInserted, [&inserted] { ++inserted; });
    sent.addRecipient(QStringLiteral("Ada.Lovelace@Example.ORG"));
    sent.addRecipient(QString::fromUtf8("JÜRGEN@example.de"));
    EXPECT_EQ(inserted, 2); // the window's table follows each addition
    EXPECT_EQ(sent.data(sent.index(1)).toString(), QString::fromUtf8("JÜRGEN@example.de"));
    EXPECT_EQ(sent.headerData(1, Qt::Vertical).toInt(), 2);
    for (const char* same : {"ada.lovelace@example.org", "ADA.LOVELACE@EXAMPLE.ORG"})
        EXPECT_TRUE(sent.recipientsContains(QLatin1String(same))) << same;
    EXPECT_TRUE(sent.recipientsContains(QString::fromUtf8("jürgen@EXAMPLE.de")));
    for (const char* other :
         {" ada.lovelace@example.org", "ada.lovelace@example.org ", "ada.lovelace@example.or"})
        EXPECT_FALSE(sent.recipientsContains(QLatin1String(other))) << other;
    sent.resetRecipients();
    EXPECT_EQ(sent.rowCount(), 0);
    EXPECT_FALSE(sent.recipientsContains(QStringLiteral("ada.lovelace@example.org")));
}

} // namespace
