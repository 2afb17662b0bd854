#pragma once

// Terminal sessions with the pelmo program, written down in tests/data/cli/ as a user would see
// them; tests/data/cli/commands.txt tells their form.

#include "RowName.h"

#include <QString>
#include <gtest/gtest.h>

struct Session {
    std::string name;
};
inline void PrintTo(const Session& session, std::ostream* out) { // names the CTest test
    *out << session.name;
}
std::vector<Session> sessionsOf(const QString& file);
/** Plays the session NAME of the file and expects it to go exactly as written. */
void playSession(const QString& file, const std::string& name);

/** A test Cli/Suite.Session/NAME for each session NAME of the file. */
#define PELMO_SESSIONS(Suite, file)                                                                \
    class Suite : public ::testing::TestWithParam<Session> {};                                     \
    TEST_P(Suite, Session) {                                                                       \
        playSession(file, GetParam().name);                                                        \
    }                                                                                              \
    INSTANTIATE_TEST_SUITE_P(Cli, Suite, ::testing::ValuesIn(sessionsOf(file)), RowName())
