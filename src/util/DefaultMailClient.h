#pragma once

#include <QString>

// Which application opens mailto links, as the desktop's mimeapps.list files say.

/**
 * The desktop id ("pelmo.desktop") of the application that opens links to e-mail addresses
 * now, null when none does. The [Default Applications] groups are read in the freedesktop
 * order: in the user's config folder, then each system config folder, then the user's and the
 * systems' applications folders, a desktop's own "<desktop>-mimeapps.list" (for each name in
 * XDG_CURRENT_DESKTOP) before the plain "mimeapps.list". The first listed application whose
 * desktop file is installed wins. When none is listed, the first installed desktop file whose
 * MimeType has x-scheme-handler/mailto does, as the desktop then opens links in it.
 */
QString DefaultMailClient();

/** The Name of the installed desktop file id ("Thunderbird"), else id itself. */
QString ApplicationName(const QString& id);

/** The user's mimeapps.list, in the folder QStandardPaths::GenericConfigLocation names. */
QString UserMimeAppsList();

/**
 * Makes Pelmo the user's default for links to e-mail addresses: sets
 * "x-scheme-handler/mailto=pelmo.desktop" in [Default Applications] of UserMimeAppsList(),
 * keeping every other line as it was. The file (0600) and its folder (0700) are made when
 * missing; the new text replaces the old one in a single rename. Answers 0, or an errno value
 * after logging why.
 */
int MakePelmoDefaultMailClient();
