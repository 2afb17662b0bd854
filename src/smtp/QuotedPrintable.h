#pragma once

#include <QByteArray>

/**
 * bytes in the quoted-printable encoding (RFC 2045 6.7) with no hard line breaks: CR and LF
 * are encoded like any other control byte, so that every content, binary files included,
 * decodes to exactly the bytes given. Lines are cut by soft breaks ("=" then "\n") and hold at
 * most 76 characters, the "=" included.
 */
QByteArray EncodeQuotedPrintable(const QByteArray& bytes);
