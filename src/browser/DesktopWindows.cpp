#include "browser/DesktopWindows.h"

#include <xcb/xcb.h>

#include <cstdlib>
#include <cstring>
#include <memory>

namespace {

using Reply = std::unique_ptr<xcb_get_property_reply_t, decltype(&std::free)>;

xcb_atom_t atom(xcb_connection_t* connection, const char* name) {
    const xcb_intern_atom_cookie_t cookie =
        xcb_intern_atom(connection, 1, static_cast<uint16_t>(strlen(name)), name);
    std::unique_ptr<xcb_intern_atom_reply_t, decltype(&std::free)> reply(
        xcb_intern_atom_reply(connection, cookie, nullptr), std::free);
    return reply ? reply->atom : xcb_atom_t{XCB_ATOM_NONE};
}

// The 32-bit values of a window's property of the given type; none when it is missing.
QList<quint32> values(xcb_connection_t* connection, xcb_window_t window, xcb_atom_t property,
                      xcb_atom_t type) {
    QList<quint32> result;
    if (property == XCB_ATOM_NONE)
        return result;
    const Reply reply(
        xcb_get_property_reply(
            connection, xcb_get_property(connection, 0, window, property, type, 0, 4096), nullptr),
        std::free);
    if (!reply || reply->format != 32)
        return result;
    const auto* data = static_cast<const quint32*>(xcb_get_property_value(reply.get()));
    const int count = xcb_get_property_value_length(reply.get()) / 4;
    for (int i = 0; i < count; ++i)
        result.append(data[i]);
    return result;
}

} // namespace

QList<qint64> FrontWindowPids() {
    QList<qint64> pids;
    if (!std::getenv("DISPLAY"))
        return pids;
    std::unique_ptr<xcb_connection_t, decltype(&xcb_disconnect)> connection(
        xcb_connect(nullptr, nullptr), xcb_disconnect);
    if (xcb_connection_has_error(connection.get()))
        return pids;
    xcb_connection_t* x = connection.get();
    const xcb_screen_t* screen = xcb_setup_roots_iterator(xcb_get_setup(x)).data;
    if (!screen)
        return pids;
    QList<quint32> windows =
        values(x, screen->root, atom(x, "_NET_ACTIVE_WINDOW"), XCB_ATOM_WINDOW);
    const QList<quint32> stacking =
        values(x, screen->root, atom(x, "_NET_CLIENT_LIST_STACKING"), XCB_ATOM_WINDOW);
    for (auto it = stacking.crbegin(); it != stacking.crend(); ++it)
        windows.append(*it);
    const xcb_atom_t wmPid = atom(x, "_NET_WM_PID");
    for (quint32 window : windows) {
        const QList<quint32> pid = values(x, window, wmPid, XCB_ATOM_CARDINAL);
        if (!pid.isEmpty() && !pids.contains(pid.first()))
            pids.append(pid.first());
    }
    return pids;
}
