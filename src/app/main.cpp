#include "app/Commands.h"

#include <QGuiApplication>

int main(int argc, char** argv) {
    // Commands run where there may be no display (cron, ssh); the message body still needs
    // Qt's text layout, which the offscreen platform provides.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QGuiApplication app(argc, argv);
    QCoreApplication::setOrganizationName(QStringLiteral("Orvale Software"));
    QCoreApplication::setApplicationName(QStringLiteral("Pelmo"));
    QCoreApplication::setApplicationVersion(QStringLiteral(PELMO_VERSION));
    return Commands::run(QCoreApplication::arguments().mid(1));
}
