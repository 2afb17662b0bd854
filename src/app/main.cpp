#include "app/Commands.h"
#include "app/WindowMode.h"
#include "util/AppIdentity.h"

#include <QApplication>
#include <QGuiApplication>

#include <cstring>
#include <memory>

namespace {

void nameApplication() {
    QCoreApplication::setOrganizationName(QString::fromLatin1(kOrganisationName));
    QCoreApplication::setApplicationName(QString::fromLatin1(kApplicationName));
    QCoreApplication::setApplicationVersion(QStringLiteral(PELMO_VERSION));
}

} // namespace

int main(int argc, char** argv) {
    if (argc <= 1) {
        QApplication app(argc, argv);
        nameApplication();
        QGuiApplication::setDesktopFileName(QStringLiteral("pelmo"));
        return runWindow();
    }
    // A mailing run lays its message body out with Qt's GUI text classes; on the offscreen
    // platform that needs no display, so it runs from cron and ssh too. The other commands
    // need no GUI at all.
    std::unique_ptr<QCoreApplication> app;
    if (std::strcmp(argv[1], "send") == 0) {
        if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
            qputenv("QT_QPA_PLATFORM", "offscreen");
        app = std::make_unique<QGuiApplication>(argc, argv);
    } else {
        app = std::make_unique<QCoreApplication>(argc, argv);
    }
    nameApplication();
    return Commands::run(QCoreApplication::arguments().mid(1));
}
