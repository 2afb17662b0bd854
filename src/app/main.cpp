#include "app/Commands.h"

#include <QCoreApplication>

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    QCoreApplication::setOrganizationName(QStringLiteral("Orvale Software"));
    QCoreApplication::setApplicationName(QStringLiteral("Pelmo"));
    QCoreApplication::setApplicationVersion(QStringLiteral(PELMO_VERSION));
    return Commands::run(QCoreApplication::arguments().mid(1));
}
