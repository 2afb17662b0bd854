#include "gui/AboutDialog.h"

#include "util/LocalizedStrings.h"

#include <QApplication>
#include <QDialogButtonBox>
#include <QIcon>
#include <QLabel>
#include <QSqlDatabase>
#include <QSqlQuery>
#include <QSslSocket>
#include <QStyle>
#include <QUuid>
#include <QVBoxLayout>

#include <gmime/gmime.h>
#include <lz4.h>

namespace {

// The SQLite behind Qt's driver, which may not be the one Qt was built with; asked of a
// throw-away in-memory database under a name of its own so as not to touch the address book's.
QString sqliteVersion() {
    const QString name = QUuid::createUuid().toString();
    QString version;
    {
        QSqlDatabase db = QSqlDatabase::addDatabase(QStringLiteral("QSQLITE"), name);
        db.setDatabaseName(QStringLiteral(":memory:"));
        if (db.open()) {
            QSqlQuery query(QStringLiteral("SELECT sqlite_version()"), db);
            if (query.next())
                version = query.value(0).toString();
        }
    }
    QSqlDatabase::removeDatabase(name);
    return version.isEmpty() ? LocalizedStringNS("not available") : version;
}

QString libraryLine(const char* name, const QString& version) {
    return QLatin1String(name) + QLatin1Char(' ') + version;
}

// "Name version" lines, one per library.
QStringList libraryVersions() {
    const QString openSsl = QSslSocket::sslLibraryVersionString();
    return {
        libraryLine("Qt", QString::fromLatin1(qVersion())) +
            (qstrcmp(qVersion(), QT_VERSION_STR) == 0
                 ? QString()
                 : LocalizedStringNS(" (built with %1)").arg(QLatin1String(QT_VERSION_STR))),
        libraryLine("QtKeychain", QStringLiteral(PELMO_QTKEYCHAIN_VERSION)),
        // Qt names the library in its version string ("OpenSSL 3.0.15 3 Sep 2024").
        openSsl.isEmpty() ? LocalizedStringNS("OpenSSL not available") : openSsl,
        libraryLine("SQLite", sqliteVersion()),
        libraryLine("GMime", QStringLiteral("%1.%2.%3")
                                 .arg(gmime_major_version)
                                 .arg(gmime_minor_version)
                                 .arg(gmime_micro_version)),
        libraryLine("libplist", QStringLiteral(PELMO_PLIST_VERSION)),
        libraryLine("liblz4", QString::fromLatin1(LZ4_versionString())),
        libraryLine("libxcb", QStringLiteral(PELMO_XCB_VERSION)),
    };
}

} // namespace

AboutDialog::AboutDialog(QWidget* parent) : QDialog(parent) {
    setWindowTitle(LocalizedStringNS("About Pelmo"));
    auto* icon = new QLabel;
    icon->setPixmap(QIcon::fromTheme(QStringLiteral("pelmo"),
                                     qApp->style()->standardIcon(QStyle::SP_DesktopIcon))
                        .pixmap(64, 64));
    icon->setAlignment(Qt::AlignHCenter);
    auto* version =
        new QLabel(QStringLiteral("<b>Pelmo %1</b>").arg(QStringLiteral(PELMO_VERSION)));
    version->setObjectName(QStringLiteral("aboutVersion"));
    version->setAlignment(Qt::AlignHCenter);
    auto* description =
        new QLabel(LocalizedStringNS("Mails one message to many people, each their own copy."));
    auto* licence = new QLabel(LocalizedStringNS(
        "Pelmo is free software under the <a "
        "href=\"https://www.gnu.org/licenses/gpl-3.0.html\">GNU General Public License</a>, "
        "version 3 or later. It comes with no warranty."));
    licence->setOpenExternalLinks(true);
    licence->setWordWrap(true);
    auto* libraries = new QLabel(LocalizedStringNS("Runs with:") + QLatin1Char('\n') +
                                 libraryVersions().join(QLatin1Char('\n')));
    libraries->setObjectName(QStringLiteral("aboutLibraries"));
    libraries->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);

    auto* layout = new QVBoxLayout(this);
    for (QWidget* widget : {static_cast<QWidget*>(icon), static_cast<QWidget*>(version),
                            static_cast<QWidget*>(description), static_cast<QWidget*>(licence),
                            static_cast<QWidget*>(libraries), static_cast<QWidget*>(buttons)})
        layout->addWidget(widget);
    setAttribute(Qt::WA_DeleteOnClose);
}
