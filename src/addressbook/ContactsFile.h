#pragma once

#include "addressbook/ImportedContact.h"

#include <QList>
#include <QString>

/** A contacts file on disk, read by the importer its kind calls for. */
class ContactsFile {
public:
    /**
     * Reads and parses the whole file: vCard when its name ends in .vcf or .vcard or its text
     * begins with BEGIN:VCARD, CSV otherwise. Throws ImportError when the file cannot be read
     * or is malformed.
     */
    static QList<ImportedContact> read(const QString& path);
    /** True when the file is to be read as vCard. */
    static bool isVCard(const QString& path, const QByteArray& data);
};
