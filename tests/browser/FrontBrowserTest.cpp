#include "QtTestMain.h"
#include "RowName.h"
#include "browser/DesktopWindows.h"
#include "browser/FrontPageQuery.h"
#include "e2e/E2eSupport.h"
#include "gui/GuiFixture.h"

#include <QDir>
#include <QFile>

#include <xcb/xcb.h>

namespace {

// A /proc tree of the processes given as "pid parent started comm exe arguments...".
void writeProcesses(const QString& root, const std::vector<const char*>& processes) {
    for (const char* line : processes) {
        const QStringList f = QString::fromLatin1(line).split(' ');
        const QString dir = root + '/' + f[0] + '/';
        QDir().mkpath(dir);
        QFile stat(dir + "stat"), comm(dir + "comm"), cmdline(dir + "cmdline");
        stat.open(QIODevice::WriteOnly);
        stat.write(QString("%1 (%2) S %3 %4%5 0 0\n")
                       .arg(f[0], f[3], f[1], QString("0 ").repeated(17), f[2])
                       .toLatin1());
        comm.open(QIODevice::WriteOnly);
        comm.write(f[3].toLatin1() + '\n');
        cmdline.open(QIODevice::WriteOnly);
        cmdline.write(f.mid(5).join(QChar('\0')).toLatin1() + '\0');
        QFile::link("/usr/lib/browsers/" + f[4], dir + "exe");
    }
}

struct PreferenceRow {
    std::string name;
    std::vector<const char*> processes;
    QList<qint64> front; // the owners of the windows, front first
    qint64 title, url;   // the pid asked, 0 for none
};

class Preference : public ::testing::TestWithParam<PreferenceRow> {};

TEST_P(Preference, PicksTheBrowserToAsk) {
    const PreferenceRow& row = GetParam();
    QTemporaryDir root;
    writeProcesses(root.path(), row.processes);
    const ProcessTable processes(root.path());
    const QList<RunningBrowser> running = FindRunningBrowsers(processes);
    const auto title = GetRunningBrowserNameScript(running, processes, row.front);
    const auto url = GetRunningBrowserURLScript(running, processes, row.front);
    EXPECT_EQ(title ? title->process.pid : 0, row.title);
    EXPECT_EQ(url ? url->process.pid : 0, row.url);
}

const char* kShell = "50 1 5 bash bash -bash";
const char* kChromium = "80 1 8 chromium chromium /usr/lib/chromium/chromium";
const char* kFirefox = "60 1 6 firefox firefox /usr/lib/firefox/firefox";
const char* kLibreWolf = "70 1 7 librewolf librewolf librewolf";

INSTANTIATE_TEST_SUITE_P(
    Browsers, Preference,
    ::testing::Values(
        PreferenceRow{"NoBrowserNoneAsked", {kShell}, {50}, 0, 0},
        PreferenceRow{"OneBrowserAnswersBoth", {kShell, kLibreWolf}, {}, 70, 70},
        PreferenceRow{"TitleFromFirefoxAddressFromLibreWolf", {kFirefox, kLibreWolf}, {}, 60, 70},
        PreferenceRow{"ChromiumBeforeFirefox", {kFirefox, kChromium}, {}, 80, 80},
        PreferenceRow{"RendererIsNotTheBrowser",
                      {kChromium, "81 80 9 chromium chromium chromium --type=renderer"},
                      {},
                      80,
                      80},
        PreferenceRow{"FrontWindowBeatsPreference", {kFirefox, kChromium}, {60}, 60, 60},
        PreferenceRow{"ContentProcessWindowIsItsBrowsers",
                      {kFirefox, kChromium, "61 60 9 Web_Content firefox firefox -contentproc"},
                      {61},
                      60,
                      60},
        PreferenceRow{
            "TopmostBrowserBelowTheTerminal", {kShell, kFirefox, kChromium}, {50, 60}, 60, 60},
        PreferenceRow{
            "LatestStartedOfTwo", {kChromium, "90 1 20 chromium chromium chromium"}, {}, 90, 90},
        PreferenceRow{
            "KnownByItsExecutable", {"65 1 6 MainThread firefox-esr firefox-esr"}, {}, 65, 65}),
    RowName());

xcb_atom_t atom(xcb_connection_t* x, const char* name) {
    xcb_intern_atom_reply_t* reply =
        xcb_intern_atom_reply(x, xcb_intern_atom(x, 0, strlen(name), name), nullptr);
    const xcb_atom_t found = reply->atom;
    free(reply);
    return found;
}

// Xvfb, with this test acting as the window manager: three windows of three processes, the
// bottom one active.
TEST(DesktopWindows, ActiveWindowThenTheStackFromTheTop) {
    QProcess xvfb;
    xvfb.start("Xvfb", {"-displayfd", "1", "-nolisten", "tcp"});
    ASSERT_TRUE(xvfb.waitForReadyRead(10000));
    qputenv("DISPLAY", ":" + xvfb.readAllStandardOutput().trimmed());
    xcb_connection_t* x = xcb_connect(nullptr, nullptr);
    const xcb_window_t root = xcb_setup_roots_iterator(xcb_get_setup(x)).data->root;
    std::vector<xcb_window_t> stack; // bottom to top
    for (uint32_t pid : {11, 22, 33}) {
        stack.push_back(xcb_generate_id(x));
        xcb_create_window(x, 0, stack.back(), root, 0, 0, 10, 10, 0, XCB_WINDOW_CLASS_INPUT_ONLY,
                          XCB_COPY_FROM_PARENT, 0, nullptr);
        xcb_change_property(x, XCB_PROP_MODE_REPLACE, stack.back(), atom(x, "_NET_WM_PID"),
                            XCB_ATOM_CARDINAL, 32, 1, &pid);
    }
    xcb_change_property(x, XCB_PROP_MODE_REPLACE, root, atom(x, "_NET_CLIENT_LIST_STACKING"),
                        XCB_ATOM_WINDOW, 32, 3, stack.data());
    xcb_change_property(x, XCB_PROP_MODE_REPLACE, root, atom(x, "_NET_ACTIVE_WINDOW"),
                        XCB_ATOM_WINDOW, 32, 1, stack.data());
    xcb_flush(x);
    EXPECT_EQ(FrontWindowPids(), QList<qint64>({11, 33, 22}));
    xcb_disconnect(x);
    qunsetenv("DISPLAY");
    xvfb.terminate();
    xvfb.waitForFinished();
}

// "URL, title, status" as pelmo front-page prints them.
QString frontPage() {
    QTemporaryDir home;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("HOME", home.path());
    environment.insert("XDG_CONFIG_HOME", home.path());
    environment.remove("DISPLAY");
    const PelmoRun run = runPelmo({"front-page"}, environment);
    return run.out + run.err + QString::number(run.status);
}

class RealBrowser : public ::testing::Test {
protected:
    ServerProcess pages{PELMO_TEST_DIR "/controller/page_server.py",
                        {PELMO_TEST_DATA "/browser/www"}};
    const QString base = QString("http://127.0.0.1:%1/").arg(pages.port());
    QString shown;
    bool shows(const QString& expected) {
        return eventually([&] { return (shown = frontPage()) == expected; });
    }
};

TEST_F(RealBrowser, ChromiumsFrontTab) {
    HeadlessBrowser chromium(HeadlessBrowser::Kind::Chromium, base + "alpha.html");
    EXPECT_TRUE(shows(base + "alpha.html\nAlpha page\n0")) << shown.toStdString();
    // A new tab comes to the front, its title given HTML-escaped by Chromium.
    chromium.devTools("PUT", "/json/new?" + base + "beta.html");
    EXPECT_TRUE(shows(base + "beta.html\nBeta & more\n0")) << shown.toStdString();

    // pelmo send --front-page mails that page with its title as the subject.
    QTemporaryDir home;
    QProcessEnvironment environment;
    environment.insert("HOME", home.path());
    const PelmoRun sent =
        runPelmo({"send", "--front-page", "--to", "ann@example.org", "--name", "Ann", "--set",
                  "senderEmail=me@example.org", "--set", "senderName=Me", "--set",
                  "serverAddress=localhost", "--set", "serverPort=25", "--dry-run", home.path()},
                 environment);
    QFile copy(home.filePath("0001.eml"));
    ASSERT_TRUE(copy.open(QIODevice::ReadOnly)) << (sent.out + sent.err).toStdString();
    const ReceivedMessage message = parseMessage(copy.readAll());
    EXPECT_EQ(message.subject, "Beta & more");
    EXPECT_TRUE(message.parts.value(1).content.contains("<p>Beta</p>"));

    // A browser started with a fixed port is asked on that port, its user data unknown.
    QFile portFile(chromium.profile() + "/DevToolsActivePort");
    ASSERT_TRUE(portFile.open(QIODevice::ReadOnly));
    const QByteArray port = portFile.readLine().trimmed();
    QTemporaryDir root, config;
    writeProcesses(
        root.path(),
        {("99 1 5 chromium chromium chromium --remote-debugging-port=" + port).constData()});
    FrontPageQuery query({root.path(), config.path(), config.path(), false}, nullptr);
    QObject::connect(&query, &FrontPageQuery::finished,
                     [&](const QString& url, const QString& title) { shown = url + ' ' + title; });
    query.start();
    EXPECT_TRUE(eventually([&] { return query.state() == FrontPageQuery::State::Finished; }));
    EXPECT_EQ(shown, base + "beta.html Beta & more");
}

TEST_F(RealBrowser, FirefoxsSelectedTab) {
    HeadlessBrowser firefox(HeadlessBrowser::Kind::FirefoxEsr, base + "beta.html");
    EXPECT_TRUE(shows(base + "beta.html\nBeta & more\n0")) << shown.toStdString();
}

// The Web Page button: the front page's address and title fill the two fields; without one,
// the alert says what to do and the fields keep what they held.
class WebPageButton : public GuiFixture {
protected:
    QString fields() const {
        return child<QLineEdit>("webPageOrFile")->text() + " | " +
               child<QLineEdit>("subject")->text();
    }
    void press() {
        QTest::mouseClick(child<QPushButton>("webPageButton"), Qt::LeftButton);
        ASSERT_TRUE(
            eventually([this] { return child<QPushButton>("webPageButton")->isEnabled(); }));
    }
};

TEST_F(WebPageButton, FillsTheFieldsFromChromium) {
    ServerProcess pages{PELMO_TEST_DIR "/controller/page_server.py",
                        {PELMO_TEST_DATA "/browser/www"}};
    const QString page = QString("http://127.0.0.1:%1/beta.html").arg(pages.port());
    HeadlessBrowser chromium(HeadlessBrowser::Kind::Chromium, page);
    EXPECT_TRUE(eventually([&] {
        press();
        return fields() == page + " | Beta & more";
    })) << fields().toStdString();
}

TEST_F(WebPageButton, AlertsAndKeepsTheFieldsWithoutAPage) {
    QTemporaryDir root;
    writeProcesses(root.path(), {"80 1 8 chromium chromium chromium"});
    pelmo->setFrontPagePlaces({root.path(), root.path(), root.path(), false});
    QTest::keyClicks(child<QLineEdit>("subject"), "Kept");
    press();
    auto* box = asked<QMessageBox>();
    ASSERT_NE(box, nullptr);
    EXPECT_EQ(box->text() + '\n' + box->informativeText(),
              "The front browser web page could not be retreived\n"
              "Please make sure your browser is running and displaying a web page.\n"
              "To let Pelmo read Chromium's page, start it with --remote-debugging-port=9222.");
    box->accept();
    EXPECT_EQ(fields(), " | Kept");
}

} // namespace

int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv);
}
