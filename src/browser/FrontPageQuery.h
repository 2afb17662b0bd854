#pragma once

#include "browser/FrontPage.h"
#include "browser/RunningBrowsers.h"

#include <QObject>
#include <QString>

#include <chrono>
#include <optional>

class PageDownload;

/**
 * One question to the browsers: which page is in front? The browser owning the frontmost
 * browser window is asked, else the preferred running one (a title and an address may come
 * from two browsers, as the orders of preference say). Firefox's session file is read at
 * once; a Chromium browser is asked over its DevTools endpoint on 127.0.0.1 without blocking.
 * finished() comes once, on the main loop, never from inside start(), at the latest after the
 * time-out. Main thread only.
 */
class FrontPageQuery : public QObject {
    Q_OBJECT

public:
    enum class State {
        Idle,     ///< start() not yet called
        Asking,   ///< a browser's answer is awaited
        Finished, ///< finished() was emitted
    };
    Q_ENUM(State)

    /** Where the browsers and their files are found; tests hand in a tree of their own. */
    struct Places {
        QString procRoot = QStringLiteral("/proc");
        QString home;               ///< the user's home; Firefox's profiles are under it
        QString configHome;         ///< $XDG_CONFIG_HOME; Chromium's user data folders are under it
        bool desktopWindows = true; ///< ask the X11 window manager which window is in front
        std::chrono::milliseconds timeout{2000};
    };

    /** Asks the user's own browsers. */
    explicit FrontPageQuery(QObject* parent = nullptr);
    FrontPageQuery(Places places, QObject* parent);

    void start();
    State state() const { return m_state; }

Q_SIGNALS:
    /**
     * url is the front page's address, null when there is none (no browser, no readable
     * answer, or a tab that shows no web page); title is null when unknown. hint is a line
     * telling the user how to let Pelmo read the browser, or empty; why says what went wrong,
     * for the log, or is empty.
     */
    void finished(const QString& url, const QString& title, const QString& hint,
                  const QString& why);

private:
    struct Answer {
        std::optional<RunningBrowser> browser;
        std::optional<FrontPage> page;
        QString why;
        bool pending = false;
    };
    void ask(Answer& answer);
    void answered();
    /** The same browser answers for the title and the address: it is asked once. */
    bool askedOnce() const;

    Places m_places;
    State m_state = State::Idle;
    Answer m_url, m_title;
    QString m_hint;
};
