#pragma once

#include "smtp/SmtpClient.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QPointer>
#include <gtest/gtest.h>

// What the delivery asks of a session to 127.0.0.1, in its order: the handshake on an implicit-TLS
// port, STARTTLS, authentication, each message, then close. With nothing to authenticate or send,
// the session is left to end by itself.
struct Plan {
    bool closeFirst = false, implicitTls = false, startSsl = true, startTls = false;
    bool plainOnly = false;
    std::chrono::seconds timeout = std::chrono::seconds(10);
    QString mechanism = {}, user = QStringLiteral("user"), password = {};
    QString sender = QStringLiteral("sender@example.org");
    QStringList recipients = {QStringLiteral("a@example.org")};
    QList<QByteArray> messages = {};
};

// What the session did: its signals, the mechanisms after each EHLO, its last words.
struct Outcome {
    QString signals, error;
    QStringList mechanisms;
    QByteArray lastResponse;
    bool ssl = false;
};

// Runs a client through `plan` from the slots of its signals, as the delivery does, and deletes it
// from the slot of its ending signal after calling it once more, which must change nothing. The
// last words are read at the outcome that made the driver close, or else at the end. No signal
// may arrive from inside a call into the client.
inline Outcome drive(quint16 port, const Plan& plan) {
    Outcome out;
    auto* client = new SmtpClient(QStringLiteral("127.0.0.1"), port, plan.timeout, nullptr,
                                  plan.plainOnly ? SmtpClient::Transport::PlainOnly
                                                 : SmtpClient::Transport::TlsCapable);
    client->setImplicitTLS(plan.implicitTls);
    const QPointer<SmtpClient> alive(client);
    int depth = 0; // above 0 while a call into the client runs
    bool authenticated = plan.mechanism.isEmpty(), read = false;
    qsizetype sent = 0;
    const auto readOutcome = [&] {
        read = true, out.error = client->errorString(), out.ssl = client->isSSL();
        out.lastResponse = client->lastResponse();
    };
    const auto close = [&] { readOutcome(), client->close(), client->close(); };
    const auto next = [&] {
        if (!std::exchange(authenticated, true))
            return client->authenticate(plan.user, plan.password, plan.mechanism);
        if (sent == plan.messages.size())
            return close();
        client->setMessage(plan.messages[sent++], plan.sender, plan.recipients);
        client->sendMessage();
    };
    const auto ended = [&] {
        if (!read)
            readOutcome();
        client->close(), client->sendMessage(), client->connectInBackgroundAndNotify();
        client->deleteLater();
    };
    const auto on = [&](void (SmtpSession::*signal)(), const char* name, auto react) {
        QObject::connect(client, signal, client, [&, name, react] {
            EXPECT_EQ(depth++, 0) << name << " arrived from inside a call";
            out.signals += (out.signals.isEmpty() ? "" : " ") + QString::fromLatin1(name);
            react();
            --depth;
        });
    };
    on(&SmtpSession::connectionEstablished, "connected", [&] {
        if (client->isSSL() && plan.startSsl)
            client->startSSL();
    });
    on(&SmtpSession::serviceInitialized, "ready", [&] {
        out.mechanisms += client->supportedMechanisms().join(QLatin1Char(' '));
        if (plan.startTls && !client->isSSL())
            client->startTLS();
        else if (!authenticated || !plan.messages.isEmpty())
            next();
    });
    on(&SmtpSession::authenticationCompleted, "authenticated", next);
    on(&SmtpSession::messageSent, "sent", next);
    on(&SmtpSession::authenticationFailed, "authFailed", close);
    // A refused message leaves the session for the next one, if the plan has one.
    on(&SmtpSession::messageNotSent, "notSent",
       [&] { sent < plan.messages.size() ? next() : close(); });
    on(&SmtpSession::connectionLost, "lost", ended);
    on(&SmtpSession::connectionTimedOut, "timedOut", ended);
    on(&SmtpSession::connectionTerminated, "terminated", ended);
    if (plan.closeFirst)
        client->close();
    ++depth, client->connectInBackgroundAndNotify(), --depth;
    for (const QDeadlineTimer guard(std::chrono::seconds(20)); alive && !guard.hasExpired();)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents, 50);
    EXPECT_TRUE(alive.isNull()) << "the session did not end: " << out.signals.toStdString();
    delete alive.data();
    return out;
}
