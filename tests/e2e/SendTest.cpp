#include "Transcript.h"

#include <gtest/gtest.h>

namespace {

// pelmo send as a user runs it, against aiosmtpd and servers that misbehave on purpose:
// tests/data/cli/send.txt.
class Send : public ::testing::TestWithParam<std::string> {};

TEST_P(Send, Session) {
    const Played session = playSession(QStringLiteral("send.txt"), GetParam());
    EXPECT_EQ(session.played, session.written);
}

INSTANTIATE_TEST_SUITE_P(Cli, Send, ::testing::ValuesIn(sessionNames("send.txt")),
                         [](const auto& row) { return row.param; });

} // namespace
