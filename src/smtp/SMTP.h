#pragma once

#include <QObject>
#include <QPointer>

#include <memory>

class MessageAssembly;
class PelmoController;
class PelmoException;
class SmtpSession;

/**
 * One delivery: one message to one recipient over one SMTP session. The controller creates a
 * fresh SMTP for every recipient and starts it with sendMail(); from then on the object builds
 * the message from the controller's getters, drives its session, reports every step through
 * the controller's status line, and hands control back to the controller (sendMember) when the
 * connection has closed.
 *
 * The object owns its session. It is a child of the controller and deletes itself once its
 * session has ended; it emits finished() once, when it reaches a state from which it starts no
 * further step on its own.
 */
class SMTP : public QObject {
    Q_OBJECT

public:
    enum class State {
        Created,        ///< made, sendMail not yet called
        Connecting,     ///< connecting in the background
        Connected,      ///< transport up, waiting for the greeting and capabilities
        Upgrading,      ///< STARTTLS under way
        Authenticating, ///< credentials sent
        Sending,        ///< message handed to the session
        Closing,        ///< QUIT sent after success or a refused login
        Stalled,        ///< an unknown login mechanism: nothing sent, connection left open
        Aborted,        ///< the message was refused and the run stopped
        Halted,         ///< a setting failed validation: no further step
        Ended,          ///< the session has ended
    };
    Q_ENUM(State)

    explicit SMTP(PelmoController& controller);
    ~SMTP() override;

    /** Starts the delivery; returns once the connection attempt runs in the background. */
    void sendMail();

    /** Adds a body part with the chosen character set, base64-encoded. */
    void createMessageBodyPart(const QString& content, const QString& mimeType);

    State state() const { return m_state; }
    bool succeeded() const { return m_succeeded; }

Q_SIGNALS:
    /** The delivery will start nothing more by itself; accepted when the server took the message.
     */
    void finished(bool accepted);

private:
    void connectionEstablished();
    void serviceInitialized();
    void authenticationCompleted();
    void authenticationFailed();
    void messageSent();
    void messageNotSent();
    void connectionTimedOut();
    void connectionTerminated();

    void start();
    void buildMessage();
    void openSession();
    void authenticate();
    void releaseSession();
    /** After the last delivery: the spinner stops, and a success applies the completion action. */
    void finishRun();
    void reportFailureReason();
    void enter(State state);
    /** Runs step, reporting a settings failure the way the status line shows it. */
    template <class Step>
    void trapped(Step step);
    void trap(const PelmoException& failure);

    PelmoController& m_controller;
    std::unique_ptr<MessageAssembly> m_message;
    QPointer<SmtpSession> m_session;
    State m_state = State::Created;
    bool m_succeeded = false;
    bool m_finished = false;
};
