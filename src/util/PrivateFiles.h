#pragma once

#include <filesystem>

// Keeping the user's contacts, settings and logs from the other local users. On failure both
// answer false and leave errno saying why.

/**
 * Makes folder, and each missing level above it, with mode 0700. The folder itself, when it
 * already exists (and its owner can read it), loses its group and other bits; levels above it that
 * already exist are left as they are, and no mode is ever widened. A symbolic link to a folder is
 * followed. False when the folder cannot be made or made private, or is not a folder.
 */
bool MakePrivateFolder(const std::filesystem::path& folder);

/**
 * Makes file private to its owner. A missing file is created empty with mode 0600, never
 * existing with wider bits; an existing regular file, which its owner must be able to read,
 * loses its group and other bits and keeps its content and owner bits. A symbolic link or
 * anything else than a regular file is refused and left as it is. False when the file cannot
 * be made or made private, or is refused.
 */
bool MakePrivateFile(const std::filesystem::path& file);
