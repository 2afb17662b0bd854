#pragma once

#include <filesystem>

/**
 * Finds the per-user data folder "<XDG_DATA_HOME or ~/.local/share>/Orvale Software/Pelmo",
 * creating each missing level. It holds the activity log and the address book, which are the
 * user's alone: both "Orvale Software" and "Pelmo" are made 0700 and the regular files in
 * "Pelmo" 0600 at each call (see MakePrivateFolder, MakePrivateFile); a file that cannot be
 * tightened is reported with qWarning. Answers false, leaving folder untouched, when the
 * folder cannot be found, made or made private.
 */
bool GetOurApplicationSupportFolder(std::filesystem::path& folder);
