#include "smtp/SmtpClient.h"

#include <QCryptographicHash>
#include <QDir>
#include <QHostAddress>
#include <QHostInfo>
#include <QMessageAuthenticationCode>
#include <QMetaEnum>
#include <QMutex>
#include <QRegularExpression>
#include <QSet>
#include <QSslSocket>
#include <QTcpSocket>
#include <QUrl>

#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <optional>
#include <utility>

namespace {

bool isPositive(int code) {
    return code >= 200 && code < 300;
}

// Lone CR and lone LF become CRLF, and the message ends with a line end: RFC 5321 2.3.8
// allows no other line ends in DATA.
// Whether every CR is followed by LF and every LF preceded by CR.
bool hasCrlfOnly(QByteArrayView text) {
    const char* const begin = text.data();
    const char* const end = begin + text.size();
    for (const char* lf = begin;
         (lf = static_cast<const char*>(std::memchr(lf, '\n', size_t(end - lf)))); ++lf)
        if (lf == begin || lf[-1] != '\r')
            return false;
    for (const char* cr = begin;
         (cr = static_cast<const char*>(std::memchr(cr, '\r', size_t(end - cr)))); ++cr)
        if (cr + 1 == end || cr[1] != '\n')
            return false;
    return true;
}

QByteArray normalizeLineEnds(const QByteArray& message) {
    // A copy from the assembly has CRLF throughout: it is kept as it is, without a copy made on
    // the thread that talks to the server.
    if (message.endsWith("\r\n") && hasCrlfOnly(message))
        return message;
    QByteArray out;
    out.reserve(message.size() + 2);
    const QByteArrayView text(message);
    qsizetype done = 0;
    // Runs between line ends are copied whole: a message is mostly text, and its line ends
    // are already CRLF when it comes from the assembly.
    for (qsizetype cr = text.indexOf('\r'), lf = text.indexOf('\n'); cr >= 0 || lf >= 0;) {
        const qsizetype at = cr < 0 ? lf : lf < 0 ? cr : std::min(cr, lf);
        out.append(text.sliced(done, at - done));
        out.append("\r\n", 2);
        done = at + (at == cr && lf == at + 1 ? 2 : 1);
        if (cr >= 0 && cr < done)
            cr = text.indexOf('\r', done);
        if (lf >= 0 && lf < done)
            lf = text.indexOf('\n', done);
    }
    out.append(text.sliced(done));
    if (!out.isEmpty() && !out.endsWith("\r\n"))
        out += "\r\n";
    return out;
}

// RFC 5321 4.5.2: dot-stuffing, then the end of data "CRLF.CRLF" (the message already ends
// with CRLF). One pass over the dots, which are rare (base64 has none), into one buffer sized
// for the whole block (a stuffed dot may grow it), so that it leaves in one write.
QByteArray dataBlock(const QByteArray& normalized) {
    const QByteArrayView text(normalized);
    QByteArray out;
    out.reserve(text.size() + 3);
    qsizetype done = 0;
    // Only a dot that starts a line is doubled: the lines are looked at, not the dots.
    for (qsizetype start = 0; start < text.size();) {
        if (text[start] == '.') {
            out.append(text.sliced(done, start - done)).append('.');
            done = start;
        }
        const auto* lf = static_cast<const char*>(
            std::memchr(text.data() + start, '\n', size_t(text.size() - start)));
        if (!lf)
            break;
        start = lf - text.data() + 1;
    }
    return out.append(text.sliced(done)).append(".\r\n", 3);
}

bool hasLineBreakOrNul(const QString& text) {
    return text.contains(QLatin1Char('\r')) || text.contains(QLatin1Char('\n')) ||
           text.contains(QChar(0));
}

// Control characters would end or split the command; angle brackets would close the path
// early and smuggle in parameters (RFC 5321 4.1.2 Path).
bool isEnvelopeSafe(const QString& address) {
    return std::none_of(address.begin(), address.end(), [](QChar c) {
        return c.unicode() < 0x20 || c.unicode() == 0x7f || c == QLatin1Char('<') ||
               c == QLatin1Char('>');
    });
}

// RFC 5321 4.1.2 wants the domain of a path in ASCII: an international domain goes in its
// IDNA form (RFC 5890), which every server takes. Only a name before the @ that is not ASCII
// still needs UTF-8, and with it a server offering SMTPUTF8 (RFC 6531 3.3).
QByteArray envelopePath(const QString& address) {
    const qsizetype at = address.lastIndexOf(QLatin1Char('@'));
    if (at < 0)
        return address.toUtf8();
    const QString domain = address.mid(at + 1);
    const QByteArray ace = QUrl::toAce(domain);
    return address.left(at + 1).toUtf8() + (ace.isEmpty() ? domain.toUtf8() : ace);
}

// The first address of the envelope whose path is not ASCII, or a null string.
QString firstUtf8Path(const QString& sender, const QStringList& recipients) {
    for (const QString& address : QStringList{sender} + recipients) {
        const QByteArray path = envelopePath(address);
        if (!std::all_of(path.begin(), path.end(), [](char c) { return c > 0; }))
            return address;
    }
    return {};
}

QString printable(QString text) {
    for (QChar& c : text)
        if (c.unicode() < 0x20 || c.unicode() == 0x7f)
            c = QLatin1Char('?');
    return text;
}

// RFC 5321 4.1.4: EHLO names the client by its fully qualified domain name.
bool isDomainName(const QString& name) {
    static const QRegularExpression domain(
        QStringLiteral("^[A-Za-z0-9]([A-Za-z0-9-]*[A-Za-z0-9])?(\\.[A-Za-z0-9]([A-Za-z0-9-]*["
                       "A-Za-z0-9])?)+$"));
    return domain.match(name).hasMatch();
}

void wipe(QByteArray& secret) {
    secret.fill('\0');
    secret.clear();
}

QList<QSslCertificate> readCaCertificates(const QString& file, const QString& folders) {
    QList<QSslCertificate> added;
    if (!file.isEmpty())
        added += QSslCertificate::fromPath(file, QSsl::Pem);
    for (const QString& folder : folders.split(QLatin1Char(':'), Qt::SkipEmptyParts))
        added += QSslCertificate::fromPath(QDir(folder).filePath(QStringLiteral("*")), QSsl::Pem,
                                           QSslCertificate::PatternSyntax::Wildcard);
    if (added.isEmpty())
        return {};
    // Any CA list turns off Qt's loading of the system store on demand, so the system's
    // certificates must be in it too.
    QList<QSslCertificate> all;
    QSet<QSslCertificate> seen;
    for (const QSslCertificate& certificate : QSslConfiguration::systemCaCertificates() + added) {
        if (seen.contains(certificate))
            continue;
        seen.insert(certificate);
        all += certificate;
    }
    return all;
}

} // namespace

SmtpClient::SmtpClient(const QString& host, quint16 port, std::chrono::seconds timeout,
                       QObject* parent, Transport transport)
    : SmtpSession(parent),
      m_tls(transport == Transport::TlsCapable ? new QSslSocket(this) : nullptr),
      m_socket(m_tls ? m_tls : new QTcpSocket(this)), m_host(host), m_port(port),
      m_timeoutCap(timeout), m_implicitTLS(port == 465) {
    m_timer.setSingleShot(true);
    connect(&m_timer, &QTimer::timeout, this, &SmtpClient::onTimeout);
    connect(m_socket, &QTcpSocket::connected, this, &SmtpClient::onConnected);
    connect(m_socket, &QTcpSocket::readyRead, this, &SmtpClient::readReplies);
    connect(m_socket, &QTcpSocket::errorOccurred, this, &SmtpClient::onSocketError);
    connect(m_socket, &QTcpSocket::disconnected, this, &SmtpClient::onDisconnected);
    if (m_tls) {
        connect(m_tls, &QSslSocket::encrypted, this, &SmtpClient::onEncrypted);
        connect(m_tls, &QSslSocket::sslErrors, this,
                [this](const QList<QSslError>& errors) { m_sslErrors = errors; });
    }
    // A large message on a slow link may take long to write: the end-of-data limit counts
    // from the last progress, not from the start.
    connect(m_socket, &QTcpSocket::bytesWritten, this, [this] {
        if (m_state == State::DataEnd)
            startTimer(dataEndLimit);
    });
}

SmtpClient::~SmtpClient() {
    forgetCredentials();
}

// Reading hundreds of certificate files takes a noticeable while, and a mailing run opens one
// connection per recipient: the configuration is built again only when the variables change,
// and every session shares it.
QSslConfiguration SmtpClient::tlsConfiguration() {
    static QMutex mutex;
    static QString cachedFile;
    static QString cachedFolders;
    static std::optional<QSslConfiguration> cached;
    const QString file = qEnvironmentVariable("SSL_CERT_FILE");
    const QString folders = qEnvironmentVariable("SSL_CERT_DIR");
    const QMutexLocker lock(&mutex);
    if (!cached || file != cachedFile || folders != cachedFolders) {
        cached = QSslConfiguration::defaultConfiguration();
        if (const QList<QSslCertificate> trusted = readCaCertificates(file, folders);
            !trusted.isEmpty())
            cached->setCaCertificates(trusted);
        cachedFile = file;
        cachedFolders = folders;
    }
    return *cached;
}

void SmtpClient::connectInBackgroundAndNotify() {
    if (!expect(State::Unconnected, "connectInBackgroundAndNotify"))
        return;
    enter(State::Connecting);
    m_socket->connectToHost(m_host, m_port);
}

void SmtpClient::setImplicitTLS(bool implicit) {
    if (expect(State::Unconnected, "setImplicitTLS"))
        m_implicitTLS = implicit;
}

bool SmtpClient::isSSL() const {
    return m_implicitTLS || (m_tls && m_tls->isEncrypted());
}

void SmtpClient::startSSL() {
    if (expect(State::AwaitingSSL, "startSSL"))
        startEncryption(State::SSLHandshake);
}

void SmtpClient::startTLS() {
    if (!expect(State::Ready, "startTLS") || isSSL())
        return;
    if (!m_tls)
        return failWithoutTLS();
    send("STARTTLS");
    enter(State::StartTLS);
}

QStringList SmtpClient::supportedMechanisms() const {
    return m_capabilities.mechanisms;
}

void SmtpClient::authenticate(const QString& user, const QString& password,
                              const QString& mechanism) {
    if (!expect(State::Ready, "authenticate"))
        return;
    if (hasLineBreakOrNul(user) || hasLineBreakOrNul(password) || hasLineBreakOrNul(mechanism))
        return failAuthentication(
            tr("The user name, password or mechanism contains a line break or NUL character."));
    m_user = user.toUtf8();
    m_password = password.toUtf8();
    const QString name = mechanism.toUpper();
    if (name == QLatin1String("PLAIN")) {
        // RFC 4616 2: authzid NUL authcid NUL passwd, sent as the initial response.
        send("AUTH PLAIN " + (QByteArray(1, '\0') + m_user + '\0' + m_password).toBase64());
        enter(State::AuthResult);
    } else if (name == QLatin1String("LOGIN")) {
        send("AUTH LOGIN");
        enter(State::AuthLoginUser);
    } else if (name == QLatin1String("CRAM-MD5")) {
        send("AUTH CRAM-MD5");
        enter(State::AuthCramChallenge);
    } else {
        failAuthentication(tr("Unknown authentication mechanism \"%1\".").arg(mechanism));
    }
}

void SmtpClient::setMessage(const QByteArray& message, const QString& sender,
                            const QStringList& recipients) {
    m_message = normalizeLineEnds(message);
    m_sender = sender;
    m_recipients = recipients;
}

void SmtpClient::sendMessage() {
    if (!expect(State::Ready, "sendMessage"))
        return;
    m_senderRefused = false;
    if (const QString problem = envelopeProblem(); !problem.isEmpty())
        return refuseBeforeSending(problem);
    if (m_capabilities.sizeLimit > 0 && m_message.size() > m_capabilities.sizeLimit)
        return refuseBeforeSending(
            tr("The message (%1 bytes) is larger than the %2 bytes the server accepts.")
                .arg(m_message.size())
                .arg(m_capabilities.sizeLimit));
    QByteArray command = "MAIL FROM:<" + envelopePath(m_sender) + '>';
    if (m_capabilities.size) // RFC 1870 6: declare the size so the server can refuse it early
        command += " SIZE=" + QByteArray::number(m_message.size());
    if (!firstUtf8Path(m_sender, m_recipients).isNull()) // RFC 6531 3.4
        command += " SMTPUTF8";
    m_nextRecipient = 0;
    m_refusal.reset();
    // RFC 2920 3.1: DATA may end a group, so the whole envelope is one round trip.
    m_pipelined = m_capabilities.pipelining;
    if (m_pipelined) {
        command += "\r\n";
        for (const QString& recipient : std::as_const(m_recipients))
            command += "RCPT TO:<" + envelopePath(recipient) + ">\r\n";
        command += "DATA";
    }
    m_messageWritten = false;
    if (!m_resetFirst) {
        send(command);
        return enter(State::MailFrom);
    }
    m_resetFirst = false;
    m_envelope = m_pipelined ? QByteArray() : command;
    send(m_pipelined ? "RSET\r\n" + command : QByteArray("RSET"));
    enter(State::Reset);
}

void SmtpClient::onReset(int code) {
    if (!isPositive(code))
        return finish(&SmtpSession::connectionLost,
                      tr("The server %1 refused RSET: %2").arg(m_host, replyText()));
    if (!m_envelope.isEmpty())
        send(std::exchange(m_envelope, {}));
    enter(State::MailFrom);
}

void SmtpClient::close() {
    switch (m_state) {
    case State::Closed:
    case State::Quit:
        return;
    case State::Unconnected:
    case State::Connecting:
    case State::AwaitingSSL:
    case State::SSLHandshake:
    case State::TLSHandshake:
        return finish(&SmtpSession::connectionTerminated, {});
    default:
        send("QUIT");
        enter(State::Quit);
    }
}

QByteArray SmtpClient::lastResponse() const {
    return m_reply.raw;
}

QString SmtpClient::errorString() const {
    return m_errorString;
}

bool SmtpClient::expect(State state, const char* operation) const {
    if (m_state == state)
        return true;
    qWarning("SmtpClient: %s ignored in state %s", operation,
             QMetaEnum::fromType<State>().valueToKey(int(m_state)));
    return false;
}

void SmtpClient::notify(Signal signal) {
    QMetaObject::invokeMethod(
        this, [this, signal] { Q_EMIT std::invoke(signal, this); }, Qt::QueuedConnection);
}

void SmtpClient::finish(Signal signal, const QString& why) {
    if (m_state == State::Closed)
        return;
    if (!why.isEmpty())
        m_errorString = why;
    enter(State::Closed);
    forgetCredentials();
    m_socket->abort();
    notify(signal);
}

void SmtpClient::enter(State state) {
    m_state = state;
    switch (state) {
    case State::Unconnected:
    case State::Ready:
    case State::Closed:
        m_timer.stop();
        return;
    case State::Connecting:
        return startTimer(connectLimit);
    case State::AwaitingSSL:
    case State::SSLHandshake:
    case State::Greeting:
    case State::TLSHandshake:
        return startTimer(replyLimit);
    case State::DataEnd:
        startTimer(dataEndLimit);
        break;
    default:
        startTimer(replyLimit);
        break;
    }
    // What was just written leaves now, not on the socket's next turn of the event loop: a
    // wake-up less for every command. A failed write ends the session in here (finish()), and
    // every caller returns right after entering a state that waits for a reply.
    m_socket->flush();
}

void SmtpClient::startTimer(std::chrono::seconds limit) {
    if (m_timeoutCap > std::chrono::seconds::zero())
        limit = std::min(limit, m_timeoutCap);
    m_timer.start(limit);
}

void SmtpClient::send(const QByteArray& command) {
    m_socket->write(command + "\r\n");
}

void SmtpClient::forgetCredentials() {
    wipe(m_user);
    wipe(m_password);
}

void SmtpClient::onConnected() {
    if (m_state != State::Connecting)
        return;
    // Every command goes in one write and waits for its reply: holding a small segment back
    // for an acknowledgement (Nagle) only adds a delayed ACK's wait, after the TLS handshake
    // above all.
    m_socket->setSocketOption(QAbstractSocket::LowDelayOption, 1);
    notify(&SmtpSession::connectionEstablished);
    enter(m_implicitTLS ? State::AwaitingSSL : State::Greeting);
}

void SmtpClient::onEncrypted() {
    if (m_state == State::SSLHandshake) {
        enter(State::Greeting);
    } else if (m_state == State::TLSHandshake) {
        sendEhlo();
    }
    acknowledgePromptly();
    readReplies();
}

// A TLS 1.3 server sends its session tickets as soon as the handshake ends, and its greeting or
// EHLO reply right after them. Most servers leave Nagle on, so that reply waits until the
// tickets are acknowledged, and a delayed ACK (40 ms on Linux) would hold it that long in every
// session: this side acknowledges at once instead. The kernel drops the option again when it
// sees a request-reply rhythm, so it is set after this side's last write of the handshake.
void SmtpClient::acknowledgePromptly() {
#ifdef TCP_QUICKACK
    m_socket->flush();
    const qintptr descriptor = m_socket->socketDescriptor();
    const int on = 1;
    if (descriptor >= 0)
        ::setsockopt(int(descriptor), IPPROTO_TCP, TCP_QUICKACK, &on, sizeof on);
#endif
}

void SmtpClient::onSocketError() {
    if (m_socket->error() == QAbstractSocket::RemoteHostClosedError)
        return onDisconnected();
    switch (m_state) {
    case State::Connecting:
        return finish(&SmtpSession::connectionTimedOut, tr("Could not connect to %1:%2: %3")
                                                            .arg(m_host)
                                                            .arg(m_port)
                                                            .arg(m_socket->errorString()));
    case State::SSLHandshake:
    case State::TLSHandshake:
        return failHandshake();
    case State::Quit:
        return finish(&SmtpSession::connectionTerminated, {});
    default:
        return finish(&SmtpSession::connectionLost,
                      tr("Connection to %1 lost: %2").arg(m_host, m_socket->errorString()));
    }
}

void SmtpClient::onDisconnected() {
    switch (m_state) {
    case State::Closed:
        return;
    case State::Quit:
        return finish(&SmtpSession::connectionTerminated, {});
    case State::SSLHandshake:
    case State::TLSHandshake:
        return failHandshake();
    default:
        return finish(&SmtpSession::connectionLost,
                      tr("The server %1 closed the connection.").arg(m_host));
    }
}

void SmtpClient::onTimeout() {
    if (m_state == State::Quit)
        return finish(&SmtpSession::connectionTerminated, {});
    const auto waited =
        std::chrono::duration_cast<std::chrono::seconds>(m_timer.intervalAsDuration());
    finish(&SmtpSession::connectionTimedOut,
           m_state == State::Connecting
               ? tr("Could not connect to %1:%2 within %3 s.")
                     .arg(m_host)
                     .arg(m_port)
                     .arg(waited.count())
               : tr("The server %1 did not answer within %2 s.").arg(m_host).arg(waited.count()));
}

void SmtpClient::failHandshake() {
    QStringList reasons;
    for (const QSslError& error : m_sslErrors)
        reasons += error.errorString();
    const QString reason =
        reasons.isEmpty() ? m_socket->errorString() : reasons.join(QStringLiteral("; "));
    failTLS(tr("TLS handshake with %1 failed: %2").arg(m_host, reason));
}

bool SmtpClient::readsReplies() const {
    switch (m_state) {
    case State::Unconnected:
    case State::Connecting:
    case State::AwaitingSSL:
    case State::SSLHandshake:
    case State::TLSHandshake:
    case State::Closed:
        return false;
    default:
        return true;
    }
}

// Bytes are taken from the socket only in states that read replies: during a TLS handshake
// they are not yet the conversation's.
void SmtpClient::readReplies() {
    if (!readsReplies())
        return;
    m_replies.feed(m_socket->readAll());
    while (readsReplies()) {
        std::optional<SmtpReply> reply = m_replies.next();
        if (!reply)
            break;
        m_reply = std::move(*reply);
        handleReply(m_reply.code);
    }
    if (!readsReplies())
        return;
    switch (m_replies.error()) {
    case SmtpReplyReader::Error::None:
        return;
    case SmtpReplyReader::Error::Malformed:
        return finish(&SmtpSession::connectionLost,
                      tr("The server %1 sent a malformed reply: %2")
                          .arg(m_host, printable(QString::fromUtf8(m_replies.malformedLine()))));
    case SmtpReplyReader::Error::Overlong:
        return finish(&SmtpSession::connectionLost,
                      tr("The server %1 sent an overlong reply.").arg(m_host));
    }
}

void SmtpClient::handleReply(int code) {
    switch (m_state) {
    case State::Greeting:
        return onGreeting(code);
    case State::Ehlo:
        return onEhlo(code);
    case State::Helo:
        return onHelo(code);
    case State::StartTLS:
        return onStartTLS(code);
    case State::AuthLoginUser:
    case State::AuthLoginPassword:
    case State::AuthCramChallenge:
    case State::AuthResult:
    case State::AuthCancelled:
        return onAuthReply(code);
    case State::Reset:
        return onReset(code);
    case State::MailFrom:
        return onMailFrom(code);
    case State::RcptTo:
        return onRcptTo(code);
    case State::Data:
        return onData(code);
    case State::DataEnd:
        return onDataEnd(code);
    case State::Quit:
        return onQuit(code);
    default: // Ready: unasked, such as a 421 before the server closes; kept as lastResponse
        return;
    }
}

void SmtpClient::onGreeting(int code) {
    if (code == 220)
        return sendEhlo();
    // RFC 5321 3.1: after a 554 greeting the client should still send QUIT.
    send("QUIT");
    m_socket->flush();
    finish(&SmtpSession::connectionLost,
           tr("The server %1 refused the session: %2").arg(m_host, replyText()));
}

void SmtpClient::sendEhlo() {
    // RFC 3207 4.2: what the server announced before TLS is forgotten.
    m_capabilities = {};
    send("EHLO " + ehloDomain());
    enter(State::Ehlo);
}

void SmtpClient::onEhlo(int code) {
    if (isPositive(code)) {
        m_capabilities = SmtpCapabilities::fromEhlo(m_reply);
        enter(State::Ready);
        return notify(&SmtpSession::serviceInitialized);
    }
    // RFC 5321 4.1.1.1: a server that does not know EHLO answers 5xx; HELO then.
    if (code >= 500) {
        send("HELO " + ehloDomain());
        return enter(State::Helo);
    }
    finish(&SmtpSession::connectionLost,
           tr("The server %1 refused EHLO: %2").arg(m_host, replyText()));
}

void SmtpClient::onHelo(int code) {
    if (!isPositive(code))
        return finish(&SmtpSession::connectionLost,
                      tr("The server %1 refused HELO: %2").arg(m_host, replyText()));
    enter(State::Ready);
    notify(&SmtpSession::serviceInitialized);
}

void SmtpClient::onStartTLS(int code) {
    if (code != 220)
        return failTLS(tr("The server %1 refused STARTTLS: %2").arg(m_host, replyText()));
    // RFC 3207 5: anything the server sent after its 220 and before TLS cannot be trusted.
    m_replies.clear();
    startEncryption(State::TLSHandshake);
}

void SmtpClient::onAuthReply(int code) {
    if (code == 334)
        return answerChallenge();
    const bool accepted = code == 235 && m_state != State::AuthCancelled;
    forgetCredentials();
    enter(State::Ready);
    if (accepted)
        return notify(&SmtpSession::authenticationCompleted);
    m_errorString = tr("The server %1 refused the authentication: %2").arg(m_host, replyText());
    notify(&SmtpSession::authenticationFailed);
}

void SmtpClient::answerChallenge() {
    switch (m_state) {
    case State::AuthLoginUser:
        send(m_user.toBase64());
        return enter(State::AuthLoginPassword);
    case State::AuthLoginPassword:
        send(m_password.toBase64());
        return enter(State::AuthResult);
    case State::AuthCramChallenge:
        if (const auto response = cramMd5Response(); !response.isEmpty()) {
            send(response);
            return enter(State::AuthResult);
        }
        break;
    default:
        break;
    }
    // RFC 4954 4: "*" cancels an exchange the client cannot go on with.
    send("*");
    enter(State::AuthCancelled);
}

// RFC 2195 2: base64 of "user SP hex(HMAC-MD5(password, challenge))". The challenge is the
// text of a one-line 334 (RFC 4954 4).
QByteArray SmtpClient::cramMd5Response() const {
    if (m_reply.lines.size() != 1)
        return {};
    const auto decoded = QByteArray::fromBase64Encoding(m_reply.lines[0].trimmed(),
                                                        QByteArray::AbortOnBase64DecodingErrors);
    if (!decoded || decoded.decoded.isEmpty())
        return {};
    const QByteArray digest =
        QMessageAuthenticationCode::hash(decoded.decoded, m_password, QCryptographicHash::Md5)
            .toHex();
    return (m_user + ' ' + digest).toBase64();
}

void SmtpClient::failAuthentication(const QString& why) {
    m_reply = {};
    m_errorString = why;
    forgetCredentials();
    notify(&SmtpSession::authenticationFailed);
}

QString SmtpClient::envelopeProblem() const {
    if (m_recipients.isEmpty())
        return tr("The message has no recipient.");
    if (!isEnvelopeSafe(m_sender))
        return tr("The sender address \"%1\" contains a control character or an angle bracket.")
            .arg(printable(m_sender));
    for (const QString& recipient : m_recipients)
        if (!isEnvelopeSafe(recipient))
            return tr("The recipient address \"%1\" contains a control character or an angle "
                      "bracket.")
                .arg(printable(recipient));
    if (const QString address = firstUtf8Path(m_sender, m_recipients);
        !address.isNull() && !m_capabilities.smtpUtf8)
        return tr("The address \"%1\" has a name before the @ that is not ASCII, which the "
                  "server %2 does not accept (it does not offer SMTPUTF8).")
            .arg(address, m_host);
    return {};
}

void SmtpClient::refuseBeforeSending(const QString& why) {
    m_reply = {};
    m_errorString = why;
    notify(&SmtpSession::messageNotSent);
}

void SmtpClient::refuseMessage() {
    m_pipelined = false;
    m_resetFirst = true;
    m_errorString = tr("The server %1 refused the message: %2").arg(m_host, replyText());
    enter(State::Ready);
    notify(&SmtpSession::messageNotSent);
}

void SmtpClient::onMailFrom(int code) {
    m_senderRefused = !isPositive(code);
    if (m_pipelined)
        return onPipelinedReply(code, State::RcptTo);
    if (!isPositive(code))
        return refuseMessage();
    sendNextRecipient();
}

// RFC 2920 3.2: every command of the group gets its reply, in order, whatever came before.
void SmtpClient::onPipelinedReply(int code, State next) {
    if (!isPositive(code) && !m_refusal)
        m_refusal = m_reply;
    if (next == State::RcptTo && ++m_nextRecipient > m_recipients.size())
        next = State::Data;
    enter(next);
}

void SmtpClient::sendNextRecipient() {
    send("RCPT TO:<" + envelopePath(m_recipients[m_nextRecipient++]) + '>');
    enter(State::RcptTo);
}

// A refused recipient stops the whole transaction: a personalised copy goes to all its
// recipients or to none.
void SmtpClient::onRcptTo(int code) {
    if (m_pipelined)
        return onPipelinedReply(code, State::RcptTo);
    if (!isPositive(code))
        return refuseMessage();
    if (m_nextRecipient < m_recipients.size())
        return sendNextRecipient();
    send("DATA");
    enter(State::Data);
}

void SmtpClient::onData(int code) {
    if (m_refusal) {
        m_reply = *m_refusal;
        // A server that wants the message after refusing part of the envelope would deliver
        // it to some recipients only; leaving mid-transaction makes it drop the message.
        if (code == 354)
            return finish(&SmtpSession::connectionLost,
                          tr("The server %1 refused the message: %2").arg(m_host, replyText()));
        return refuseMessage();
    }
    if (code != 354)
        return refuseMessage();
    m_socket->write(dataBlock(m_message));
    m_messageWritten = true;
    enter(State::DataEnd);
}

void SmtpClient::onDataEnd(int code) {
    m_pipelined = false;
    if (!isPositive(code))
        return refuseMessage();
    enter(State::Ready);
    notify(&SmtpSession::messageSent);
}

// Replies still due for earlier commands may come first; only QUIT's 221 ends the wait.
void SmtpClient::onQuit(int code) {
    if (code == 221)
        finish(&SmtpSession::connectionTerminated, {});
}

// The trust store is read only when a session really goes TLS.
void SmtpClient::startEncryption(State handshake) {
    if (!m_tls)
        return failWithoutTLS();
    m_tls->setSslConfiguration(tlsConfiguration());
    enter(handshake);
    m_tls->startClientEncryption();
}

void SmtpClient::failTLS(const QString& why) {
    finish(&SmtpSession::connectionTimedOut, why);
}

void SmtpClient::failWithoutTLS() {
    failTLS(tr("TLS is not available on this connection to %1.").arg(m_host));
}

QByteArray SmtpClient::ehloDomain() const {
    const QString name = QHostInfo::localHostName();
    if (isDomainName(name))
        return name.toLatin1();
    // RFC 5321 4.1.3: address literals, for a host without a domain name.
    QHostAddress address = m_socket->localAddress();
    address.setScopeId({});
    if (address.protocol() == QAbstractSocket::IPv6Protocol)
        return "[IPv6:" + address.toString().toLatin1() + ']';
    return '[' + address.toString().toLatin1() + ']';
}

QString SmtpClient::replyText() const {
    return QString::fromUtf8(m_reply.raw).simplified();
}
