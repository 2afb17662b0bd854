#include "app/Commands.h"
#include "app/WindowMode.h"
#include "util/Translations.h"

#include <QCoreApplication>
#include <QGuiApplication>

#include <cstring>
#include <memory>

#include <fontconfig/fontconfig.h>
#include <malloc.h>
#include <strings.h>

int main(int argc, char** argv) {
    // A mailing run builds each copy (megabytes with a large attachment) on a worker thread
    // and sends it from this one. Left to adapt, glibc maps such buffers afresh for each copy
    // and the kernel zeroes every page again, half a second per hundred copies of a 1 MB
    // file; these fixed thresholds, the largest its adaptation reaches, keep them for reuse.
    mallopt(M_MMAP_THRESHOLD, 32 * 1024 * 1024);
    mallopt(M_TRIM_THRESHOLD, 64 * 1024 * 1024);
    // A link (any letter case, so that the controller can refuse one it does not take) opens
    // the window as no argument does.
    if (argc <= 1 || strncasecmp(argv[1], "mailto:", 7) == 0)
        return startWindow(argc, argv, argc > 1 ? QString::fromLocal8Bit(argv[1]) : QString());
    // A mailing run lays its message body out with Qt's GUI text classes; on the offscreen
    // platform that needs no display, so it runs from cron and ssh too. The other commands
    // need no GUI at all.
    // A command's loop serves no desktop: Qt's own dispatcher, which wakes itself once per
    // loop turn where GLib's writes its eventfd for every posted event, takes a third fewer
    // system calls a mailed copy. Programs the command starts keep the user's environment.
    const bool ownDispatcher = qEnvironmentVariableIsEmpty("QT_NO_GLIB");
    if (ownDispatcher)
        qputenv("QT_NO_GLIB", "1");
    std::unique_ptr<QCoreApplication> app;
    if (std::strcmp(argv[1], "send") == 0) {
        if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
            qputenv("QT_QPA_PLATFORM", "offscreen");
        app = std::make_unique<QGuiApplication>(argc, argv);
    } else {
        app = std::make_unique<QCoreApplication>(argc, argv);
    }
    if (ownDispatcher)
        qunsetenv("QT_NO_GLIB");
    nameApplication();
    installTranslations(QLocale::system());
    const int status = Commands::run(QCoreApplication::arguments().mid(1));
    // Qt's font database on the offscreen platform ends by destroying fontconfig's current
    // configuration, which loads the whole of it first when no font was ever asked for: a
    // third of a one-copy run's work. An empty one, made current, is what it destroys instead.
    if (qobject_cast<QGuiApplication*>(app.get()))
        FcConfigSetCurrent(FcConfigCreate());
    return status;
}
