#include "browser/BrowserTable.h"

const QList<BrowserKind>& LinuxBrowsers() {
    static const QList<BrowserKind> browsers = {
        {"Chromium", BrowserFamily::Chromium, {"chromium", "chromium-browse"}, "chromium"},
        {"Google Chrome", BrowserFamily::Chromium, {"chrome", "google-chrome"}, "google-chrome"},
        {"Firefox", BrowserFamily::Firefox, {"firefox", "firefox-bin"}, ".mozilla/firefox"},
        {"Firefox ESR", BrowserFamily::Firefox, {"firefox-esr"}, ".mozilla/firefox"},
        {"Vivaldi", BrowserFamily::Chromium, {"vivaldi-bin", "vivaldi"}, "vivaldi"},
        {"Brave",
         BrowserFamily::Chromium,
         {"brave", "brave-browser"},
         "BraveSoftware/Brave-Browser"},
        {"Microsoft Edge", BrowserFamily::Chromium, {"msedge", "microsoft-edge"}, "microsoft-edge"},
        {"LibreWolf", BrowserFamily::Firefox, {"librewolf"}, ".librewolf"},
    };
    return browsers;
}

const BrowserKind* BrowserNamed(const QString& program) {
    for (const BrowserKind& kind : LinuxBrowsers())
        if (kind.programs.contains(program))
            return &kind;
    return nullptr;
}

namespace {

QList<const BrowserKind*> inOrder(std::initializer_list<const char*> names) {
    QList<const BrowserKind*> order;
    for (const char* name : names)
        for (const BrowserKind& kind : LinuxBrowsers())
            if (kind.name == QLatin1String(name))
                order.append(&kind);
    return order;
}

} // namespace

// The Chromium pair, Firefox, the other Chromium browsers and LibreWolf, as the Mac original
// had Safari, Firefox, OmniWeb, Internet Explorer and Camino; Firefox moves to the end of the
// address order as it did there.
const QList<const BrowserKind*>& TitleOrder() {
    static const QList<const BrowserKind*> order =
        inOrder({"Chromium", "Google Chrome", "Firefox", "Firefox ESR", "Vivaldi", "Brave",
                 "Microsoft Edge", "LibreWolf"});
    return order;
}

const QList<const BrowserKind*>& URLOrder() {
    static const QList<const BrowserKind*> order =
        inOrder({"Chromium", "Google Chrome", "Vivaldi", "Brave", "Microsoft Edge", "LibreWolf",
                 "Firefox", "Firefox ESR"});
    return order;
}
