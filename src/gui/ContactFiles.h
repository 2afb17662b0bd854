#pragma once

#include <QString>
#include <QStringList>

#include <functional>

class AddressBook;
class QWidget;

/**
 * Importing and exporting contact files from the windows: the file dialogs and the summary
 * shown after an import. Every dialog is window-modal on parent and the calls return at once;
 * done runs once the book has changed. The book is not owned and must outlive the dialogs.
 */
class ContactFiles {
public:
    /** True for the files an import reads: vCard (.vcf, .vcard) and CSV. */
    static bool isContactsFile(const QString& path);
    /** Asks for vCard or CSV files, then imports them as importFiles() does. */
    static void chooseAndImport(QWidget* parent, AddressBook& book,
                                const std::function<void()>& done);
    /**
     * Imports each file and shows one summary: per file its counts and the values it left
     * out with their lines, or why the file could not be read.
     */
    static void importFiles(QWidget* parent, AddressBook& book, const QStringList& paths,
                            const std::function<void()>& done);
    /** Asks where to write the members of groupName (everyone when null) as a vCard file. */
    static void chooseAndExport(QWidget* parent, const AddressBook& book, const QString& groupName);
};
