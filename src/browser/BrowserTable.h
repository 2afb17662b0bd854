#pragma once

#include <QList>
#include <QString>
#include <QStringList>

/** How a browser's front page is read: the family decides the reader. */
enum class BrowserFamily {
    Firefox,  ///< the session store of the profile in use
    Chromium, ///< the DevTools endpoint on 127.0.0.1, when remote debugging is on
};

/** One browser Pelmo can ask for its front page. */
struct BrowserKind {
    QString name; ///< as the user knows it, "Firefox ESR"
    BrowserFamily family;
    QStringList programs; ///< process names (comm, at most 15 bytes) and executable names
    QString folder;       ///< Firefox: its home under $HOME (or, without the dot, under
                          ///< $XDG_CONFIG_HOME); Chromium: its user data under $XDG_CONFIG_HOME
};

/** Every browser Pelmo knows, in no particular order. */
const QList<BrowserKind>& LinuxBrowsers();
/** The browser whose programs include name (a comm or an executable's file name), or null. */
const BrowserKind* BrowserNamed(const QString& program);

/**
 * The orders of preference when no browser window is known to be in front: the first running
 * browser of the list is asked. The two differ on purpose: with Firefox and LibreWolf both
 * running, the title is asked of Firefox and the address of LibreWolf.
 */
const QList<const BrowserKind*>& TitleOrder();
const QList<const BrowserKind*>& URLOrder();
