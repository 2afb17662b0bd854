#pragma once

#include <QList>
#include <QString>

#include <chrono>
#include <deque>
#include <optional>

/**
 * When the next copy of a mailing may start, so that a server that limits how fast it takes
 * mail is not pushed past its limit. It knows nothing of the network: the run tells it when
 * each copy started and ended and asks it how long to wait; times come from the caller, so
 * that the rules can be checked without a clock.
 *
 * Three rules, the strictest wins:
 * - the delay: a copy starts no sooner than delay() after the previous copy ended;
 * - the hourly limit: at most hourlyLimit() copies start in any sliding hour, so with a limit
 *   of 100 the 101st starts an hour after the 1st did. Every copy that starts counts, a copy
 *   that goes again after a temporary refusal once more, since the server saw each try;
 * - a hold: after a temporary refusal, nothing starts before the back-off has passed.
 *
 * A delay of 0 and a limit of 0 (none) never make a copy wait. The history lives as long as
 * the object, so a run stopped and started again keeps to the same hour.
 */
class RunPace {
public:
    using Clock = std::chrono::steady_clock;
    using Duration = std::chrono::milliseconds;

    void setDelay(Duration delay) { m_delay = delay; }
    Duration delay() const { return m_delay; }
    /** 0 for no limit. */
    void setHourlyLimit(int copies) { m_hourlyLimit = copies; }
    int hourlyLimit() const { return m_hourlyLimit; }

    /** The back-offs before each retry of a temporarily refused copy; its size is how many. */
    void setRetrySchedule(QList<Duration> backOffs) { m_retrySchedule = std::move(backOffs); }
    const QList<Duration>& retrySchedule() const { return m_retrySchedule; }

    void copyStarted(Clock::time_point at);
    void copyEnded(Clock::time_point at) { m_lastEnd = at; }
    /** Nothing starts before until. */
    void holdUntil(Clock::time_point until) { m_hold = until; }

    /** How long from now until the next copy may start; zero when it may at once. */
    Duration waitBefore(Clock::time_point now) const;
    /** How long from now until the last of copies more can start, if each went in no time. */
    Duration timeFor(int copies, Clock::time_point now) const;

    /** A wait as the user reads it: "12 s", "3 min", "1 h 20 min" (rounded up). */
    static QString describe(Duration wait);

private:
    Clock::time_point earliestStart(const std::deque<Clock::time_point>& started,
                                    std::optional<Clock::time_point> lastEnd) const;

    Duration m_delay{0};
    int m_hourlyLimit = 0;
    QList<Duration> m_retrySchedule{std::chrono::seconds(30), std::chrono::minutes(2),
                                    std::chrono::minutes(8)};
    /** The start times within the last hour, oldest first; at most hourlyLimit() of them. */
    std::deque<Clock::time_point> m_started;
    std::optional<Clock::time_point> m_lastEnd;
    std::optional<Clock::time_point> m_hold;
};
