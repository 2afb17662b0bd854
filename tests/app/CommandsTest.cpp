#include "e2e/Transcript.h"

#include <gtest/gtest.h>

namespace {

// The pelmo program's commands, run as a user runs them: tests/data/cli/commands.txt.
class Commands : public ::testing::TestWithParam<std::string> {};

TEST_P(Commands, Session) {
    const Played session = playSession(QStringLiteral("commands.txt"), GetParam());
    EXPECT_EQ(session.played, session.written);
}

INSTANTIATE_TEST_SUITE_P(Cli, Commands, ::testing::ValuesIn(sessionNames("commands.txt")),
                         [](const auto& row) { return row.param; });

} // namespace
