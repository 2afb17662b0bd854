#include "QtTestMain.h"
#include "RowName.h"
#include "browser/ChromiumDevTools.h"
#include "browser/DesktopWindows.h"
#include "browser/FirefoxSession.h"
#include "browser/FrontPageQuery.h"
#include "e2e/E2eSupport.h"
#include "gui/GuiFixture.h"

#include <QDateTime>
#include <QDir>
#include <QFile>

#include <xcb/xcb.h>

namespace {

// A /proc tree of the processes given as "pid parent started comm exe arguments...".
void writeProcesses(const QString& root, const QStringList& processes) {
    for (const QString& line : processes) {
        const QStringList f = line.trimmed().split(' ');
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

QByteArray recorded() {
    QFile file(PELMO_TEST_DATA "/browser/two-windows.jsonlz4");
    EXPECT_TRUE(file.open(QIODevice::ReadOnly));
    return file.readAll();
}

// text as a mozLz4 file whose LZ4 block is one run of literals.
QByteArray mozLz4(const QByteArray& text) {
    QByteArray out("mozLz40\0", 8);
    for (int shift = 0; shift < 32; shift += 8)
        out += char(text.size() >> shift);
    out += char(std::min<qsizetype>(text.size(), 15) << 4);
    for (qsizetype rest = text.size() - 15; rest >= 0; rest -= 255)
        out += char(std::min<qsizetype>(rest, 255));
    return out + text;
}

QString pageText(const std::optional<FrontPage>& page, const QString& why) {
    return page ? page->url + '|' + (page->title.isNull() ? "~" : page->title) : why;
}

QString prefer(const QString& input) {
    QStringList processes = input.split(" ; ");
    QList<qint64> front;
    if (processes[0].startsWith("front="))
        for (const QString& pid : processes.takeFirst().mid(6).split(','))
            front << pid.toLongLong();
    QTemporaryDir root;
    writeProcesses(root.path(), processes);
    const ProcessTable table(root.path());
    const QList<RunningBrowser> running = FindRunningBrowsers(table);
    const auto title = GetRunningBrowserNameScript(running, table, front);
    const auto url = GetRunningBrowserURLScript(running, table, front);
    return QString("title=%1 url=%2")
        .arg(title ? title->process.pid : 0)
        .arg(url ? url->process.pid : 0);
}

QString session(const QString& input) {
    QByteArray file = input.startsWith("recorded") ? recorded() : mozLz4(input.toUtf8());
    const QStringList options =
        input.startsWith("recorded") ? input.split(' ').mid(1) : QStringList();
    for (const QString& option : options) {
        const int at = option.section('=', 1).section(':', 0, 0).toInt();
        const QByteArray bytes = QByteArray::fromHex(option.section(':', 1).toLatin1());
        if (option.startsWith("cut="))
            file = at < 0 ? file.chopped(-at) : file.left(at);
        else
            file.replace(at < 0 ? file.size() / 2 : at, bytes.size(), bytes);
    }
    QString why;
    const QByteArray json = FirefoxSession::decodeMozLz4(file, &why);
    return pageText(json.isNull() ? std::nullopt : FirefoxSession::frontPage(json, &why), why);
}

QString profile(const QString& input) {
    QStringList f = input.split('|');
    for (QString& field : f)
        field =
            field.trimmed()
                .replace("\\n", "\n")
                .replace("@two",
                         "[General]\nStartWithLastProfile=1\n[Profile1]\nName=home\nIsRelative=1\n"
                         "Path=a.home\nDefault=1\n\n[Profile0]\nName=work\nIsRelative=0\nPath=/srv/"
                         "w.work\n");
    QTemporaryDir home;
    for (const auto& [name, text] : {std::pair("profiles.ini", f[0]), {"installs.ini", f[1]}}) {
        QFile file(home.filePath(name));
        EXPECT_TRUE(text.isEmpty() ||
                    (file.open(QIODevice::WriteOnly) && file.write(text.toUtf8())));
    }
    const QStringList files = f[3].split(' ', Qt::SkipEmptyParts);
    for (qsizetype i = 0; i < files.size(); ++i) {
        const QString folder = files[i].section(':', 0, 0);
        QDir(home.path()).mkpath(folder + "/sessionstore-backups");
        QFile file(home.filePath(folder + "/sessionstore-backups/recovery.jsonlz4"));
        EXPECT_TRUE(files[i].contains(':')
                        ? QFile::link("127.0.0.1:" + files[i].section(':', 1),
                                      home.filePath(folder + "/lock"))
                        : file.open(QIODevice::WriteOnly) && file.write(recorded()) > 0 &&
                              file.flush() &&
                              file.setFileTime(QDateTime::currentDateTime().addSecs(i * 60),
                                               QFileDevice::FileModificationTime));
    }
    QString why;
    const QString folder = FirefoxSession::profileFolder(home.path(), f[2].split(' '), 4242, &why);
    const auto page = folder.isNull() ? std::nullopt : FirefoxSession::read(folder, &why);
    QString found = folder.isNull() ? why : page ? folder + ' ' + page->title : folder;
    return found.replace(home.path(), "~");
}

struct Row {
    std::string name;
    QString reader, input, gives;
};

std::vector<Row> rows() {
    QFile data(PELMO_TEST_DATA "/browser/reads.txt");
    EXPECT_TRUE(data.open(QIODevice::ReadOnly));
    std::vector<Row> rows;
    for (const QString& line : QString::fromUtf8(data.readAll()).split('\n')) {
        const QStringList words = line.section(" => ", 0, 0).split(' ', Qt::SkipEmptyParts);
        if (!line.isEmpty() && !line.startsWith('#'))
            rows.push_back({words[0].toStdString(), words[1],
                            line.section(" => ", 0, 0).section(words[1], 1).trimmed(),
                            line.section(" => ", 1)});
    }
    return rows;
}

class Reads : public ::testing::TestWithParam<Row> {};

TEST_P(Reads, Give) {
    const Row& row = GetParam();
    QString why;
    const QString given =
        row.reader == "prefer"    ? prefer(row.input)
        : row.reader == "session" ? session(row.input)
        : row.reader == "profile"
            ? profile(row.input)
            : pageText(ChromiumDevTools::frontPage(row.input.toUtf8(), &why), why);
    EXPECT_EQ(given.toStdString(), row.gives.toStdString());
}

INSTANTIATE_TEST_SUITE_P(Browsers, Reads, ::testing::ValuesIn(rows()), RowName());

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

// pelmo front-page and the window's Web Page button, which fills the web page field and the
// subject, or alerts and keeps what they held.
class FrontPage : public GuiFixture {
protected:
    ServerProcess pages{PELMO_TEST_DIR "/controller/page_server.py",
                        {PELMO_TEST_DATA "/browser/www"}};
    const QString base = QString("http://127.0.0.1:%1/").arg(pages.port());
    QString shown;
    bool shows(const QString& expected) {
        return waitUntil([&] { return (shown = frontPage()) == expected; }, 15000);
    }
    QString pressed() {
        QTest::mouseClick(child<QPushButton>("webPageButton"), Qt::LeftButton);
        EXPECT_TRUE(waitUntil([this] { return child<QPushButton>("webPageButton")->isEnabled(); }));
        return child<QLineEdit>("webPageOrFile")->text() + " | " +
               child<QLineEdit>("subject")->text();
    }
};

TEST_F(FrontPage, FromChromium) {
    HeadlessBrowser chromium(HeadlessBrowser::Kind::Chromium, {base + "alpha.html"});
    EXPECT_TRUE(shows(base + "alpha.html\nAlpha page\n0")) << shown.toStdString();
    EXPECT_EQ(pressed(), base + "alpha.html | Alpha page");
    // A new tab comes to the front, its title given HTML-escaped by Chromium.
    chromium.openTab(base + "beta.html");
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
    QFile port(chromium.profile() + "/DevToolsActivePort");
    ASSERT_TRUE(port.open(QIODevice::ReadOnly));
    QTemporaryDir root;
    writeProcesses(root.path(), {"99 1 5 chromium chromium chromium --remote-debugging-port=" +
                                 port.readLine().trimmed()});
    pelmo->setFrontPagePlaces({root.path(), root.path(), root.path(), false});
    EXPECT_EQ(pressed(), base + "beta.html | Beta & more");
}

TEST_F(FrontPage, FromFirefox) {
    HeadlessBrowser firefox(HeadlessBrowser::Kind::FirefoxEsr,
                            {base + "beta.html", base + "alpha.html"});
    EXPECT_TRUE(shows(base + "beta.html\nBeta & more\n0")) << shown.toStdString();
}

TEST_F(FrontPage, AlertWithoutAPage) {
    QTemporaryDir root;
    writeProcesses(root.path(), {"80 1 8 chromium chromium chromium"});
    pelmo->setFrontPagePlaces({root.path(), root.path(), root.path(), false});
    QTest::keyClicks(child<QLineEdit>("subject"), "Kept");
    EXPECT_EQ(pressed(), " | Kept");
    auto* box = asked<QMessageBox>();
    ASSERT_NE(box, nullptr);
    EXPECT_EQ(box->text() + '\n' + box->informativeText(),
              "The front browser web page could not be retreived\n"
              "Please make sure your browser is running and displaying a web page.\n"
              "To let Pelmo read Chromium's page, start it with --remote-debugging-port=9222.");
    box->accept();
}

} // namespace

int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv);
}
