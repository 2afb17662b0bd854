#pragma once

#include <QLocale>
#include <QStringList>

/**
 * Where Pelmo's catalogs (pelmo_<language>.qm) are looked for: share/pelmo/translations beside
 * an installed program's bin folder, then translations/ beside a program in its build tree.
 */
QStringList translationFolders();

/**
 * Installs into the running application Qt's own catalog for the locale's languages, which
 * words the standard buttons and dialogs, and Pelmo's from the first of folders that has one.
 * Answers whether Pelmo's was found; without it the texts stay English. Must come before the
 * first LocalizedString(), which keeps what it has looked up.
 */
bool installTranslations(const QLocale& locale, const QStringList& folders = translationFolders());
