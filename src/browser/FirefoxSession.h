#pragma once

#include "browser/FrontPage.h"

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <optional>

/**
 * The page in front of a running Firefox (or firefox-esr, LibreWolf), read from the session
 * store its profile keeps current. Every function that fails says why in one short line, when
 * why is not null.
 */
class FirefoxSession {
public:
    /** Largest decompressed session accepted; a header claiming more is refused unread. */
    static constexpr qint64 maxDecodedSize = 256 * 1024 * 1024;

    /**
     * The payload of a mozLz4 file: the magic "mozLz40\0", the decompressed size (32 bits,
     * little-endian), then one LZ4 block that decompresses to exactly that size. Null on any
     * other file.
     */
    static QByteArray decodeMozLz4(const QByteArray& file, QString* why);

    /**
     * The current entry of the selected tab of the selected window of a session's JSON.
     * Closed windows are never chosen; private windows are not written into the session.
     */
    static std::optional<FrontPage> frontPage(const QByteArray& json, QString* why);

    /**
     * The profile folder that the Firefox process pid, started with arguments (argv[0] first),
     * uses: the one its command line names (-profile DIR, -P NAME), else the one whose lock
     * names pid, else the installation's default (the most recently saved when there are
     * several), else the profile marked Default. firefoxHome holds profiles.ini. Null when none.
     */
    static QString profileFolder(const QString& firefoxHome, const QStringList& arguments,
                                 qint64 pid, QString* why);

    /** The front page from the session file that a running Firefox keeps in profileFolder. */
    static std::optional<FrontPage> read(const QString& profileFolder, QString* why);
};
