#include "app/Commands.h"
#include "app/WindowMode.h"

#include <QApplication>
#include <QGuiApplication>

namespace {

void nameApplication() {
    QCoreApplication::setOrganizationName(QStringLiteral("Orvale Software"));
    QCoreApplication::setApplicationName(QStringLiteral("Pelmo"));
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
    // Commands run where there may be no display (cron, ssh); the message body still needs
    // Qt's text layout, which the offscreen platform provides.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QGuiApplication app(argc, argv);
    nameApplication();
    return Commands::run(QCoreApplication::arguments().mid(1));
}
