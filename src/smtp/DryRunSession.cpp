#include "smtp/DryRunSession.h"

#include <QFile>
#include <QSaveFile>

DryRunSession::DryRunSession(const QString& path, QObject* parent)
    : SmtpSession(parent), m_path(path) {}

void DryRunSession::later(void (SmtpSession::*signal)()) {
    QMetaObject::invokeMethod(
        this,
        [this, signal] {
            Q_EMIT(this->*signal)
            ();
        },
        Qt::QueuedConnection);
}

void DryRunSession::connectInBackgroundAndNotify() {
    later(&SmtpSession::connectionEstablished);
    later(&SmtpSession::serviceInitialized);
}

void DryRunSession::startTLS() {
    m_tls = true;
    later(&SmtpSession::serviceInitialized);
}

QStringList DryRunSession::supportedMechanisms() const {
    return {QStringLiteral("PLAIN"), QStringLiteral("LOGIN"), QStringLiteral("CRAM-MD5")};
}

void DryRunSession::authenticate(const QString&, const QString&, const QString&) {
    later(&SmtpSession::authenticationCompleted);
}

void DryRunSession::setMessage(const QByteArray& message, const QString&, const QStringList&) {
    m_message = message;
}

void DryRunSession::sendMessage() {
    QSaveFile file(m_path);
    if (file.open(QIODevice::WriteOnly) && file.write(m_message) == m_message.size() &&
        file.commit()) {
        m_lastResponse = "250 written to " + m_path.toUtf8();
        later(&SmtpSession::messageSent);
        return;
    }
    m_error = QStringLiteral("Cannot write %1: %2").arg(m_path, file.errorString());
    m_lastResponse.clear();
    later(&SmtpSession::messageNotSent);
}

void DryRunSession::close() {
    later(&SmtpSession::connectionTerminated);
}
