#include "browser/FrontPageQuery.h"

#include "browser/ChromiumDevTools.h"
#include "browser/DesktopWindows.h"
#include "browser/FirefoxSession.h"
#include "browser/PageDownload.h"

#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>
#include <QTimer>

namespace {

FrontPageQuery::Places usersPlaces() {
    FrontPageQuery::Places places;
    places.home = QDir::homePath();
    places.configHome = QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation);
    return places;
}

bool isWebAddress(const QString& url) {
    return url.startsWith(QLatin1String("http://"), Qt::CaseInsensitive) ||
           url.startsWith(QLatin1String("https://"), Qt::CaseInsensitive);
}

} // namespace

FrontPageQuery::FrontPageQuery(QObject* parent) : FrontPageQuery(usersPlaces(), parent) {}

FrontPageQuery::FrontPageQuery(Places places, QObject* parent)
    : QObject(parent), m_places(std::move(places)) {}

void FrontPageQuery::start() {
    m_state = State::Asking;
    const ProcessTable processes(m_places.procRoot);
    const QList<RunningBrowser> running = FindRunningBrowsers(processes);
    const QList<qint64> front =
        m_places.desktopWindows && !running.isEmpty() ? FrontWindowPids() : QList<qint64>();
    m_url.browser = GetRunningBrowserURLScript(running, processes, front);
    m_title.browser = GetRunningBrowserNameScript(running, processes, front);
    if (!m_url.browser)
        m_url.why = QStringLiteral("no web browser is running");
    else
        ask(m_url);
    // One browser answers both questions once.
    if (m_title.browser && !askedOnce())
        ask(m_title);
    // Answers read at once are given on the main loop, as the ones that come later are.
    QTimer::singleShot(0, this, &FrontPageQuery::answered);
}

void FrontPageQuery::ask(Answer& answer) {
    const RunningBrowser& browser = *answer.browser;
    const QString name = browser.kind->name;
    if (browser.kind->family == BrowserFamily::Firefox) {
        QString why;
        // Newer releases keep the profiles under $XDG_CONFIG_HOME, without the leading dot.
        QString home = QDir(m_places.home).filePath(browser.kind->folder);
        if (!QFileInfo::exists(home + QLatin1String("/profiles.ini")))
            home = QDir(m_places.configHome).filePath(browser.kind->folder.mid(1));
        const QString profile = FirefoxSession::profileFolder(home, browser.process.arguments,
                                                              browser.process.pid, &why);
        if (!profile.isEmpty())
            answer.page = FirefoxSession::read(profile, &why);
        if (!answer.page)
            answer.why = name + QStringLiteral(": ") + why;
        return;
    }
    const int port = ChromiumDevTools::port(browser, m_places.configHome);
    if (port == 0) {
        answer.why = name + QStringLiteral(" was not started with remote debugging");
        m_hint = ChromiumDevTools::startHint(*browser.kind);
        return;
    }
    answer.pending = true;
    auto* download = new PageDownload(this);
    connect(
        download, &PageDownload::finished, this,
        [this, &answer, download, name, port](const QString& text, const QString& error) {
            download->deleteLater();
            answer.pending = false;
            QString why =
                QStringLiteral("no answer from DevTools on 127.0.0.1:%1 (%2)").arg(port).arg(error);
            if (!text.isNull())
                answer.page = ChromiumDevTools::frontPage(text.toUtf8(), &why);
            if (!answer.page)
                answer.why = name + QStringLiteral(": ") + why;
            answered();
        });
    download->start(QStringLiteral("http://127.0.0.1:%1/json/list").arg(port), m_places.timeout);
}

bool FrontPageQuery::askedOnce() const {
    return m_title.browser && m_url.browser &&
           m_title.browser->process.pid == m_url.browser->process.pid;
}

void FrontPageQuery::answered() {
    if (m_state != State::Asking || m_url.pending || m_title.pending)
        return;
    m_state = State::Finished;
    if (askedOnce())
        m_title = m_url;
    QString url = m_url.page ? m_url.page->url : QString();
    QString why = m_url.why;
    if (!url.isNull() && !isWebAddress(url)) {
        why = QStringLiteral("the front tab shows %1, not a web page").arg(url.left(80));
        url = QString();
    }
    if (why.isEmpty() && m_title.browser && !m_title.page)
        why = m_title.why;
    Q_EMIT finished(url, m_title.page ? m_title.page->title : QString(),
                    url.isNull() ? m_hint : QString(), why);
}
