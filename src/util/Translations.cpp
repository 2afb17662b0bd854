#include "util/Translations.h"

#include <QCoreApplication>
#include <QDir>
#include <QLibraryInfo>
#include <QTranslator>

namespace {

// The application owns the translator it keeps, so that it outlives every lookup.
bool install(const QLocale& locale, const QString& name, const QString& folder) {
    auto* translator = new QTranslator(QCoreApplication::instance());
    if (!translator->load(locale, name, QStringLiteral("_"), folder)) {
        delete translator;
        return false;
    }
    QCoreApplication::installTranslator(translator);
    return true;
}

} // namespace

QStringList translationFolders() {
    const QDir program(QCoreApplication::applicationDirPath());
    return {program.filePath(QStringLiteral("../share/pelmo/translations")),
            program.filePath(QStringLiteral("translations"))};
}

bool installTranslations(const QLocale& locale, const QStringList& folders) {
    install(locale, QStringLiteral("qtbase"), QLibraryInfo::path(QLibraryInfo::TranslationsPath));
    for (const QString& folder : folders)
        if (install(locale, QStringLiteral("pelmo"), folder))
            return true;
    return false;
}
