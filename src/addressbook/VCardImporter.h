#pragma once

#include "addressbook/ImportedContact.h"

#include <QByteArray>
#include <QList>

/**
 * Reads vCard files of versions 2.1, 3.0 and 4.0 (RFC 6350, RFC 2426 and the versit vCard 2.1
 * format): folded lines, quoted-printable values with soft line breaks and CHARSET
 * parameters, escaped text values. Of each card it keeps the name (N, else FN), the e-mail
 * addresses (the preferred one, else the first, is primary) and CATEGORIES as group names;
 * group cards (KIND:group, or Apple's X-ADDRESSBOOKSERVER-KIND:group) add their MEMBERs,
 * matched by UID, to the group of that name. Cards with neither a name nor an address are
 * left out. Every other property is skipped.
 */
class VCardImporter {
public:
    /** Parses a whole file; throws ImportError naming the first malformed line. */
    static QList<ImportedContact> parse(const QByteArray& data);
};
