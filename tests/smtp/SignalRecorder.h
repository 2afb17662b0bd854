#pragma once

#include "smtp/SmtpSession.h"

#include <QObject>
#include <QStringList>

#include <chrono>
#include <functional>

/**
 * Records every signal of a session by name, in order, and runs the event loop until one
 * arrives. A hook may react to each signal the way the delivery driver would.
 */
class SignalRecorder : public QObject {
public:
    explicit SignalRecorder(SmtpSession& session);

    const QStringList& names() const { return m_names; }
    qsizetype count(const QString& name) const { return m_names.count(name); }
    QString joined() const { return m_names.join(QLatin1Char(',')); }

    /**
     * Runs the event loop until `name` has arrived `occurrences` times, a failure or the end
     * came instead, or the guard against hangs has passed; true when it arrived.
     */
    bool waitFor(const QString& name, qsizetype occurrences = 1,
                 std::chrono::milliseconds guard = std::chrono::seconds(20));
    /** Runs the event loop a little, so that any signal still queued would be recorded. */
    void settle();

    std::function<void(const QString& name)> onSignal;

private:
    bool settled(const QString& awaited, qsizetype occurrences, qsizetype before) const;

    QStringList m_names;
};
