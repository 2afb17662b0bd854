#include "QtTestMain.h"
#include "app/SingleInstance.h"
#include "app/WindowMode.h"
#include "gui/GuiFixture.h"

#include <QProcess>
#include <QThread>

namespace {

// This test's window is the running Pelmo of a display of its own; pelmo started as a desktop
// starts it hands its link over.
class HandOver : public GuiFixture {
protected:
    void SetUp() override {
        qputenv("XDG_RUNTIME_DIR", runtime.path().toUtf8());
        qputenv("DISPLAY", ":handover");
        GuiFixture::SetUp();
    }
    // Runs pelmo while this window keeps answering; its exit status, -1 when it did not end.
    int pelmoWith(const QStringList& arguments) {
        QProcess start;
        start.start(PELMO_EXECUTABLE, arguments);
        waitUntil([&] { return start.state() == QProcess::NotRunning; }, 15000);
        start.kill();
        start.waitForFinished();
        return start.exitStatus() == QProcess::NormalExit ? start.exitCode() : -1;
    }
    QTemporaryDir runtime;
};

TEST_F(HandOver, LinksFillTheRunningWindowsToField) {
    SingleInstance instance;
    ASSERT_TRUE(instance.listen());
    acceptHandOvers(instance, *window, *pelmo);
    for (const char* first : {"Ann", "Bob"})
        addPerson(first, "Test", "Club");
    picker().reload();
    clickRow(child<QListWidget>("groups", &picker()), "Club");
    const auto to = [this] { return child<QLineEdit>("to")->text(); };
    // All after "mailto:" as it stands; capitals are no mailto: link; no link only raises.
    EXPECT_EQ(pelmoWith({"mailto:a@b.example?subject=x&body=Hi%20there"}), 0);
    EXPECT_EQ(to(), "a@b.example?subject=x&body=Hi%20there");
    EXPECT_EQ(pelmoWith({"MAILTO:c@d.example"}), 0);
    EXPECT_EQ(pelmoWith({}), 0);
    EXPECT_EQ(to(), "a@b.example?subject=x&body=Hi%20there");
    // A link is not the user's typing: the group chosen is still the one to mail.
    ASSERT_TRUE(pelmo->getPeople().has_value());
    EXPECT_EQ(pelmo->getPeople()->size(), 2);
}

// Installed into a prefix of its own and made the default through its own command, Pelmo takes
// the links xdg-open hands out.
TEST_F(HandOver, XdgOpenReachesTheDefaultClient) {
    const QString prefix = runtime.filePath("prefix");
    ASSERT_EQ(QProcess::execute("cmake", {"--install", PELMO_BUILD_DIR, "--prefix", prefix}), 0);
    qputenv("XDG_DATA_DIRS", (prefix + "/share").toUtf8());
    qputenv("PATH", prefix.toUtf8() + "/bin:" + qgetenv("PATH"));
    EXPECT_EQ(pelmoWith({"default-client", "--set"}), 0);
    QProcess query;
    query.start("xdg-mime", {"query", "default", "x-scheme-handler/mailto"});
    query.waitForFinished();
    EXPECT_EQ(query.readAllStandardOutput(), "pelmo.desktop\n");
    SingleInstance instance;
    ASSERT_TRUE(instance.listen());
    acceptHandOvers(instance, *window, *pelmo);
    QProcess open;
    open.start("xdg-open", {"mailto:a@b.example?subject=x"});
    EXPECT_TRUE(waitUntil([&] { return open.state() == QProcess::NotRunning; }, 15000));
    EXPECT_EQ(open.exitCode(), 0) << open.readAllStandardError().toStdString();
    EXPECT_EQ(child<QLineEdit>("to")->text(), "a@b.example?subject=x");
}

// Three starts at once, over the socket a crashed Pelmo left: one runs, two hand over.
TEST_F(HandOver, OneOfThreeRacingStartsRuns) {
    ASSERT_EQ(QProcess::execute(
                  PELMO_PYTHON3,
                  {"-c", "import socket,sys; socket.socket(socket.AF_UNIX).bind(sys.argv[1])",
                   SingleInstance::socketPath()}),
              0);
    QProcess starts[3];
    for (QProcess& start : starts)
        start.start(PELMO_EXECUTABLE,
                    &start == starts ? QStringList() : QStringList{"mailto:x@example.org"});
    const auto ended = [&] {
        return std::count_if(std::begin(starts), std::end(starts),
                             [](QProcess& p) { return p.state() == QProcess::NotRunning; });
    };
    EXPECT_TRUE(waitUntil([&] { return ended() == 2; }, 20000));
    QThread::msleep(500); // a second Pelmo would not end by itself
    EXPECT_EQ(ended(), 2);
    for (QProcess& start : starts) {
        if (start.state() == QProcess::NotRunning) {
            EXPECT_EQ(start.exitCode(), 0);
        }
        start.kill();
        start.waitForFinished();
    }
}

} // namespace

int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv);
}
