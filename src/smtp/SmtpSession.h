#pragma once

#include <QByteArray>
#include <QObject>
#include <QString>
#include <QStringList>

/**
 * One SMTP conversation carrying one message, as a delivery drives it: connect, upgrade to TLS
 * when asked, authenticate when asked, send, close. Every outcome arrives as a signal on the
 * main loop, never from inside the call that caused it, so a slot may call the next operation
 * or close the session at once. SmtpClient is the real one; tests hand in sessions that
 * misbehave on purpose.
 *
 * The session is owned by whoever created it; after connectionTerminated or connectionTimedOut
 * it does nothing more and may be deleted (with deleteLater from a slot).
 */
class SmtpSession : public QObject {
    Q_OBJECT

public:
    using QObject::QObject;
    ~SmtpSession() override = default;

    /** Starts connecting without blocking: connectionEstablished, then serviceInitialized. */
    virtual void connectInBackgroundAndNotify() = 0;
    /** Whether the transport is TLS: from the start on port 465, after startTLS elsewhere. */
    virtual bool isSSL() const = 0;
    /** Runs the TLS handshake on an implicit-TLS transport, before the greeting is read. */
    virtual void startSSL() = 0;
    /** STARTTLS on a plain transport; serviceInitialized again once upgraded. */
    virtual void startTLS() = 0;
    /** The mechanisms the server announced in its EHLO reply. */
    virtual QStringList supportedMechanisms() const = 0;
    /** "PLAIN", "LOGIN" or "CRAM-MD5": authenticationCompleted or authenticationFailed. */
    virtual void authenticate(const QString& user, const QString& password,
                              const QString& mechanism) = 0;
    /**
     * The message to send: its bytes (CRLF line ends, not dot-stuffed), the envelope sender
     * and recipients.
     */
    virtual void setMessage(const QByteArray& message, const QString& sender,
                            const QStringList& recipients) = 0;
    /** Sends the message set: messageSent or messageNotSent. */
    virtual void sendMessage() = 0;
    /** QUIT and close: connectionTerminated. */
    virtual void close() = 0;
    /** The server's last reply, all its lines, as received (empty before any). */
    virtual QByteArray lastResponse() const = 0;
    /** Why the last failure happened, for the status line ("certificate untrusted", ...). */
    virtual QString errorString() const = 0;
    /**
     * Whether the last message went out whole, up to its final dot: a connection lost after
     * that may have delivered it, one lost before cannot have.
     */
    virtual bool messageWritten() const { return false; }
    /** Whether the last refusal answered MAIL FROM: it concerns the sender, so every copy. */
    virtual bool senderRefused() const { return false; }
    /** The largest message the server takes, from its EHLO SIZE keyword; 0 when unknown. */
    virtual qint64 sizeLimit() const { return 0; }

Q_SIGNALS:
    void connectionEstablished();
    void serviceInitialized();
    void authenticationCompleted();
    void authenticationFailed();
    void messageSent();
    void messageNotSent();
    /** The connection broke or a TLS handshake failed; the reason is in errorString(). */
    void connectionLost();
    void connectionTimedOut();
    void connectionTerminated();
};
