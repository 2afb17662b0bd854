#pragma once

#include "addressbook/ImportedContact.h"
#include "addressbook/SkippedValue.h"

#include <QList>

/**
 * What an importer read from a contacts file: the contacts it could take, and every value it
 * had to leave out. A bad value costs only itself; a contact is left out whole only when
 * nothing usable (no name, no address) remains of it, or when its record cannot be read at all.
 */
struct ParsedContacts {
    QList<ImportedContact> contacts;
    QList<SkippedValue> skipped;
    /** Contacts of the file left out whole because of a fault. */
    int contactsSkipped = 0;

    void skip(int line, const QString& reason) { skipped.append({line, reason}); }
};
