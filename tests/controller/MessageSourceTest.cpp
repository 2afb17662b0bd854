#include "ControllerFixture.h"

#include "relink/browser/FrontBrowser.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>

namespace {

// A folder of pages served on 127.0.0.1 (page_server.py); it stops with the test, or by itself.
class PageServer {
public:
    explicit PageServer(const QString& root) {
        server.setProgram(QStringLiteral(PELMO_PYTHON3));
        server.setArguments({QStringLiteral("-u"),
                             QStringLiteral(PELMO_TEST_DIR "/controller/page_server.py"), root});
        server.start();
        static const QRegularExpression serving(QStringLiteral(R"(port (\d+))"));
        QByteArray said;
        while (server.waitForReadyRead(5000)) {
            said += server.readAllStandardOutput();
            const QRegularExpressionMatch match = serving.match(QString::fromLatin1(said));
            if (match.hasMatch()) {
                port = match.captured(1).toInt();
                break;
            }
        }
    }
    ~PageServer() {
        server.closeWriteChannel(); // the server stops when its input closes
        if (!server.waitForFinished(3000))
            server.kill();
        server.waitForFinished();
    }
    QString url(const QString& path) const {
        return QStringLiteral("http://127.0.0.1:%1/%2").arg(port).arg(path);
    }

    QProcess server;
    int port = 0;
};

class MessageSource : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        QDir(folder.path()).mkpath(QStringLiteral("site/dir"));
        write("site/dir/page.html",
              "<p>Hi {toName}</p><img src=\"img/a.gif\"><a href='../up.html'>up</a>");
        write("site/dir/index.html", "<p>index</p>");
        write("site/dir/latin.html", "<meta charset=\"iso-8859-1\"><p>caf\xe9</p>");
        write("site/dir/roman.html", "<p>caf\x8e</p>");
        server = std::make_unique<PageServer>(folder.filePath(QStringLiteral("site")));
        ASSERT_NE(server->port, 0) << "the page server did not start";
    }
    void write(const char* path, const QByteArray& bytes) {
        QFile file(folder.filePath(QLatin1String(path)));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
    }

    std::unique_ptr<PageServer> server;
};

TEST_F(MessageSource, FetchesLowerCasedAndRelinksAgainstTheAddressAsTyped) {
    const QString typed = QStringLiteral("HTTP://127.0.0.1:%1/Dir/Page.HTML").arg(server->port);
    view.pageText = typed;
    const QString page = controller->getWebPageOrFile();
    const QString lower = typed.toLower();
    EXPECT_EQ(view.statuses, (QStringList{QStringLiteral("Downloading \"%1\"").arg(lower),
                                          QStringLiteral("Relinking web page...")}));
    EXPECT_TRUE(page.contains(
        QStringLiteral("src=\"http://127.0.0.1:%1/Dir/img/a.gif\"").arg(server->port)))
        << page.toStdString();
    EXPECT_TRUE(
        page.contains(QStringLiteral("href='http://127.0.0.1:%1/up.html'").arg(server->port)));
}

TEST_F(MessageSource, FailuresAndNonPagesGiveNoPage) {
    view.pageText = server->url(QStringLiteral("dir/missing.html"));
    EXPECT_TRUE(controller->getWebPageOrFile().isNull());
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Could not download \"%1\"").arg(view.pageText));

    view.statuses.clear();
    for (const QString& notAPage :
         {QString(), QStringLiteral("/home/me/page.html"), QStringLiteral("ftp://h/x")}) {
        view.pageText = notAPage;
        EXPECT_TRUE(controller->getWebPageOrFile().isNull());
    }
    EXPECT_TRUE(view.statuses.isEmpty());

    // Nothing listens on the port any more: a refused connection is a failed download.
    const QString gone = server->url(QStringLiteral("dir/page.html"));
    server.reset();
    QString why;
    EXPECT_TRUE(DownloadURL(gone, std::chrono::seconds(5), &why).isNull());
    EXPECT_FALSE(why.isEmpty());
}

TEST_F(MessageSource, DecodesUtf8ThenTheDeclaredCharsetThenMacRoman) {
    EXPECT_EQ(DownloadURL(server->url(QStringLiteral("dir/latin.html"))),
              QString::fromUtf8("<meta charset=\"iso-8859-1\"><p>caf\u00e9</p>"));
    EXPECT_EQ(DownloadURL(server->url(QStringLiteral("dir/roman.html"))),
              QString::fromUtf8("<p>caf\u00e9</p>"));
    // The server answers /dir with a redirect to /dir/, which is followed.
    EXPECT_EQ(DownloadURL(server->url(QStringLiteral("dir"))), QStringLiteral("<p>index</p>"));
}

TEST_F(MessageSource, EveryCopyGetsItsOwnTags) {
    set("senderEmail", QStringLiteral("me@example.org"));
    set("senderName", QStringLiteral("Me"));
    view.pageText = server->url(QStringLiteral("dir/page.html"));
    view.buttonTitle = QStringLiteral("Stop"); // a Stop press still fetches the page, then stops
    controller->send();
    view.toText = QStringLiteral("ann@example.org");
    view.nameText = QStringLiteral("Ann");
    EXPECT_TRUE(controller->getWebPageOrFileContents().startsWith(QStringLiteral("<p>Hi Ann</p>")));
    view.nameText = QStringLiteral("Bob");
    EXPECT_TRUE(controller->getWebPageOrFileContents().startsWith(QStringLiteral("<p>Hi Bob</p>")));
    view.pageText.clear();
    view.buttonTitle = QStringLiteral("Stop");
    controller->send();
    EXPECT_TRUE(controller->getWebPageOrFileContents().isNull());
}

} // namespace
