#pragma once

#include "addressbook/ImportedContact.h"

#include <QByteArray>
#include <QList>

/**
 * Writes persons as vCard 4.0 (RFC 6350) in UTF-8 with CRLF line ends, one card each: N and FN
 * for the name, EMAIL for each address with the primary one first (PREF=1), and CATEGORIES
 * for the groups. VCardImporter reads the result back to the same persons and groups.
 */
class VCardExporter {
public:
    /** The cards of contacts, in their order; empty for no contacts. */
    static QByteArray write(const QList<ImportedContact>& contacts);
};
