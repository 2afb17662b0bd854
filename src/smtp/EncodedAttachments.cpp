#include "smtp/EncodedAttachments.h"

#include "smtp/QuotedPrintable.h"

#include <QFile>

#include <sys/stat.h>

namespace {

qint64 nanoseconds(const timespec& time) {
    return static_cast<qint64>(time.tv_sec) * 1'000'000'000 + time.tv_nsec;
}

} // namespace

std::optional<QByteArray> EncodedAttachments::read(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return std::nullopt;
    const QByteArray bytes = file.readAll();
    if (file.error() != QFileDevice::NoError)
        return std::nullopt;
    return EncodeQuotedPrintable(bytes);
}

std::optional<QByteArray> EncodedAttachments::quotedPrintable(const QString& path) {
    // Two copies' builds meet only when a delivery ends before its build does.
    const std::lock_guard lock(m_mutex);
    struct stat status {};
    if (::stat(QFile::encodeName(path).constData(), &status) != 0) {
        m_entries.remove(path);
        return std::nullopt;
    }
    const Identity identity{status.st_dev, status.st_ino, status.st_size,
                            nanoseconds(status.st_mtim), nanoseconds(status.st_ctim)};
    if (const auto known = m_entries.constFind(path);
        known != m_entries.constEnd() && known->identity == identity)
        return known->encoded;
    std::optional<QByteArray> encoded = read(path);
    if (encoded)
        m_entries.insert(path, {identity, *encoded});
    else
        m_entries.remove(path);
    return encoded;
}
