#include "util/LocalizedStrings.h"

#include <QCoreApplication>
#include <QHash>

namespace {

QHash<QString, QString>& cache() {
    static QHash<QString, QString> translations;
    return translations;
}

} // namespace

QString LocalizedString(const QString& key) {
    auto& known = cache();
    const auto hit = known.constFind(key);
    if (hit != known.constEnd())
        return hit.value();
    // translate() answers the key itself when no translator has it.
    const QString translated =
        QCoreApplication::translate("LocalizedStrings", key.toUtf8().constData());
    if (translated.isNull())
        return translated;
    known.insert(key, translated);
    return translated;
}

QString LocalizedString(const char* key) {
    return LocalizedString(QString::fromUtf8(key));
}

QString LocalizedStringNS(const char* key) {
    return LocalizedString(key);
}
