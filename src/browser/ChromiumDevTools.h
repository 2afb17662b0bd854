#pragma once

#include "browser/FrontPage.h"
#include "browser/RunningBrowsers.h"

#include <QByteArray>
#include <QString>

#include <optional>

/**
 * What a Chromium-family browser tells through its DevTools HTTP endpoint, which it opens on
 * 127.0.0.1 only when started with remote debugging.
 */
class ChromiumDevTools {
public:
    /**
     * The endpoint's port: N of --remote-debugging-port=N when N is not 0, else the first line
     * of DevToolsActivePort in the browser's user data folder (--user-data-dir, else its
     * folder under configHome); 0 when the browser has no endpoint.
     */
    static int port(const RunningBrowser& browser, const QString& configHome);
    /**
     * The front tab from a /json/list reply: the first target of type "page", which Chromium
     * lists most recently activated first. Null, with why, when there is none or the reply is
     * not such a list.
     */
    static std::optional<FrontPage> frontPage(const QByteArray& json, QString* why);
    /** One line telling the user how to start the browser so that Pelmo can read its tab. */
    static QString startHint(const BrowserKind& kind);
};
