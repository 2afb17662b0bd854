#pragma once

#include "smtp/SmtpSession.h"

#include <QMetaObject>

// A session that plays the server's part from a script, for the turns a real server is hard to
// bring to: a refused reply that is not UTF-8, a time-out, a connection lost while sending.
// Like a real session it answers on the main loop, never from inside the call.
class ScriptedSession : public SmtpSession {
public:
    struct Script {
        bool implicitTls = false; // transport is TLS from the start (port 465)
        bool acceptLogin = true;
        bool timeOutOnConnect = false;
        bool loseConnectionOnSend = false;
        QByteArray refusal; // non-empty: the message is refused with this reply
        QStringList mechanisms = {QStringLiteral("PLAIN"), QStringLiteral("LOGIN")};
    };

    ScriptedSession(const Script& script, QStringList& calls) : m_script(script), m_calls(calls) {
        m_tls = script.implicitTls;
    }

    void connectInBackgroundAndNotify() override {
        m_calls << QStringLiteral("connect");
        if (m_script.timeOutOnConnect)
            return later(&SmtpSession::connectionTimedOut);
        later(&SmtpSession::connectionEstablished);
        if (!m_script.implicitTls)
            later(&SmtpSession::serviceInitialized);
    }
    bool isSSL() const override { return m_tls; }
    void startSSL() override {
        m_calls << QStringLiteral("startSSL");
        later(&SmtpSession::serviceInitialized);
    }
    void startTLS() override {
        m_calls << QStringLiteral("startTLS");
        m_tls = true;
        later(&SmtpSession::serviceInitialized);
    }
    QStringList supportedMechanisms() const override { return m_script.mechanisms; }
    void authenticate(const QString& user, const QString&, const QString& mechanism) override {
        m_calls << QStringLiteral("auth %1 %2").arg(mechanism, user);
        later(m_script.acceptLogin ? &SmtpSession::authenticationCompleted
                                   : &SmtpSession::authenticationFailed);
    }
    void setMessage(const QByteArray& message, const QString&,
                    const QStringList& recipients) override {
        m_calls << QStringLiteral("message to %1").arg(recipients.join(QLatin1Char(',')));
        m_message = message;
    }
    void sendMessage() override {
        m_calls << QStringLiteral("send");
        if (m_script.loseConnectionOnSend)
            return later(&SmtpSession::connectionLost);
        m_last = m_script.refusal.isEmpty() ? QByteArray("250 OK") : m_script.refusal;
        later(m_script.refusal.isEmpty() ? &SmtpSession::messageSent
                                         : &SmtpSession::messageNotSent);
    }
    void close() override {
        m_calls << QStringLiteral("close");
        later(&SmtpSession::connectionTerminated);
    }
    QByteArray lastResponse() const override { return m_last; }
    QString errorString() const override {
        return m_script.loseConnectionOnSend
                   ? QStringLiteral("The remote host closed the connection")
                   : QString();
    }

private:
    void later(void (SmtpSession::*signal)()) {
        QMetaObject::invokeMethod(
            this, [this, signal] { Q_EMIT(this->*signal)
                                   (); }, Qt::QueuedConnection);
    }

    Script m_script;
    QStringList& m_calls;
    QByteArray m_message;
    QByteArray m_last;
    bool m_tls = false;
};
