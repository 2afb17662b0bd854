#pragma once

#include "addressbook/ParsedContacts.h"

#include <QByteArray>

/**
 * Reads contacts from comma-separated values (RFC 4180) whose first row names the columns;
 * the separator (",", ";" or tab) is the one the header row uses. Column names are matched
 * ignoring case and everything but letters and digits, against a table of the names that our
 * own files and Google, Outlook (English and German) and Thunderbird exports use for the first,
 * last and display name, the e-mail addresses (at least one column is required) and the
 * groups. Several e-mail columns, or several values in one separated by ";" or " ::: ", give
 * several addresses, the first primary; groups are listed the same way, and Google's "* My
 * Contacts" and "* Starred" labels are no groups. The display name is used when both name
 * columns are blank. The text is UTF-16 after a byte order mark, else UTF-8, else Windows-1252.
 * Blank rows, and rows with neither a name nor an address, are left out; a row shorter than
 * the header has its last fields blank.
 */
class CsvImporter {
public:
    /**
     * Parses a whole file. A bad value (an implausible address, a name with a control
     * character) or a row that cannot be read is left out and reported with its line; throws
     * ImportError only when the file as a whole is unusable (empty, or no e-mail column).
     */
    static ParsedContacts parse(const QByteArray& data);
};
