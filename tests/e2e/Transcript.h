#pragma once

// Terminal sessions with the pelmo program, written down in tests/data/cli/ as a user would see
// them; tests/data/cli/commands.txt tells their form.

#include <QString>

#include <string>
#include <vector>

/** The names of the sessions in the file. */
std::vector<std::string> sessionNames(const QString& file);

/** The session as written, and as it went when played: a test wants them equal. */
struct Played {
    std::string written, played;
};
Played playSession(const QString& file, const std::string& name);
