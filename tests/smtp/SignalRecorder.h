#pragma once

#include "smtp/SmtpSession.h"

#include <QObject>
#include <QStringList>
#include <gtest/gtest.h>

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
     * came instead, or a guard against hangs has passed; a failure names what came instead
     * and the session's errorString().
     */
    ::testing::AssertionResult arrived(const char* name, qsizetype occurrences = 1);
    /** Runs the event loop a little, so that any signal still queued would be recorded. */
    void settle();

    std::function<void(const QString& name)> onSignal;

private:
    bool settled(const QString& awaited, qsizetype occurrences, qsizetype before) const;

    const SmtpSession& m_session;
    QStringList m_names;
};
