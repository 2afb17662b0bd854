#pragma once

#include "addressbook/ImportedContact.h"

#include <QByteArray>
#include <QList>

/**
 * Reads contacts from comma-separated values (RFC 4180) whose first row names the columns.
 * Column names are matched ignoring case, spaces, hyphens and underscores: "first name"
 * (or given name), "last name" (or surname, family name), "e-mail" (or email, e-mail
 * address; required), "groups" (or group, categories), and "name" (or full name, display
 * name) used when both name columns are blank. Other columns are ignored. The e-mail and
 * groups columns may hold several values separated by ";"; the first address is primary.
 * The text is UTF-8, or Windows-1252 when it is not valid UTF-8. Blank rows, and rows with
 * neither a name nor an address, are left out; a row shorter than the header has its last
 * fields blank.
 */
class CsvImporter {
public:
    /** Parses a whole file; throws ImportError naming the first malformed line. */
    static QList<ImportedContact> parse(const QByteArray& data);
};
