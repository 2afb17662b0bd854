#pragma once

#include "smtp/SmtpReply.h"
#include "smtp/SmtpSession.h"

#include <QByteArray>
#include <QSslConfiguration>
#include <QSslError>
#include <QString>
#include <QStringList>
#include <QTimer>

#include <chrono>
#include <optional>

class QSslSocket;
class QTcpSocket;

/**
 * The SMTP transport (RFC 5321) over QSslSocket, or a plain QTcpSocket for a session that will
 * never use TLS: one object per connection and message, owned
 * by its creator. Every signal is queued to the main loop, never emitted from inside the call
 * that caused it. Exactly one of connectionTerminated (after close()), connectionLost and
 * connectionTimedOut ends a session; after it the object does nothing more. An operation
 * called in a state that does not allow it is ignored with a warning.
 *
 * connectionLost: the connection broke or the server closed it, refused the session (a greeting
 * other than 220), refused both EHLO and HELO, or sent something that is not SMTP.
 * connectionTimedOut: a waiting limit passed, the server could not be reached, or TLS failed
 * (handshake, untrusted certificate, wrong host name, STARTTLS refused). TLS failures end the
 * session like a time-out on purpose: the user asked for TLS, so nothing more may go to that
 * server, and the delivery run halts instead of trying the next recipient; an unreachable
 * server halts it alike, as every later recipient would fail the same way.
 *
 * TLS: on port 465 (or after setImplicitTLS) the transport is implicit TLS (RFC 8314): isSSL()
 * is true from the start and the greeting is read only after startSSL()'s handshake; without
 * startSSL() the session waits until its time-out. Elsewhere startTLS() sends STARTTLS
 * (RFC 3207) and EHLO again. Certificates are checked against the system's trust store plus
 * the certificates of SSL_CERT_FILE / SSL_CERT_DIR when set, and against the host name.
 *
 * A refused MAIL, RCPT (any one recipient), DATA or end of data is messageNotSent with the
 * refusal in lastResponse(); the session stays open for close(). When the server offers
 * PIPELINING (RFC 2920), MAIL, every RCPT and DATA go in one write and their replies are read
 * in order; the first refusal among them is the one reported. Several messages may go over one
 * session, one sendMessage() after the other; after a refusal the next begins with RSET
 * (RFC 5321 4.1.1.5). What is refused before
 * anything is sent (a CR, LF or NUL in a credential, a control character or angle bracket in
 * an address, a message above the server's SIZE, an unknown mechanism) is authenticationFailed
 * or messageNotSent with lastResponse() empty, as no reply belongs to it. errorString() gives
 * the reason of every failure in words for the status line; it never holds the password.
 */
class SmtpClient : public SmtpSession {
    Q_OBJECT

public:
    /** Where the conversation stands; each state says what the client waits for. */
    enum class State {
        Unconnected,       ///< Nothing started yet.
        Connecting,        ///< TCP connection under way.
        AwaitingSSL,       ///< Implicit TLS: connected, waiting for startSSL().
        SSLHandshake,      ///< Implicit TLS handshake under way; the greeting follows it.
        Greeting,          ///< Waiting for the server's 220 greeting.
        Ehlo,              ///< EHLO sent, waiting for its reply.
        Helo,              ///< EHLO refused, HELO sent, waiting for its reply.
        Ready,             ///< Service initialized: waiting for the next operation.
        StartTLS,          ///< STARTTLS sent, waiting for its 220.
        TLSHandshake,      ///< STARTTLS accepted, handshake under way; EHLO follows it.
        AuthLoginUser,     ///< AUTH LOGIN sent, waiting for the user-name challenge.
        AuthLoginPassword, ///< User name sent, waiting for the password challenge.
        AuthCramChallenge, ///< AUTH CRAM-MD5 sent, waiting for the server's challenge.
        AuthResult,        ///< Credentials sent, waiting for 235 or a refusal.
        AuthCancelled,     ///< Unexpected challenge answered with "*", waiting for the refusal.
        Reset,             ///< RSET sent before a new transaction, waiting for its reply.
        MailFrom,          ///< MAIL FROM sent, waiting for its reply.
        RcptTo,            ///< RCPT TO sent for one recipient, waiting for its reply.
        Data,              ///< DATA sent, waiting for 354.
        DataEnd,           ///< Message and final dot sent, waiting for the end-of-data reply.
        Quit,              ///< QUIT sent, waiting for 221 or the server to close.
        Closed,            ///< Over: the one ending signal has been queued.
    };
    Q_ENUM(State)

    static constexpr std::chrono::seconds connectLimit{30};
    static constexpr std::chrono::seconds replyLimit{5 * 60};
    static constexpr std::chrono::seconds dataEndLimit{10 * 60};

    /** Whether the session can go TLS. */
    enum class Transport {
        TlsCapable, ///< implicit TLS, or STARTTLS when asked
        PlainOnly,  ///< never TLS: a plain socket, which spares loading the TLS library; a
                    ///< startSSL() or startTLS() fails the session as a failed handshake does
    };

    /**
     * An unconnected session to host:port. `timeout` caps every waiting limit above (the
     * time-out setting); zero or less keeps the limits as they are.
     */
    SmtpClient(const QString& host, quint16 port,
               std::chrono::seconds timeout = std::chrono::seconds::zero(),
               QObject* parent = nullptr, Transport transport = Transport::TlsCapable);
    ~SmtpClient() override;

    void connectInBackgroundAndNotify() override;
    bool isSSL() const override;
    void startSSL() override;
    void startTLS() override;
    QStringList supportedMechanisms() const override;
    void authenticate(const QString& user, const QString& password,
                      const QString& mechanism) override;
    void setMessage(const QByteArray& message, const QString& sender,
                    const QStringList& recipients) override;
    void sendMessage() override;
    void close() override;
    QByteArray lastResponse() const override;
    QString errorString() const override;
    bool messageWritten() const override { return m_messageWritten; }
    qint64 sizeLimit() const override { return m_capabilities.sizeLimit; }
    bool senderRefused() const override { return m_senderRefused; }

    State state() const { return m_state; }
    /** Implicit TLS on another port than 465, for servers set up so; only before connecting. */
    void setImplicitTLS(bool implicit);

    /**
     * The TLS settings of every session: the defaults, plus the certificates of
     * SSL_CERT_FILE and of the folders of SSL_CERT_DIR (colon-separated) as trusted CAs.
     * Built once and shared by every session while those variables stay the same.
     */
    static QSslConfiguration tlsConfiguration();

private:
    using Signal = void (SmtpSession::*)();

    bool expect(State state, const char* operation) const;
    void notify(Signal signal);
    void finish(Signal signal, const QString& why);
    void enter(State state);
    void startTimer(std::chrono::seconds limit);
    void send(const QByteArray& command);
    void forgetCredentials();

    void onConnected();
    void onEncrypted();
    void acknowledgePromptly();
    void onSocketError();
    void onDisconnected();
    void onTimeout();
    void failHandshake();
    bool readsReplies() const;
    void readReplies();
    void handleReply(int code);

    void onGreeting(int code);
    void sendEhlo();
    void onEhlo(int code);
    void onHelo(int code);
    void onStartTLS(int code);
    void startEncryption(State handshake);
    void onAuthReply(int code);
    void answerChallenge();
    QByteArray cramMd5Response() const;
    void failAuthentication(const QString& why);
    QString envelopeProblem() const;
    void refuseBeforeSending(const QString& why);
    void refuseMessage();
    void onReset(int code);
    void onMailFrom(int code);
    void onPipelinedReply(int code, State next);
    void sendNextRecipient();
    void onRcptTo(int code);
    void onData(int code);
    void onDataEnd(int code);
    void onQuit(int code);
    void failTLS(const QString& why);
    /** startSSL() or startTLS() on a PlainOnly session. */
    void failWithoutTLS();
    QByteArray ehloDomain() const;
    QString replyText() const;

    /** The socket when it can go TLS, else null. */
    QSslSocket* m_tls;
    QTcpSocket* m_socket;
    QTimer m_timer;
    QString m_host;
    quint16 m_port;
    std::chrono::seconds m_timeoutCap;
    bool m_implicitTLS;
    State m_state = State::Unconnected;

    SmtpReplyReader m_replies;
    SmtpReply m_reply; // the last one: lastResponse()
    QString m_errorString;
    QList<QSslError> m_sslErrors;

    SmtpCapabilities m_capabilities;

    QByteArray m_user;
    QByteArray m_password;

    QByteArray m_message;
    QString m_sender;
    QStringList m_recipients;
    qsizetype m_nextRecipient = 0;
    /** The envelope went in one write: replies are read without answering each. */
    bool m_pipelined = false;
    /** The first refusal among pipelined replies, reported once DATA's reply is in. */
    std::optional<SmtpReply> m_refusal;
    /** A refused transaction may be half open: the next one on this session starts with RSET. */
    bool m_resetFirst = false;
    /** The envelope that waits for RSET's reply when it cannot go in the same write. */
    QByteArray m_envelope;
    bool m_messageWritten = false;
    bool m_senderRefused = false;
};
