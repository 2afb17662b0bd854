#include "gui/HelpPage.h"

#include "gui/AlertBox.h"
#include "util/LocalizedStrings.h"

#include <QCoreApplication>
#include <QDesktopServices>
#include <QDir>
#include <QFileInfo>
#include <QUrl>

void openHelp(QWidget* window) {
    // Relative to the program, so that a package under /usr and `make install` under
    // /usr/local both find their own copy.
    const QString readme = QDir::cleanPath(QCoreApplication::applicationDirPath() +
                                           QStringLiteral("/" PELMO_HELP_FILE));
    if (!QFileInfo(readme).isFile()) {
        openAlert(window, LocalizedStringNS("Pelmo's help is not installed here."),
                  LocalizedStringNS("It is the file README.md of Pelmo's sources, which the "
                                    "Debian package installs as %1.")
                      .arg(QStringLiteral(PELMO_PACKAGE_HELP_FILE)));
        return;
    }
    if (!QDesktopServices::openUrl(QUrl::fromLocalFile(readme)))
        openAlert(window, LocalizedStringNS("No application could open Pelmo's help."),
                  LocalizedStringNS("It is the file %1.").arg(readme));
}
