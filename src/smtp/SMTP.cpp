#include "smtp/SMTP.h"

#include "smtp/EncodedAttachments.h"
#include "smtp/MessageAssembly.h"
#include "smtp/SmtpSession.h"
#include "util/InBackground.h"
#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

namespace {

const char* mechanismName(int mechanism) {
    switch (mechanism) {
    case 1:
        return "PLAIN";
    case 2:
        return "LOGIN";
    case 3:
        return "CRAM-MD5";
    default:
        return nullptr;
    }
}

} // namespace

SMTP::SMTP(DeliveryRequest request, SmtpSession* session, QObject* parent)
    : QObject(parent), m_request(std::move(request)), m_session(session) {
    session->setParent(this);
}

SMTP::~SMTP() = default;

template <class Step>
void SMTP::trapped(Step step) {
    try {
        step();
    } catch (const PelmoException& failure) {
        halt(failure);
    }
}

void SMTP::halt(const PelmoException& failure) {
    const QString text = failure.statusText();
    status(text);
    failed(text);
    // Nothing the server does from now on may start a step: its signals are cut, and the
    // connection is closed at once; the session goes when it has closed.
    if (m_session) {
        SmtpSession* session = m_session;
        disconnect(session, nullptr, this, nullptr);
        session->setParent(nullptr);
        for (auto signal : {&SmtpSession::connectionTerminated, &SmtpSession::connectionLost,
                            &SmtpSession::connectionTimedOut})
            connect(session, signal, session, &QObject::deleteLater);
        session->close();
        m_session = nullptr;
    }
    end(State::Halted);
}

void SMTP::end(State state) {
    m_state = state;
    m_messageWritten = m_session && m_session->messageWritten();
    if (m_session)
        m_session->deleteLater();
    m_session = nullptr;
    Q_EMIT finished();
}

SmtpSession* SMTP::takeSession() {
    if (m_state != State::Kept || !m_session)
        return nullptr;
    SmtpSession* session = m_session;
    disconnect(session, nullptr, this, nullptr);
    session->setParent(nullptr);
    m_session = nullptr;
    return session;
}

void SMTP::startOnOpenSession() {
    trapped([this] {
        m_succeeded = false;
        setMessage();
        connectSession();
        status(LocalizedStringNS("Sending the message."));
        sendMessage();
    });
}

void SMTP::assemble(const DeliveryRequest& request, MessageAssembly& message) {
    message.setSubject(request.subject);
    message.setFrom(request.senderName, request.sender);
    message.setTo(request.recipientName, request.recipient);
    for (qsizetype i = 0; i < request.bodyParts.size(); ++i) {
        const DeliveryRequest::BodyPart& part = request.bodyParts.at(i);
        if (i == 0 && !request.plainAlternative.isNull())
            message.addAlternativeBodyParts(request.plainAlternative, part.text,
                                            request.characterSet);
        else
            message.addBodyPart(part.text, part.mimeType, request.characterSet);
    }
    message.setListUnsubscribe(request.listUnsubscribe);
    // A file that has gone or cannot be read is left out without a word.
    for (const QString& path : request.attachments) {
        if (request.encodedAttachments)
            message.addAttachment(path, *request.encodedAttachments);
        else
            message.addAttachment(path);
    }
}

// Thread-safe: the request is a copy, its attachments' cache locks itself.
SMTP::Built SMTP::build(const DeliveryRequest& request) {
    Built built;
    try {
        MessageAssembly message;
        assemble(request, message);
        built.bytes = message.toBytes();
        built.sender = message.envelopeSender();
        built.recipients = message.envelopeRecipients();
        built.messageId = message.messageId();
    } catch (const PelmoException& failure) {
        built.failure = failure;
    }
    return built;
}

// Builds the message now; throws as the assembly does.
void SMTP::setMessage() {
    m_message = build(m_request);
    if (m_message->failure)
        throw *m_message->failure;
}

// Building a copy is most of its work on this thread; on a worker it is mostly done by the time
// the server has greeted and answered EHLO, and it does not hold up this thread meanwhile.
void SMTP::buildInBackground() {
    connect(&m_building, &QFutureWatcherBase::finished, this, &SMTP::messageBuilt);
    m_building.setFuture(InBackground<Built>([request = m_request] { return build(request); }));
}

void SMTP::messageBuilt() {
    if (!m_session || m_state == State::Halted || m_state == State::TimedOut ||
        m_state == State::Ended)
        return;
    m_message = m_building.result();
    if (m_state == State::Building)
        trapped([this] { sendMessage(); });
}

// The message goes to the session only now, whenever it was built, so that the session sees
// the same calls in the same order however long the build took.
void SMTP::sendMessage() {
    if (!m_message) {
        m_state = State::Building;
        return;
    }
    // What the check before connecting let through does not fail to build; should it all the
    // same, the delivery stops here, where the message is wanted.
    if (m_message->failure)
        throw *m_message->failure;
    m_messageId = m_message->messageId;
    Q_EMIT aboutToSend();
    m_session->setMessage(m_message->bytes, m_message->sender, m_message->recipients);
    m_message.reset();
    m_state = State::Sending;
    m_session->sendMessage();
}

void SMTP::start() {
    trapped([this] {
        m_succeeded = false;
        MessageAssembly::checkHeaders(m_request.subject, m_request.senderName, m_request.sender,
                                      m_request.recipientName, m_request.recipient,
                                      m_request.attachments);
        connectSession();
        buildInBackground();
        status(LocalizedFormat("Connecting to the %@ server.", {m_request.server}));
        m_state = State::Connecting;
        m_session->connectInBackgroundAndNotify();
    });
}

void SMTP::connectSession() {
    SmtpSession* session = m_session;
    connect(session, &SmtpSession::connectionEstablished, this,
            [this] { trapped([this] { connectionEstablished(); }); });
    connect(session, &SmtpSession::serviceInitialized, this,
            [this] { trapped([this] { serviceInitialized(); }); });
    connect(session, &SmtpSession::authenticationCompleted, this,
            [this] { trapped([this] { authenticationCompleted(); }); });
    connect(session, &SmtpSession::authenticationFailed, this,
            [this] { trapped([this] { authenticationFailed(); }); });
    connect(session, &SmtpSession::messageSent, this,
            [this] { trapped([this] { messageSent(); }); });
    connect(session, &SmtpSession::messageNotSent, this, &SMTP::messageNotSent);
    // A lost connection ends the delivery exactly as a closed one does, once its cause is shown.
    connect(session, &SmtpSession::connectionLost, this, [this] {
        reportFailureReason();
        if (!m_succeeded)
            failed(LocalizedStringNS("Connection lost."));
        connectionTerminated();
    });
    connect(session, &SmtpSession::connectionTimedOut, this, &SMTP::connectionTimedOut);
    connect(session, &SmtpSession::connectionTerminated, this, &SMTP::connectionTerminated);
}

void SMTP::connectionEstablished() {
    m_state = State::Connected;
    status(LocalizedFormat("Connected to the %@ server.", {m_request.server}));
    if (!m_request.useSSL)
        return;
    // Only an implicit-TLS transport shakes hands here; a plain one is upgraded by STARTTLS
    // once the server has greeted.
    if (m_session->isSSL()) {
        status(LocalizedStringNS("Starting SSL."));
        m_session->startSSL();
    }
}

void SMTP::serviceInitialized() {
    if (m_request.useSSL && !m_session->isSSL()) {
        status(LocalizedStringNS("SSL handshaking..."));
        m_state = State::Upgrading;
        m_session->startTLS();
        return;
    }
    if (m_request.loginMechanism == 0) {
        status(LocalizedStringNS("Sending the message."));
        return sendMessage();
    }
    // The list is shown, never checked: a mechanism the server did not announce is tried all
    // the same, and its refusal arrives as authenticationFailed.
    status(LocalizedFormat("Available authentication mechanisms: %@",
                           {QLatin1Char('(') +
                            m_session->supportedMechanisms().join(QLatin1String(", ")) +
                            QLatin1Char(')')}));
    if (mechanismName(m_request.loginMechanism) == nullptr) {
        failed(LocalizedStringNS("The login method chosen in Preferences is unknown."));
        m_state = State::Stalled;
        Q_EMIT stalled();
        return;
    }
    askCredentials();
}

void SMTP::askCredentials() {
    m_state = State::AwaitingCredentials;
    // The answer may come after the connection has ended or the delivery was deleted.
    const QPointer<SMTP> self(this);
    m_request.credentials([self](const Credentials& credentials) {
        if (self && self->m_state == State::AwaitingCredentials)
            self->trapped([&] { self->authenticate(credentials); });
    });
}

void SMTP::authenticate(const Credentials& credentials) {
    if (credentials.failure)
        throw *credentials.failure;
    m_state = State::Authenticating;
    m_session->authenticate(credentials.user, credentials.password,
                            QString::fromLatin1(mechanismName(m_request.loginMechanism)));
}

void SMTP::authenticationCompleted() {
    status(LocalizedStringNS("Authentication completed. Sending the message."));
    sendMessage();
}

void SMTP::authenticationFailed() {
    status(LocalizedStringNS("Authentication failed. Closing the connection."));
    reportFailureReason();
    failed(LocalizedStringNS("Authentication failed."));
    m_state = State::Closing;
    m_session->close();
}

void SMTP::messageSent() {
    // The address the copy went to, whatever the window's fields say by now.
    Q_EMIT accepted(m_request.recipient);
    m_succeeded = true;
    if (m_keep) {
        status(LocalizedStringNS("Message sent."));
        m_state = State::Kept;
        return Q_EMIT finished();
    }
    status(LocalizedStringNS("Message sent. Closing the connection."));
    m_state = State::Closing;
    m_session->close();
}

void SMTP::messageNotSent() {
    m_succeeded = false;
    const QString reply = DecodeUtf8Strictly(m_session->lastResponse());
    if (!reply.isEmpty()) {
        status(LocalizedStringNS("Message not sent: %1").arg(reply.trimmed()));
        failed(reply.trimmed());
    } else {
        reportFailureReason();
        failed(LocalizedStringNS("The server refused the message."));
    }
    m_state = State::Aborted;
    Q_EMIT refused();
    // RFC 5321 4.2.2: with 421 the server is closing the channel. A kept connection is left
    // no later than the server leaves it, so that the copy can go again over a new one.
    if (m_keep && reply.startsWith(QLatin1String("421")))
        closeAfterRefusal();
}

// RFC 5321 4.1.1.10: QUIT; the session reports connectionTerminated once the server has
// answered, and the delivery ends as Ended.
void SMTP::closeAfterRefusal() {
    if (m_state != State::Aborted || !m_session)
        return;
    // Once only: a second QUIT would end the delivery twice.
    m_state = State::Closing;
    m_session->close();
}

bool SMTP::senderRefused() const {
    return m_session && m_session->senderRefused();
}

void SMTP::reportFailureReason() {
    if (m_session && !m_session->errorString().isEmpty()) {
        status(m_session->errorString());
        failed(m_session->errorString());
    }
}

void SMTP::failed(const QString& why) {
    if (m_failure.isEmpty())
        m_failure = why;
}

void SMTP::connectionTimedOut() {
    status(LocalizedStringNS("Connection lost."));
    // A refused certificate ends the session like a time-out; the user must see why.
    reportFailureReason();
    failed(LocalizedStringNS("Connection lost."));
    end(State::TimedOut);
}

void SMTP::connectionTerminated() {
    status(LocalizedStringNS("Connection closed. Done."));
    end(State::Ended);
}
