#include "SignalRecorder.h"

#include <QCoreApplication>
#include <QDeadlineTimer>

#include <utility>

namespace {

using Signal = void (SmtpSession::*)();

const std::pair<const char*, Signal> sessionSignals[] = {
    {"connectionEstablished", &SmtpSession::connectionEstablished},
    {"serviceInitialized", &SmtpSession::serviceInitialized},
    {"authenticationCompleted", &SmtpSession::authenticationCompleted},
    {"authenticationFailed", &SmtpSession::authenticationFailed},
    {"messageSent", &SmtpSession::messageSent},
    {"messageNotSent", &SmtpSession::messageNotSent},
    {"connectionLost", &SmtpSession::connectionLost},
    {"connectionTimedOut", &SmtpSession::connectionTimedOut},
    {"connectionTerminated", &SmtpSession::connectionTerminated},
};

} // namespace

SignalRecorder::SignalRecorder(SmtpSession& session) : m_session(session) {
    for (const auto& [name, signal] : sessionSignals) {
        const QString text = QString::fromLatin1(name);
        connect(&session, signal, this, [this, text] {
            m_names += text;
            if (onSignal)
                onSignal(text);
        });
    }
}

::testing::AssertionResult SignalRecorder::arrived(const char* name, qsizetype occurrences) {
    const QString awaited = QString::fromLatin1(name);
    const QDeadlineTimer deadline(std::chrono::seconds(20));
    const qsizetype before = m_names.size();
    while (!settled(awaited, occurrences, before) && !deadline.hasExpired())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
    if (count(awaited) >= occurrences)
        return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure() << "no " << name << "; signals: " << joined().toStdString()
                                         << "; error: " << m_session.errorString().toStdString();
}

void SignalRecorder::settle() {
    const QDeadlineTimer deadline(std::chrono::milliseconds(200));
    while (!deadline.hasExpired())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 20);
}

bool SignalRecorder::settled(const QString& awaited, qsizetype occurrences,
                             qsizetype before) const {
    if (count(awaited) >= occurrences)
        return true;
    static const QStringList outcomes = {
        QStringLiteral("authenticationFailed"), QStringLiteral("messageNotSent"),
        QStringLiteral("connectionLost"), QStringLiteral("connectionTimedOut"),
        QStringLiteral("connectionTerminated")};
    // A failure, or the end, since the wait began: the awaited signal will not come now.
    return m_names.size() > before && outcomes.contains(m_names.last());
}
