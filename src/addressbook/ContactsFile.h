#pragma once

#include "addressbook/ParsedContacts.h"

#include <QByteArray>
#include <QString>

/** A contacts file on disk, read by the importer its kind calls for. */
class ContactsFile {
public:
    /**
     * Reads and parses the whole file: vCard when its name ends in .vcf or .vcard or its text
     * begins with BEGIN:VCARD, CSV otherwise. Bad values are left out and reported; throws
     * ImportError when the file cannot be read or is no contacts file at all.
     */
    static ParsedContacts read(const QString& path);
    /** True when the file is to be read as vCard. */
    static bool isVCard(const QString& path, const QByteArray& data);
};
