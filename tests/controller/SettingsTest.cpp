#include "ControllerFixture.h"
#include "ScriptedSession.h"

#include "controller/SentRecipients.h"
#include "util/PelmoException.h"

#include <QDateTime>
#include <QFile>
#include <QFileInfo>
#include <QTextDocument>

#include <sys/stat.h>

namespace {

using Key = MailSettings::Key;

// Its text is in the bad_port run.
TEST_F(ControllerFixture, PortIsOneTo65365) {
    const std::pair<QVariant, const char*> rows[] = {
        {1, "1"},         {587, "587"},       {65365, "65365"},   {"2525", "2525"},
        {{}, "BadPort"},  {0, "BadPort"},     {65366, "BadPort"}, {65535, "BadPort"},
        {-25, "BadPort"}, {"smtp", "BadPort"}};
    for (const auto& [port, expected] : rows) {
        set("serverPort", port);
        QString got;
        try {
            got = QString::number(controller->getPort());
        } catch (const PelmoException& failure) {
            got = failure.name();
        }
        EXPECT_EQ(got, QLatin1String(expected)) << port.toString().toStdString();
    }
}

// The preferences of another process rewrite the file; the next message must go by it, also
// when the file comes back with the time stamp it had (cp -p, rsync -t, a restored backup).
TEST_F(ControllerFixture, TheNextMessageSeesWhatAnotherProcessSaved) {
    const QDateTime lastMinute =
        QDateTime::fromSecsSinceEpoch(QDateTime::currentSecsSinceEpoch() - 60);
    const std::pair<const char*, QDateTime> rows[] = {{"later", lastMinute.addSecs(65)},
                                                      {"kept", lastMinute}};
    QString opened;
    QStringList transcript;
    controller->setSessionFactory([&](const QString& host, int) -> SmtpSession* {
        opened = host;
        return new ScriptedSession({}, transcript);
    });
    const auto stamp = [](const QDateTime& time) {
        QFile file(settings().fileName());
        return file.open(QIODevice::ReadWrite) &&
               file.setFileTime(time, QFileDevice::FileModificationTime);
    };
    for (const auto& [row, rewrittenAt] : rows) {
        clearSettings();
        set("serverAddress", QStringLiteral("old.example.org"));
        for (const char* key : {"senderEmail", "senderName"})
            set(key, QStringLiteral("me@example.org"));
        set("serverPort", 25);
        ASSERT_TRUE(stamp(lastMinute));
        view.toText = QStringLiteral("ann@example.org");
        view.nameText = QStringLiteral("Ann");
        runUntilSettled();
        EXPECT_EQ(opened, QStringLiteral("old.example.org")) << row;
        QFile rewrite(settings().fileName());
        ASSERT_TRUE(rewrite.open(QIODevice::WriteOnly | QIODevice::Truncate));
        rewrite.write("[General]\nserverAddress=other.example.org\nsenderEmail=me@example.org\n"
                      "senderName=Me\nserverPort=25\n");
        rewrite.close();
        ASSERT_TRUE(stamp(rewrittenAt));
        view.toText = QStringLiteral("ann@example.org");
        view.nameText = QStringLiteral("Ann");
        runUntilSettled();
        EXPECT_EQ(opened, QStringLiteral("other.example.org")) << row;
    }
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

// Start-up fills To from its default (a missing default name leaves Name as typed) and forgets
// who was mailed; Reset empties the message and puts both defaults back.
TEST_F(ControllerFixture, StartUpResetAndAlert) {
    set("defaultRecipientEmail", QStringLiteral("team@example.org"));
    controller->sentRecipients().addRecipient(QStringLiteral("earlier@example.org"));
    view.nameText = QStringLiteral("typed");
    controller->startUp();
    EXPECT_EQ(view.toText + " " + view.nameText, QStringLiteral("team@example.org typed"));
    EXPECT_EQ(view.statuses, QStringList{QStringLiteral("Ready.")});
    EXPECT_EQ(controller->sentRecipients().rowCount(), 0);
    controller->message()->setPlainText(QStringLiteral("Old text"));
    view.subjectText = QStringLiteral("Old subject");
    set("defaultRecipientName", QStringLiteral("Team"));
    set("defaultRecipientEmail", QVariant());
    controller->reset();
    EXPECT_TRUE(controller->message()->isEmpty());
    EXPECT_EQ(view.subjectText + "|" + view.toText + "|" + view.nameText, QStringLiteral("||Team"));
    EXPECT_EQ(view.statuses.mid(1), QStringList{QStringLiteral("Ready.")});
    controller->doAlert(QStringLiteral("Title"), QStringLiteral("Explanation"));
    EXPECT_EQ(view.events, QStringList({"beep", "alert: Title / Explanation"}));
}

// Addresses match in any letter case, also beyond ASCII, but otherwise exactly.
TEST_F(ControllerFixture, SentRecipientsIgnoreCaseOnly) {
    SentRecipients& sent = controller->sentRecipients();
    sent.addRecipient(QStringLiteral("Ada.Lovelace@Example.ORG"));
    sent.addRecipient(QString::fromUtf8("JÜRGEN@example.de"));
    EXPECT_EQ(sent.headerData(1, Qt::Vertical).toInt(), 2); // rows are numbered from 1
    const std::pair<const char*, bool> rows[] = {
        {"ada.lovelace@example.org", true},   {"ADA.LOVELACE@EXAMPLE.ORG", true},
        {"jürgen@EXAMPLE.de", true},          {" ada.lovelace@example.org", false},
        {"ada.lovelace@example.org ", false}, {"ada.lovelace@example.or", false}};
    for (const auto& [address, known] : rows)
        EXPECT_EQ(sent.recipientsContains(QString::fromUtf8(address)), known) << address;
    sent.resetRecipients();
    EXPECT_FALSE(sent.recipientsContains(QStringLiteral("ada.lovelace@example.org")));
}

} // namespace
