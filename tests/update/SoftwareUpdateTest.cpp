// The software update against update_server.py on 127.0.0.1, in a home folder of the test's own.
#include "RowName.h"
#include "TestEnvironment.h"
#include "e2e/E2eSupport.h"
#include "update/SoftwareUpdateController.h"
#include "util/CLog.h"

#include <QNetworkReply>
#include <QSettings>
#include <QSignalSpy>
#include <QTest>
#include <QTimer>

namespace {

using Signals = QList<QList<QVariant>>;

QString base() {
    static ServerProcess server(PELMO_TEST_DIR "/update/update_server.py",
                                {PELMO_TEST_DIR "/data/update"});
    return QStringLiteral("http://127.0.0.1:%1/").arg(server.port());
}

// A row of a data file: "== NAME | FIELD | ..." and the lines below it.
struct Row {
    std::string name;
    QStringList field;
    QString text;
};

std::vector<Row> rows(const char* file) {
    QFile data(PELMO_TEST_DATA "/update/" + QString(file));
    std::vector<Row> table;
    for (QString& line : (data.open(QFile::ReadOnly) ? QString(data.readAll()) : "").split('\n'))
        if (line.startsWith("== ")) {
            const QStringList head = line.mid(3).split(" | ");
            table.push_back({head[0].toStdString(), head.mid(1), ""});
        } else if (!table.empty() && !line.isEmpty())
            table.back().text += (table.back().text.isEmpty() ? "" : "\n") + line;
    return table;
}

QString address(const QString& path) {
    return path.startsWith("http") ? path : base() + path;
}

// An expected text with the address asked, the server's port and the file downloaded.
QString fill(QString text, const QString& url, const QString& file = {}) {
    const QString port = QString::number(QUrl(base()).port());
    return text.replace("{url}", url).replace("{port}", port).replace("{file}", file);
}

// Runs the event loop until every request has ended (its reply is deleted then).
QString settle(SoftwareUpdateController& update, const QSignalSpy& statuses) {
    for (int i = 0; i < 250 && !update.findChildren<QNetworkReply*>().isEmpty(); ++i)
        QTest::qWait(20);
    QStringList lines;
    for (const QList<QVariant>& status : statuses)
        lines << status.at(0).toString();
    return lines.join('\n');
}

class Check : public ::testing::TestWithParam<Row> {};
INSTANTIATE_TEST_SUITE_P(Update, Check, ::testing::ValuesIn(rows("checks.txt")), RowName());

// Catches: a wrong or missing status line, a failure reported as success, an alert for anything
// but a newer version (the automatic check is silent on every failure); and pelmo check-update
// printing other lines or answering the wrong exit status.
TEST_P(Check, StatusLinesAndAlert) {
    const QString url = address(GetParam().field[0]);
    const QString expected = fill(GetParam().text, url);
    QSettings().setValue("softwareUpdateVersionURL", url);
    SoftwareUpdateController update;
    update.setTimeouts(std::chrono::milliseconds(300), std::chrono::milliseconds(300));
    QSignalSpy statuses(&update, &SoftwareUpdateController::statusChanged);
    QSignalSpy alerts(&update, &SoftwareUpdateController::updateAvailable);
    QSignalSpy finished(&update, &SoftwareUpdateController::checkFinished);
    update.checkVersion();
    update.checkForSoftwareUpdate();
    EXPECT_EQ(settle(update, statuses), expected);
    EXPECT_EQ(finished, Signals{{GetParam().field[1] == "1"}});
    EXPECT_EQ(alerts.size(), GetParam().field[2].toInt());
    if (url.contains("hang")) // the command waits its full 10 seconds there
        return;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    for (const char* name : {"HOME", "XDG_CONFIG_HOME", "XDG_DATA_HOME"})
        environment.insert(name, QDir::homePath());
    const PelmoRun run = runPelmo({"check-update"}, environment);
    EXPECT_EQ(run.out, expected + '\n');
    EXPECT_EQ(run.status, GetParam().field[1] == "1" ? 0 : 1);
}

class Download : public ::testing::TestWithParam<Row> {};
INSTANTIATE_TEST_SUITE_P(Update, Download, ::testing::ValuesIn(rows("downloads.txt")), RowName());

// Catches: a user's file overwritten, a server's path followed out of the desktop, a desktop
// folder made readable by others, wrong progress lines, a broken file left behind, the
// indicator hidden after a failure.
TEST_P(Download, ToTheDesktop) {
    const QStringList& field = GetParam().field;
    QDir desktop(QDir::homePath() + "/Desktop");
    ASSERT_TRUE(desktop.removeRecursively());
    ASSERT_TRUE(field[1].isEmpty() ||
                (desktop.mkpath(".") && QFile(desktop.filePath(field[1])).open(QFile::WriteOnly)));
    QSettings().setValue("softwareUpdateDownloadURL", address(field[0]));
    SoftwareUpdateController update;
    QSignalSpy statuses(&update, &SoftwareUpdateController::statusChanged);
    QSignalSpy progress(&update, &SoftwareUpdateController::downloadProgressChanged);
    QSignalSpy finished(&update, &SoftwareUpdateController::downloadFinished);
    update.clickSoftwareUpdateButton();
    const QString lines = settle(update, statuses), pattern = GetParam().text.section('\n', 1);
    const QString path = field[2].isEmpty() ? "" : desktop.filePath(field[2]);
    EXPECT_TRUE(QRegularExpression("^" + pattern + "$").match(lines).hasMatch())
        << lines.toStdString();
    EXPECT_EQ(finished, (Signals{{field[3] == "1", path}}));
    EXPECT_EQ(QFileInfo(path).size(), field[3] == "1" ? 65536 : 0);
    EXPECT_EQ(progress.last().at(0).toBool(), field[3] != "1");
    // Made by the download, the folder is the user's alone.
    EXPECT_TRUE(!field[1].isEmpty() || !(QFile::permissions(desktop.path()) & 0x0077));
    QFile file(QDir::homePath() + "/Orvale Software/Pelmo/Pelmo.log");
    const QByteArray written = file.open(QFile::ReadOnly) ? file.readAll() : "";
    EXPECT_TRUE(written.contains(
        fill(GetParam().text.section('\n', 0, 0), address(field[0]), path).toUtf8() + '\r'))
        << written.toStdString();
}

class Version : public ::testing::TestWithParam<Row> {};
INSTANTIATE_TEST_SUITE_P(Update, Version, ::testing::ValuesIn(rows("versions.txt")), RowName());

// Catches: versions compared as text, dots kept, a text read past 255 bytes, an overflow.
TEST_P(Version, AsNumber) {
    EXPECT_EQ(SoftwareUpdateController::getVersionNumber(GetParam().field[0]),
              GetParam().field[1].toInt());
}

// Catches: an automatic check armed though turned off, not 5 seconds later, or not checking.
TEST(Update, AwakeArmsTheCheckOnlyWhenOn) {
    QSettings().setValue("softwareUpdateVersionURL", base() + "newer.plist");
    QSettings().setValue("checkForSoftwareUpdates", false);
    SoftwareUpdateController update;
    update.awake();
    EXPECT_EQ(update.findChild<QTimer*>(), nullptr);
    QSettings().setValue("checkForSoftwareUpdates", true);
    update.awake();
    QTimer* timer = update.findChild<QTimer*>();
    ASSERT_TRUE(timer && timer->isActive() && timer->isSingleShot() && timer->interval() == 5000);
    QSignalSpy alerts(&update, &SoftwareUpdateController::updateAvailable);
    timer->start(0);
    ASSERT_TRUE(alerts.wait(5000));
    EXPECT_EQ(alerts.first().at(0), "An update is available for Pelmo (version 0.1.1.) Use "
                                    "Software Update in the Pelmo menu to download it.");
}

} // namespace

int main(int argc, char** argv) {
    useTestEnvironment();
    QTemporaryDir home;
    for (const char* name : {"HOME", "XDG_CONFIG_HOME", "XDG_DATA_HOME"})
        qputenv(name, home.path().toUtf8());
    QCoreApplication app(argc, argv);
    QCoreApplication::setOrganizationName("Orvale Software");
    QCoreApplication::setApplicationName("Pelmo");
    StartLogging();
    ::testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
