#pragma once

#include <QList>
#include <QString>
#include <QtGlobal>

#include <cstdint>

class CString256;
class QDateTime;

/** Reverses a C string in place; null is ignored. */
void reverse(char* s);

/**
 * Writes the decimal form of value into out: at most max - 1 digits (the least significant
 * ones are kept when there are more), then "-" for a negative value, which the budget does not
 * count. A max of 1 or less writes no digits. out must hold max + 1 bytes.
 */
void itoa(char* out, short max, long value);

/** Newly allocated decimal forms (free with delete[]); null when out of memory. */
char* itoa(unsigned long value);
char* itoa(long value);
char* itoa(short value);

// Character classes of the URL grammar (RFC 1738 2.2); every byte belongs to at most one.
bool isHiAlpha(unsigned char c);
bool isLoAlpha(unsigned char c);
bool isHiorLoAlpha(unsigned char c);
bool isDig(unsigned char c);
bool isSafe(unsigned char c);
bool isExtra(unsigned char c);
bool isReserved(unsigned char c);
bool isPunctuation(unsigned char c);
bool isNational(unsigned char c);

/** True for bytes in none of the classes above: space, controls, 127 and bytes above 127. */
bool NeedsURLEncoding(unsigned char c);

/** Writes "%xx" (lower-case hex) when c needs encoding, else c alone. out holds 4 bytes. */
void URLencode(char* out, unsigned char c);

/** Writes c alone for letters, digits, $ - _ . + and &, else "%xx". out holds 4 bytes. */
void URLSafeEncode(char* out, unsigned char c);

/**
 * Appends "1 hr 2 mins 3 secs " style text for a duration, skipping zero parts and keeping a
 * trailing space; zero seconds replaces the text by "0 secs".
 */
void ElapsedTimeMessage(uint32_t seconds, CString256& text);

/**
 * The MIME type the desktop's MIME database gives a file of this name ("application/pdf" for
 * "report.pdf"), looked up by name only (the file need not exist). Null when the name has no
 * extension or the database does not know it: never a made-up type.
 */
QString MimeTypeForPath(const QString& path);

/** bytes as UTF-8 text, or a null string when they are not valid UTF-8 (a cut sequence included).
 */
QString DecodeUtf8Strictly(const QByteArray& bytes);

/**
 * Whether text is one e-mail address as RFC 5322 section 3.4.1 writes it (an addr-spec):
 * a dot-atom or quoted-string local part, "@", and a dot-atom or domain-literal domain. UTF-8
 * letters count as atom text (RFC 6532 section 3.2). A display name, angle brackets, a list
 * or surrounding spaces are not an addr-spec.
 */
bool IsAddrSpec(const QString& text);

/** A date in the program's one textual form, local time: "2024-05-01 14:03:22 +0200". */
QString DateDescription(const QDateTime& date);

/**
 * Moves the element at from to index to, shifting those between by one. Out-of-range indexes
 * or from == to change nothing. Always answers 0.
 */
template <class T>
int MoveArrayItem(QList<T>& array, qsizetype from, qsizetype to) {
    const qsizetype lastIndex = array.size() - 1;
    if (from == to || from < 0 || to < 0 || from > lastIndex || to > lastIndex)
        return 0;
    array.move(from, to);
    return 0;
}
