#include "gui/ContactFiles.h"

#include "addressbook/AddressBook.h"
#include "addressbook/ImportError.h"
#include "gui/AlertBox.h"
#include "util/LocalizedStrings.h"

#include <QFileDialog>
#include <QFileInfo>
#include <QMessageBox>
#include <QStandardPaths>

namespace {

QFileDialog* fileDialog(QWidget* parent, const QString& title) {
    auto* dialog = new QFileDialog(parent, title,
                                   QStandardPaths::writableLocation(QStandardPaths::HomeLocation));
    dialog->setObjectName(QStringLiteral("contactsFileDialog"));
    dialog->setWindowModality(Qt::WindowModal);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    return dialog;
}

} // namespace

bool ContactFiles::isContactsFile(const QString& path) {
    const QString suffix = QFileInfo(path).suffix().toLower();
    return suffix == QLatin1String("vcf") || suffix == QLatin1String("vcard") ||
           suffix == QLatin1String("csv");
}

void ContactFiles::chooseAndImport(QWidget* parent, AddressBook& book,
                                   const std::function<void()>& done) {
    QFileDialog* dialog = fileDialog(parent, LocalizedStringNS("Import Contacts"));
    dialog->setFileMode(QFileDialog::ExistingFiles);
    dialog->setNameFilters(
        {LocalizedStringNS("Contacts (*.vcf *.vcard *.csv)"), LocalizedStringNS("All files (*)")});
    QObject::connect(dialog, &QFileDialog::filesSelected, parent,
                     [parent, &book, done](const QStringList& paths) {
                         importFiles(parent, book, paths, done);
                     });
    dialog->open();
}

void ContactFiles::importFiles(QWidget* parent, AddressBook& book, const QStringList& paths,
                               const std::function<void()>& done) {
    QStringList headlines;
    QStringList details;
    for (const QString& path : paths) {
        const QString name = QFileInfo(path).fileName();
        try {
            const ImportSummary summary = book.importFile(path);
            headlines << summary.headline(name);
            for (const QString& line : summary.skippedLines())
                details << name + QLatin1String(", ") + line;
        } catch (const PelmoException& failure) {
            // One unreadable file leaves the others imported.
            headlines << LocalizedStringNS("%1 was not imported: %2").arg(name, failure.reason());
        }
    }
    done();
    auto* box = new QMessageBox(QMessageBox::Information, LocalizedStringNS("Import Contacts"),
                                headlines.join(QLatin1Char('\n')), QMessageBox::Ok, parent);
    box->setObjectName(QStringLiteral("importSummary"));
    if (!details.isEmpty()) {
        box->setInformativeText(details.size() == 1
                                    ? LocalizedStringNS("1 value was left out; see Show Details.")
                                    : LocalizedStringNS("%1 values were left out; see Show "
                                                        "Details.")
                                          .arg(details.size()));
        box->setDetailedText(details.join(QLatin1Char('\n')));
    }
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->open();
}

void ContactFiles::chooseAndExport(QWidget* parent, const AddressBook& book,
                                   const QString& groupName) {
    QFileDialog* dialog =
        fileDialog(parent, groupName.isNull() ? LocalizedStringNS("Export All Contacts")
                                              : LocalizedStringNS("Export %1").arg(groupName));
    dialog->setAcceptMode(QFileDialog::AcceptSave);
    dialog->setNameFilter(LocalizedStringNS("vCard (*.vcf)"));
    dialog->setDefaultSuffix(QStringLiteral("vcf"));
    dialog->selectFile((groupName.isNull() ? LocalizedStringNS("Contacts") : groupName) +
                       QLatin1String(".vcf"));
    QObject::connect(dialog, &QFileDialog::fileSelected, parent,
                     [parent, &book, groupName](const QString& path) {
                         try {
                             book.exportFile(path, groupName);
                         } catch (const PelmoException& failure) {
                             openAlert(parent, LocalizedStringNS("The contacts were not exported."),
                                       failure.reason());
                         }
                     });
    dialog->open();
}
