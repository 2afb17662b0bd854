#include "controller/RunPace.h"
#include "RowName.h"

#include <gtest/gtest.h>

namespace {

using namespace std::chrono_literals;
using Time = RunPace::Clock::time_point;

// Seconds after an arbitrary start, as the rows write their times.
Time at(double seconds) {
    return Time() +
           std::chrono::round<RunPace::Clock::duration>(std::chrono::duration<double>(seconds));
}

struct Copy {
    double start, end;
};

// Copies sent so far, then how long the next waits and how long those left take.
struct PaceRow {
    const char* name;
    RunPace::Duration delay;
    int hourlyLimit;
    std::vector<Copy> sent;
    double now;
    RunPace::Duration wait;
    int left = 1;
    RunPace::Duration total = wait;
    double holdUntil = -1;
};

const PaceRow kPaceRows[] = {
    {"no_pace_never_waits", 0ms, 0, {{0, 1}, {1, 2}}, 2, 0ms, 1000, 0ms},
    {"first_copy_goes_at_once", 5s, 1, {}, 0, 0ms},
    {"delay_counts_from_the_end", 5s, 0, {{0, 2}}, 3, 4s},
    {"delay_passed", 5s, 0, {{0, 2}}, 7, 0ms},
    {"delay_for_each_left", 10s, 0, {{0, 1}}, 1, 10s, 3, 30s},
    {"nth_copy_of_the_hour_goes", 0ms, 3, {{0, 1}, {10, 11}}, 20, 0ms},
    {"copy_past_the_limit_waits", 0ms, 3, {{0, 1}, {10, 11}, {20, 21}}, 30, 3570s},
    {"limit_of_one", 0ms, 1, {{0, 1}}, 1, 3599s},
    {"hour_is_sliding", 0ms, 2, {{0, 1}, {1800, 1801}}, 3600, 0ms},
    {"hour_ends_to_the_millisecond", 0ms, 2, {{0, 1}, {1800, 1801}}, 3599.9995, 1ms},
    {"limit_paces_those_left", 0ms, 2, {}, 0, 0ms, 5, 7200s},
    {"stricter_rule_wins", 1min, 1, {{3590, 3595}}, 3596, 3594s},
    {"hold_after_a_refusal", 0ms, 0, {{0, 1}}, 1, 29s, 2, 29s, 30},
    {"hold_passed", 0ms, 0, {{0, 1}}, 31, 0ms, 1, 0ms, 30},
};

class Pace : public ::testing::TestWithParam<PaceRow> {};

TEST_P(Pace, WaitAndTimeLeft) {
    const PaceRow& row = GetParam();
    RunPace pace;
    pace.setDelay(row.delay);
    pace.setHourlyLimit(row.hourlyLimit);
    for (const Copy& copy : row.sent) {
        pace.copyStarted(at(copy.start));
        pace.copyEnded(at(copy.end));
    }
    if (row.holdUntil >= 0)
        pace.holdUntil(at(row.holdUntil));
    EXPECT_EQ(pace.waitBefore(at(row.now)), row.wait);
    EXPECT_EQ(pace.timeFor(row.left, at(row.now)), row.total);
}

INSTANTIATE_TEST_SUITE_P(Rows, Pace, ::testing::ValuesIn(kPaceRows), RowName());

// Rounded up, so that a wait is never told shorter than it is.
TEST(Pace, WaitsAsTheUserReadsThem) {
    const std::pair<RunPace::Duration, const char*> rows[] = {
        {0ms, "0 s"}, {1ms, "1 s"},         {59s, "59 s"},         {60s, "1 min"}, {61s, "2 min"},
        {1h, "1 h"},  {61min, "1 h 1 min"}, {90min, "1 h 30 min"}, {3599s, "1 h"},
    };
    for (const auto& [wait, text] : rows)
        EXPECT_EQ(RunPace::describe(wait).toStdString(), text) << wait.count() << " ms";
}

} // namespace
