#pragma once

#include <QByteArray>
#include <QHash>
#include <QString>

#include <mutex>
#include <optional>

#include <sys/types.h>

/**
 * The attachments of one mailing run, read and encoded once for all its copies: every copy
 * carries the same file, and encoding a large one for each copy took most of a copy's time.
 * A file is read again only when it changed since (another size, inode, modification or
 * status-change time), so that a copy still carries the file as it is when the copy is built.
 * Owned by the run and shared by its copies, which may be built on other threads.
 */
class EncodedAttachments {
public:
    /**
     * The file at path as quoted-printable, as MessageAssembly attaches it; nothing when it
     * cannot be read (gone, a folder, no permission).
     */
    std::optional<QByteArray> quotedPrintable(const QString& path);

    /** The same, read now without keeping anything. */
    static std::optional<QByteArray> read(const QString& path);

private:
    struct Identity {
        dev_t device = 0;
        ino_t inode = 0;
        off_t size = 0;
        qint64 modified = 0;
        qint64 changed = 0;
        bool operator==(const Identity&) const = default;
    };
    struct Entry {
        Identity identity;
        QByteArray encoded;
    };
    std::mutex m_mutex;
    QHash<QString, Entry> m_entries;
};
