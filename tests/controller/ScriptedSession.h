#pragma once

#include "smtp/SmtpSession.h"

#include <QMetaObject>
#include <QTimer>

#include <functional>
#include <memory>

// A session that plays the server's part from a script, for the turns a real server is hard to
// bring to: a refused reply that is not UTF-8, a time-out, a connection lost while sending, a
// server that drops an idle connection. Like a real session it answers on the main loop, never
// from inside the call. Every call is written to the transcript it is given.
class ScriptedSession : public SmtpSession {
public:
    struct Script {
        bool implicitTls = false, acceptLogin = true, timeOutOnConnect = false;
        bool loseConnectionOnSend = false, dropWhenIdle = false;
        QByteArray refusal;           // non-empty: the message is refused with this reply
        std::function<void()> onSend; // runs when the message goes
        int loseAtSend = 0;           // the connection is lost at this send of the run (1-based)
        int refuseAtSend = 0;         // set: the refusal is for this send of the run only
        int refusals = 1;             // with refuseAtSend: so many sends from it on are refused
        std::shared_ptr<int> sends = std::make_shared<int>(0); // shared by the run's sessions
    };

    ScriptedSession(const Script& script, QStringList& transcript)
        : m_script(script), m_transcript(transcript), m_tls(script.implicitTls) {}

    void connectInBackgroundAndNotify() override {
        note(QStringLiteral("connect"));
        if (m_script.timeOutOnConnect)
            return later(&SmtpSession::connectionTimedOut);
        later(&SmtpSession::connectionEstablished);
        if (!m_tls)
            later(&SmtpSession::serviceInitialized);
        if (m_script.dropWhenIdle)
            QTimer::singleShot(100, this, [this] {
                if (!m_closed)
                    Q_EMIT connectionLost();
            });
    }
    bool isSSL() const override { return m_tls; }
    void startSSL() override {
        note(QStringLiteral("startSSL")), later(&SmtpSession::serviceInitialized);
    }
    void startTLS() override {
        note(QStringLiteral("startTLS")), m_tls = true, later(&SmtpSession::serviceInitialized);
    }
    QStringList supportedMechanisms() const override { return {"PLAIN", "LOGIN"}; }
    void authenticate(const QString& user, const QString& password,
                      const QString& mechanism) override {
        note(QStringLiteral("auth %1 %2:%3").arg(mechanism, user, password));
        later(m_script.acceptLogin ? &SmtpSession::authenticationCompleted
                                   : &SmtpSession::authenticationFailed);
    }
    void setMessage(const QByteArray&, const QString& sender,
                    const QStringList& recipients) override {
        note(
            QStringLiteral("message from %1 to %2").arg(sender, recipients.join(QLatin1Char(','))));
    }
    void sendMessage() override {
        note(QStringLiteral("send"));
        if (m_script.onSend)
            m_script.onSend();
        const int send = ++*m_script.sends;
        if (m_script.loseConnectionOnSend || send == m_script.loseAtSend)
            return later(&SmtpSession::connectionLost);
        const bool refused =
            !m_script.refusal.isEmpty() &&
            (m_script.refuseAtSend == 0 ||
             (send >= m_script.refuseAtSend && send < m_script.refuseAtSend + m_script.refusals));
        m_last = refused ? m_script.refusal : QByteArray("250 OK");
        later(refused ? &SmtpSession::messageNotSent : &SmtpSession::messageSent);
    }
    void close() override {
        note(QStringLiteral("close")), m_closed = true, later(&SmtpSession::connectionTerminated);
    }
    QByteArray lastResponse() const override { return m_last; }
    QString errorString() const override {
        return m_script.loseConnectionOnSend || m_script.dropWhenIdle
                   ? QStringLiteral("The remote host closed the connection")
                   : QString();
    }

private:
    void note(const QString& call) { m_transcript << QStringLiteral("smtp: ") + call; }
    void later(void (SmtpSession::*signal)()) {
        QMetaObject::invokeMethod(
            this,
            [this, signal] {
                Q_EMIT(this->*signal)
                ();
            },
            Qt::QueuedConnection);
    }

    Script m_script;
    QStringList& m_transcript;
    QByteArray m_last;
    bool m_tls, m_closed = false;
};
