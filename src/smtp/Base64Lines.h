#pragma once

#include <QByteArray>

/**
 * bytes in the base64 encoding (RFC 2045 6.8) as a mail body carries them: lines of 76
 * characters, each ended by "\n", the last one shorter when it must be; nothing for no bytes.
 */
QByteArray EncodeBase64Lines(const QByteArray& bytes);
