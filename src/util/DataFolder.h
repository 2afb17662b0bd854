#pragma once

#include <filesystem>

/**
 * Finds the per-user data folder "<XDG_DATA_HOME or ~/.local/share>/Orvale Software/Pelmo",
 * creating each missing level. It holds the activity log and the address book. Answers false,
 * leaving folder untouched, when the folder cannot be found or made.
 */
bool GetOurApplicationSupportFolder(std::filesystem::path& folder);
