#pragma once

#include "addressbook/ParsedContacts.h"

#include <QByteArray>
#include <QList>

/**
 * Reads vCard files of versions 2.1, 3.0 and 4.0 (RFC 6350, RFC 2426 and the versit vCard 2.1
 * format): folded lines, quoted-printable values with soft line breaks and CHARSET
 * parameters, escaped text values. Of each card it keeps the name (N, else FN), the e-mail
 * addresses (the preferred one, else the first, is primary) and CATEGORIES as group names; of
 * a repeated N or FN the first counts, and FN gives the name when N gives none;
 * group cards (KIND:group, or Apple's X-ADDRESSBOOKSERVER-KIND:group) add their MEMBERs,
 * matched by UID, to the group of that name. Cards with neither a name nor an address are
 * left out. Every other property is skipped.
 */
class VCardImporter {
public:
    /**
     * Parses a whole file, UTF-16 after a byte order mark. A bad value, a line that is no
     * property or a card that is not closed is left out and reported with its line; throws
     * ImportError only when the file holds no card at all.
     */
    static ParsedContacts parse(const QByteArray& data);
};
