#pragma once

#include "browser/BrowserTable.h"
#include "browser/ProcessTable.h"

#include <QList>

#include <optional>

/** A browser's main process: the one whose front page is asked for. */
struct RunningBrowser {
    const BrowserKind* kind = nullptr;
    ProcessTable::Process process;
};

/**
 * The browsers' main processes in the table, the latest started first. A browser's helpers
 * (Chromium's renderers and zygotes, Firefox's content processes) are its children of the same
 * browser and are left out.
 */
QList<RunningBrowser> FindRunningBrowsers(const ProcessTable& processes);

/**
 * The browser to ask for the front page's title: the one owning the frontmost window of
 * frontPids (the owners of the desktop's windows, front first) that is a running browser's or
 * its child's, else the first running browser of TitleOrder(); null when none runs.
 */
std::optional<RunningBrowser> GetRunningBrowserNameScript(const QList<RunningBrowser>& running,
                                                          const ProcessTable& processes,
                                                          const QList<qint64>& frontPids);
/** The browser to ask for the front page's address: likewise, with URLOrder(). */
std::optional<RunningBrowser> GetRunningBrowserURLScript(const QList<RunningBrowser>& running,
                                                         const ProcessTable& processes,
                                                         const QList<qint64>& frontPids);
