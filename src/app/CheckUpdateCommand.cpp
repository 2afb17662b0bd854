#include "app/Commands.h"

#include "update/SoftwareUpdateController.h"
#include "util/CLog.h"

#include <QCoreApplication>
#include <QTextStream>

namespace Commands {

int checkUpdate(const QStringList& args) {
    if (!args.isEmpty()) {
        const bool help = args == QStringList{QStringLiteral("--help")};
        QTextStream(help ? stdout : stderr) << "usage: pelmo check-update\n"
                                               "  asks whether a newer Pelmo has been published\n";
        return help ? 0 : 2;
    }
    StartLogging();
    SoftwareUpdateController update;
    QObject::connect(&update, &SoftwareUpdateController::statusChanged,
                     [](const QString& text) { QTextStream(stdout) << text << Qt::endl; });
    QObject::connect(&update, &SoftwareUpdateController::checkFinished,
                     [](bool ok) { QCoreApplication::exit(ok ? 0 : 1); });
    QMetaObject::invokeMethod(&update, &SoftwareUpdateController::checkVersion,
                              Qt::QueuedConnection);
    const int status = QCoreApplication::exec();
    StopLogging();
    return status;
}

} // namespace Commands
