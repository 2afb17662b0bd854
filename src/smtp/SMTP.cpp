#include "smtp/SMTP.h"

#include "attachments/AttachmentsController.h"
#include "controller/PelmoController.h"
#include "smtp/MessageAssembly.h"
#include "smtp/SmtpSession.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/TextUtilities.h"

#include <QCoreApplication>
#include <QDateTime>

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

QString now() {
    return DateDescription(QDateTime::currentDateTime());
}

} // namespace

SMTP::SMTP(PelmoController& controller) : QObject(&controller), m_controller(controller) {}

SMTP::~SMTP() = default;

void SMTP::enter(State state) {
    m_state = state;
    const bool terminal = state == State::Stalled || state == State::Aborted ||
                          state == State::Halted || state == State::Ended;
    if (terminal && !m_finished) {
        m_finished = true;
        Q_EMIT finished(m_succeeded);
    }
}

template <class Step>
void SMTP::trapped(Step step) {
    try {
        step();
    } catch (const PelmoException& failure) {
        trap(failure);
    }
}

void SMTP::trap(const PelmoException& failure) {
    m_controller.statusMsg(LocalizedFormat("Error (%@): %@", {failure.name(), failure.reason()}));
    PelmoView& view = m_controller.view();
    // Start, then stop at once: the indicator ends spinning and still, whatever it showed.
    if (m_controller.getPeople()) {
        view.setProgressBusy();
        view.startProgressAnimation();
    }
    view.stopProgressAnimation();
    view.setSendButtonTitle(LocalizedStringNS("Send"));
    enter(State::Halted);
}

void SMTP::sendMail() {
    trapped([this] { start(); });
}

void SMTP::start() {
    m_controller.statusMsg(LocalizedStringNS("[Mailing started at ") + now() +
                           LocalizedStringNS("]"));
    m_succeeded = false;
    buildMessage();
    openSession();
}

void SMTP::buildMessage() {
    m_message = std::make_unique<MessageAssembly>();
    if (!m_controller.getPeople())
        m_controller.view().startProgressAnimation();
    m_message->setSubject(m_controller.getSubject());
    const QString fromName = m_controller.getFromName();
    m_message->setFrom(fromName, m_controller.getFrom());
    const QString toName = m_controller.getToName();
    const QString to = m_controller.getTo();
    m_controller.statusMsg(QLatin1Char('[') + now() + QLatin1Char(']') +
                           LocalizedStringNS(" Mail to: ") + m_controller.getToName() +
                           QLatin1String(" <") + m_controller.getTo() + QLatin1Char('>'));
    m_message->setTo(toName, to);
    switch (m_controller.getSelectedContentType()) {
    case 0:
        createMessageBodyPart(m_controller.getHTMLMessage(), QStringLiteral("text/html"));
        break;
    case 1:
        createMessageBodyPart(m_controller.getMessage(), QStringLiteral("text/plain"));
        break;
    default:
        break;
    }
    const QString page = m_controller.getWebPageOrFileContents();
    if (!page.isNull())
        createMessageBodyPart(page, QStringLiteral("text/html"));
    // A file that has gone or cannot be read is left out without a word.
    for (const QString& path : m_controller.getAttachments().getAttachments())
        m_message->addAttachment(path);
}

void SMTP::createMessageBodyPart(const QString& content, const QString& mimeType) {
    m_message->addBodyPart(content, mimeType, m_controller.getSelectedCharacterSet());
}

void SMTP::openSession() {
    const QString server = m_controller.getServer();
    SmtpSession* session = m_controller.createSession(server, m_controller.getPort());
    session->setParent(this);
    m_session = session;
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
        connectionTerminated();
    });
    connect(session, &SmtpSession::connectionTimedOut, this, &SMTP::connectionTimedOut);
    connect(session, &SmtpSession::connectionTerminated, this, &SMTP::connectionTerminated);
    session->setMessage(m_message->toBytes(), m_message->envelopeSender(),
                        m_message->envelopeRecipients());
    m_message.reset();
    m_controller.statusMsg(
        LocalizedFormat("Connecting to the %@ server.", {m_controller.getServer()}));
    enter(State::Connecting);
    session->connectInBackgroundAndNotify();
}

void SMTP::connectionEstablished() {
    enter(State::Connected);
    m_controller.statusMsg(
        LocalizedFormat("Connected to the %@ server.", {m_controller.getServer()}));
    if (!m_controller.useSSL())
        return;
    // Only an implicit-TLS transport shakes hands here; a plain one is upgraded by STARTTLS
    // once the server has greeted.
    if (m_session->isSSL()) {
        m_controller.statusMsg(LocalizedStringNS("Starting SSL."));
        m_session->startSSL();
    }
}

void SMTP::serviceInitialized() {
    if (m_controller.useSSL() && !m_session->isSSL()) {
        m_controller.statusMsg(LocalizedStringNS("SSL handshaking..."));
        enter(State::Upgrading);
        m_session->startTLS();
        return;
    }
    if (m_controller.getSelectedLoginMechanism() == 0) {
        m_controller.statusMsg(LocalizedStringNS("Sending the message."));
        enter(State::Sending);
        m_session->sendMessage();
        return;
    }
    authenticate();
}

void SMTP::authenticate() {
    // The list is shown, never checked: a mechanism the server did not announce is tried
    // all the same, and its refusal arrives as authenticationFailed.
    const QString offered = QLatin1Char('(') +
                            m_session->supportedMechanisms().join(QLatin1String(", ")) +
                            QLatin1Char(')');
    m_controller.statusMsg(LocalizedFormat("Available authentication mechanisms: %@", {offered}));
    const char* mechanism = mechanismName(m_controller.getSelectedLoginMechanism());
    if (mechanism == nullptr) {
        enter(State::Stalled);
        return;
    }
    const QString user = m_controller.getUsername();
    const QString password = m_controller.getPassword();
    enter(State::Authenticating);
    m_session->authenticate(user, password, QString::fromLatin1(mechanism));
}

void SMTP::authenticationCompleted() {
    m_controller.statusMsg(LocalizedStringNS("Authentication completed. Sending the message."));
    enter(State::Sending);
    m_session->sendMessage();
}

void SMTP::authenticationFailed() {
    m_controller.statusMsg(LocalizedStringNS("Authentication failed. Closing the connection."));
    reportFailureReason();
    enter(State::Closing);
    m_session->close();
}

void SMTP::messageSent() {
    m_controller.addRecipient(m_controller.getTo());
    m_controller.statusMsg(LocalizedStringNS("Message sent. Closing the connection."));
    enter(State::Closing);
    m_session->close();
    m_succeeded = true;
}

void SMTP::messageNotSent() {
    m_controller.view().beep();
    m_succeeded = false;
    const QString reply = DecodeUtf8Strictly(m_session->lastResponse());
    if (!reply.isEmpty())
        m_controller.statusMsg(QStringLiteral("Message not sent: %1").arg(reply.trimmed()));
    else
        reportFailureReason();
    m_controller.abort();
    enter(State::Aborted);
}

void SMTP::reportFailureReason() {
    if (m_session && !m_session->errorString().isEmpty())
        m_controller.statusMsg(m_session->errorString());
}

void SMTP::connectionTimedOut() {
    m_controller.statusMsg(LocalizedStringNS("Connection lost."));
    // A refused certificate ends the session like a time-out; the user must see why.
    reportFailureReason();
    releaseSession();
    enter(State::Ended);
    deleteLater();
}

void SMTP::releaseSession() {
    if (m_session)
        m_session->deleteLater();
    m_session = nullptr;
}

void SMTP::connectionTerminated() {
    m_controller.statusMsg(LocalizedStringNS("Connection closed. Done."));
    releaseSession();
    deleteLater();
    // The next recipient's delivery, if any, starts before this one reports its end.
    if (!m_controller.sendMember())
        finishRun();
    enter(State::Ended);
}

void SMTP::finishRun() {
    if (!m_controller.getPeople())
        m_controller.view().stopProgressAnimation();
    if (!m_succeeded)
        return;
    switch (m_controller.completionAction()) {
    case 1:
        QCoreApplication::quit();
        break;
    case 2:
        m_controller.reset();
        break;
    default:
        break;
    }
}
