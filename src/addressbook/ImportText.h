#pragma once

#include <QByteArray>
#include <QString>

#include <optional>

/** Text rules shared by the contacts-file importers. */
class ImportText {
public:
    /** bytes decoded from the named character set; nullopt when the name is unknown. */
    static std::optional<QString> decode(const QByteArray& bytes, const QString& charset);
    /**
     * bytes whose character set nobody named: UTF-16 (little or big endian) after its byte
     * order mark, else UTF-8 when they are valid UTF-8 (a UTF-8 byte order mark dropped), else
     * Windows-1252 (what spreadsheet programs and older exporters write).
     */
    static QString decodeUnlabelled(const QByteArray& bytes);
    /**
     * bytes without a leading UTF-8 byte order mark, or, after a UTF-16 one, the text in UTF-8:
     * for readers that work on 8-bit lines. Other bytes are answered as they are.
     */
    static QByteArray asUtf8(const QByteArray& bytes);
    /** bytes without a leading UTF-8 byte order mark. */
    static QByteArray withoutBom(const QByteArray& bytes);
    /**
     * True for something that can be mailed: one "@" with text on both sides, and no space,
     * control character, angle bracket, comma or semicolon anywhere.
     */
    static bool isPlausibleAddress(const QString& address);
    /** Throws ImportError for line unless the address is plausible. */
    static void requireAddress(const QString& address, int line);
    /**
     * Throws ImportError for line when a person's or group's name holds a control character:
     * the address book refuses such names, which would go into mail headers.
     */
    static void requireCleanName(const QString& name, int line);
    /**
     * Splits a display name at its last space: "Ada King Lovelace" gives "Ada King" and
     * "Lovelace"; a single word is a first name and leaves last null.
     */
    static void splitFullName(const QString& fullName, QString& first, QString& last);
};
