#pragma once

#include "smtp/DeliveryRequest.h"

#include <QFutureWatcher>
#include <QObject>
#include <QPointer>

#include <optional>

class MessageAssembly;
class SmtpSession;

/**
 * One delivery: one message to one recipient over one SMTP session (RFC 5321), driven from a
 * DeliveryRequest. It builds the MIME message, connects, upgrades to TLS when asked, logs in
 * when asked, sends, and closes; every step is reported as a status line.
 *
 * The object owns its session. It ends in one of four ways, each reported once by finished():
 * the message accepted with the session kept open for the next (Kept, see setKeepSession()),
 * the connection closed or was lost (Ended: the run may hand over to the next recipient), it
 * timed out or TLS failed (TimedOut), or a failure stopped it (Halted: the session is closed at
 * once and whatever the server does later is ignored). A refused message (refused()) and an
 * unknown login mechanism (stalled()) leave the connection open, and its end is reported as
 * Ended like any other.
 */
class SMTP : public QObject {
    Q_OBJECT

public:
    enum class State {
        Created,             ///< made, start() not yet called
        Connecting,          ///< connecting in the background
        Connected,           ///< transport up, waiting for the greeting and capabilities
        Upgrading,           ///< STARTTLS under way
        AwaitingCredentials, ///< the login asked for, not yet answered
        Authenticating,      ///< credentials sent
        Building,            ///< the server is ready for the message, still being built
        Sending,             ///< message handed to the session
        Closing,             ///< QUIT sent after success, a refused login or a refused message
        Stalled,             ///< an unknown login mechanism: nothing sent, connection open
        Aborted,             ///< the message was refused; the connection is left open
        Halted,              ///< a failure stopped the delivery; the session is closed
        TimedOut,            ///< a time-out or a failed TLS handshake ended the session
        Ended,               ///< the connection closed or was lost
        Kept,                ///< the message was accepted; the open session awaits the next
    };
    Q_ENUM(State)

    /** session is taken over (reparented to this object). */
    SMTP(DeliveryRequest request, SmtpSession* session, QObject* parent = nullptr);
    ~SMTP() override;

    /**
     * Checks the message's header texts (a refusal halts the delivery before any connection),
     * then builds the message on a worker thread while connecting; returns at once. The
     * message goes out once the server and the message are both ready.
     */
    void start();
    /**
     * Builds the message and sends it over the session given at construction, which an
     * earlier delivery left connected, greeted and logged in (see setKeepSession()).
     */
    void startOnOpenSession();
    /**
     * Once the message is accepted, leaves the session open and ends as Kept instead of
     * closing it; takeSession() then hands it over. A refusal with 421 then closes it.
     */
    void setKeepSession(bool keep) { m_keep = keep; }
    /** The session a Kept delivery left open, reparented to nothing; the caller takes it. */
    SmtpSession* takeSession();
    /** Closes the connection a refused message left open, once; nothing in any other state. */
    void closeAfterRefusal();
    /** Whether the message went out whole before the delivery ended, so that it may have
     * arrived even though its acceptance was never read. */
    bool messageWritten() const { return m_messageWritten; }

    /** The message a delivery of request sends, built into message (an empty one). */
    static void assemble(const DeliveryRequest& request, MessageAssembly& message);
    /** A message built, or why it could not be. */
    struct Built {
        QByteArray bytes;
        QString sender;
        QStringList recipients;
        QString messageId;
        std::optional<PelmoException> failure;
    };
    /** The message a delivery of request sends, on any thread while nothing changes request. */
    static Built build(const DeliveryRequest& request);

    State state() const { return m_state; }
    /** True once the server accepted the message. */
    bool succeeded() const { return m_succeeded; }
    /**
     * Why the message was not accepted, in the words shown to the user (the server's reply, the
     * connection's error, the setting that was missing); the first cause wins. Empty while
     * nothing has failed, and when the connection ended without a word.
     */
    const QString& failureReason() const { return m_failure; }
    /** Whether the server refused the sender (MAIL FROM) rather than this copy's recipient or
     *  content: a refusal that every copy would meet. */
    bool senderRefused() const;
    const DeliveryRequest& request() const { return m_request; }
    /** The message's Message-ID, once the message is built. */
    const QString& messageId() const { return m_messageId; }

Q_SIGNALS:
    /** A line for the status line and the activity log. */
    void statusMessage(const QString& text);
    /** The message is about to go to the server; a slot connected directly finishes first. */
    void aboutToSend();
    /** The server accepted the message for recipient, the address it was sent to. */
    void accepted(const QString& recipient);
    /** The server refused the message; its reply has been shown when readable. */
    void refused();
    /** The login mechanism is unknown: the list is shown and nothing more is sent. */
    void stalled();
    /** The delivery is over: state() is Ended, TimedOut or Halted. */
    void finished();

private:
    void buildInBackground();
    void messageBuilt();
    void setMessage();
    /** Sends the message, or waits in Building until it is built. */
    void sendMessage();
    void connectSession();
    void connectionEstablished();
    void serviceInitialized();
    void askCredentials();
    void authenticate(const Credentials& credentials);
    void authenticationCompleted();
    void authenticationFailed();
    void messageSent();
    void messageNotSent();
    void connectionTimedOut();
    void connectionTerminated();
    void reportFailureReason();
    /** Records why the delivery failed, unless an earlier cause is known. */
    void failed(const QString& why);
    void halt(const PelmoException& failure);
    void end(State state);
    /** Runs step, halting on a failure. */
    template <class Step>
    void trapped(Step step);
    void status(const QString& text) { Q_EMIT statusMessage(text); }

    DeliveryRequest m_request;
    QPointer<SmtpSession> m_session;
    State m_state = State::Created;
    bool m_succeeded = false;
    QString m_failure;
    QString m_messageId;
    bool m_keep = false;
    bool m_messageWritten = false;
    /** Built, not yet handed to the session. */
    std::optional<Built> m_message;
    QFutureWatcher<Built> m_building;
};
