#include "controller/RunPace.h"

#include "util/LocalizedStrings.h"

#include <algorithm>

namespace {

using namespace std::chrono_literals;

constexpr RunPace::Duration kHour = 1h;

// Waits are rounded up: a copy that starts a millisecond early breaks the limit it keeps.
RunPace::Duration roundedUp(RunPace::Clock::duration span) {
    return std::max(RunPace::Duration(0), std::chrono::ceil<RunPace::Duration>(span));
}

} // namespace

void RunPace::copyStarted(Clock::time_point at) {
    m_started.push_back(at);
    // Only the last hour's starts, and no more of them than the limit, can hold a copy back.
    while (!m_started.empty() && (m_started.front() + kHour <= at ||
                                  (m_hourlyLimit > 0 && m_started.size() > size_t(m_hourlyLimit))))
        m_started.pop_front();
}

RunPace::Clock::time_point RunPace::earliestStart(const std::deque<Clock::time_point>& started,
                                                  std::optional<Clock::time_point> lastEnd) const {
    Clock::time_point earliest = Clock::time_point::min();
    if (lastEnd)
        earliest = *lastEnd + m_delay;
    if (m_hourlyLimit > 0 && started.size() >= size_t(m_hourlyLimit))
        earliest = std::max(earliest, started[started.size() - m_hourlyLimit] + kHour);
    if (m_hold)
        earliest = std::max(earliest, *m_hold);
    return earliest;
}

RunPace::Duration RunPace::waitBefore(Clock::time_point now) const {
    const Clock::time_point earliest = earliestStart(m_started, m_lastEnd);
    return earliest <= now ? Duration(0) : roundedUp(earliest - now);
}

RunPace::Duration RunPace::timeFor(int copies, Clock::time_point now) const {
    std::deque<Clock::time_point> started = m_started;
    std::optional<Clock::time_point> lastEnd = m_lastEnd;
    Clock::time_point last = now;
    for (int copy = 0; copy < copies; ++copy) {
        last = std::max(now, earliestStart(started, lastEnd));
        started.push_back(last);
        if (m_hourlyLimit > 0 && started.size() > size_t(m_hourlyLimit))
            started.pop_front();
        lastEnd = last;
    }
    return roundedUp(last - now);
}

QString RunPace::describe(Duration wait) {
    const auto seconds = std::chrono::ceil<std::chrono::seconds>(wait).count();
    if (seconds < 60)
        return LocalizedStringNS("%1 s").arg(seconds);
    const auto minutes = (seconds + 59) / 60;
    if (minutes < 60)
        return LocalizedStringNS("%1 min").arg(minutes);
    if (minutes % 60 == 0)
        return LocalizedStringNS("%1 h").arg(minutes / 60);
    return LocalizedStringNS("%1 h %2 min").arg(minutes / 60).arg(minutes % 60);
}
