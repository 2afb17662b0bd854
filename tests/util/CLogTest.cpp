#include "util/CLog.h"

#include "text/CString256.h"

#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QObject>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QUrl>
#include <gtest/gtest.h>

namespace {

// Stands in for the desktop's "open in default application".
class UrlRecorder : public QObject {
    Q_OBJECT
public:
    QList<QUrl> opened;
public Q_SLOTS:
    void open(const QUrl& url) { opened << url; }
};

class Log : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(home.isValid());
        saved = qgetenv("XDG_DATA_HOME");
        qputenv("XDG_DATA_HOME", home.path().toUtf8());
    }
    void TearDown() override {
        StopLogging();
        qputenv("XDG_DATA_HOME", saved);
    }

    QString logPath() const {
        return home.path() + QStringLiteral("/Orvale Software/Pelmo/Pelmo.log");
    }
    QByteArray logBytes() const {
        QFile file(logPath());
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }
    // The log's lines; the text after the last carriage return is dropped when empty.
    QList<QByteArray> logLines() const {
        QList<QByteArray> lines = logBytes().split('\r');
        if (!lines.isEmpty() && lines.last().isEmpty())
            lines.removeLast();
        return lines;
    }

    QTemporaryDir home;
    QByteArray saved;
};

const QRegularExpression
    kStart(QStringLiteral(R"(^\[Logging starting at \d{4}-\d\d-\d\d \d\d:\d\d:\d\d [+-]\d{4}\]$)"));
const QRegularExpression
    kStop(QStringLiteral(R"(^\[Logging stopping at \d{4}-\d\d-\d\d \d\d:\d\d:\d\d [+-]\d{4}\]$)"));

bool matches(const QRegularExpression& pattern, const QByteArray& line) {
    return pattern.match(QString::fromUtf8(line)).hasMatch();
}

TEST_F(Log, TwoLaunchesAppendTwoFramedRuns) {
    StartLogging();
    LogEntry("first run");
    StopLogging();
    StartLogging();
    LogEntry("second run");
    StopLogging();
    const QByteArray bytes = logBytes();
    EXPECT_FALSE(bytes.contains('\n'));
    EXPECT_TRUE(bytes.endsWith('\r'));
    const QList<QByteArray> lines = logLines();
    ASSERT_EQ(lines.size(), 6);
    EXPECT_TRUE(matches(kStart, lines[0])) << lines[0].constData();
    EXPECT_EQ(lines[1], "first run");
    EXPECT_TRUE(matches(kStop, lines[2])) << lines[2].constData();
    EXPECT_TRUE(matches(kStart, lines[3])) << lines[3].constData();
    EXPECT_EQ(lines[4], "second run");
    EXPECT_TRUE(matches(kStop, lines[5])) << lines[5].constData();
}

TEST_F(Log, MissingFoldersAreCreated) {
    ASSERT_FALSE(QDir(home.path() + QStringLiteral("/Orvale Software")).exists());
    StartLogging();
    EXPECT_TRUE(QFile::exists(logPath()));
}

TEST_F(Log, EmbeddedLineFeedIsWrittenAsItStands) {
    StartLogging();
    LogEntry("two\nparts");
    LogEntry("caf\xc3\xa9");
    StopLogging();
    EXPECT_EQ(logLines().at(1), "two\nparts");
    EXPECT_EQ(logLines().at(2), "caf\xc3\xa9");
}

TEST_F(Log, LinesAreHeldIn255Bytes) {
    StartLogging();
    LogEntry(std::string(254, 'a').c_str()); // room for the carriage return
    LogEntry(std::string(255, 'b').c_str()); // none: the next line runs on
    LogEntry(std::string(300, 'c').c_str()); // cut to 255, no carriage return
    LogEntry("end");
    StopLogging();
    const QList<QByteArray> lines = logLines();
    ASSERT_GE(lines.size(), 4);
    EXPECT_EQ(lines[1], QByteArray(254, 'a'));
    EXPECT_EQ(lines[2], QByteArray(255, 'b') + QByteArray(255, 'c') + "end");
}

TEST_F(Log, NothingIsWrittenWhileLoggingIsOff) {
    LogEntry("dropped");
    EXPECT_FALSE(QFile::exists(logPath()));
    StartLogging();
    StopLogging();
    LogEntry("dropped too");
    EXPECT_FALSE(logBytes().contains("dropped"));
}

TEST_F(Log, UnusableFolderLeavesLoggingOff) {
    QFile blocker(home.path() + QStringLiteral("/Orvale Software"));
    ASSERT_TRUE(blocker.open(QIODevice::WriteOnly)); // a file where the folder should be
    blocker.close();
    StartLogging();
    EXPECT_EQ(gLogger, nullptr);
    LogEntry("nowhere");
}

TEST_F(Log, UnopenableFileIgnoresWrites) {
    CLog log;
    EXPECT_NE(log.open_log_file("/nonexistent-folder/Pelmo.log"), 0);
    EXPECT_FALSE(log.is_open());
    EXPECT_EQ(log.write_entry(CString256("ignored")), 0);
    EXPECT_EQ(log.close_log_file(), 0);
}

TEST_F(Log, OpenConsoleOpensTheLogOnlyWhenItExists) {
    UrlRecorder recorder;
    QDesktopServices::setUrlHandler(QStringLiteral("file"), &recorder, "open");
    OpenConsole();
    EXPECT_TRUE(recorder.opened.isEmpty());
    StartLogging();
    OpenConsole();
    QDesktopServices::unsetUrlHandler(QStringLiteral("file"));
    ASSERT_EQ(recorder.opened.size(), 1);
    EXPECT_EQ(recorder.opened.first(), QUrl::fromLocalFile(logPath()));
}

} // namespace

#include "CLogTest.moc"
