#pragma once

#include <QList>

/**
 * The processes owning the desktop's top-level windows, front first: the active window's
 * (_NET_ACTIVE_WINDOW), then the others from the top of the stacking order down
 * (_NET_CLIENT_LIST_STACKING), each by its _NET_WM_PID (EWMH). Empty without an X11 display or a
 * window manager that publishes these; a window without a pid is skipped.
 */
QList<qint64> FrontWindowPids();
