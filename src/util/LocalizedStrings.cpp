#include "util/LocalizedStrings.h"

#include <QCoreApplication>
#include <QHash>

#include <mutex>

namespace {

QHash<QString, QString>& cache() {
    static QHash<QString, QString> translations;
    return translations;
}

std::mutex& cacheLock() {
    static std::mutex lock;
    return lock;
}

} // namespace

QString LocalizedString(const QString& key) {
    auto& known = cache();
    {
        const std::lock_guard lock(cacheLock());
        const auto hit = known.constFind(key);
        if (hit != known.constEnd())
            return hit.value();
    }
    // translate() answers the key itself when no translator has it; it is thread-safe.
    const QString translated =
        QCoreApplication::translate("LocalizedStrings", key.toUtf8().constData());
    if (translated.isNull())
        return translated;
    const std::lock_guard lock(cacheLock());
    known.insert(key, translated);
    return translated;
}

QString LocalizedString(const char* key) {
    return LocalizedString(QString::fromUtf8(key));
}

QString LocalizedStringNS(const char* key) {
    return LocalizedString(key);
}

QString LocalizedFormat(const char* key, const QStringList& arguments) {
    const QString format = LocalizedString(key);
    QString text;
    qsizetype from = 0;
    for (const QString& argument : arguments) {
        const qsizetype at = format.indexOf(QLatin1String("%@"), from);
        if (at < 0)
            break;
        text += QStringView(format).mid(from, at - from);
        text += argument;
        from = at + 2;
    }
    text += QStringView(format).mid(from);
    return text;
}
