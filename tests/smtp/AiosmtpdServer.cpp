#include "AiosmtpdServer.h"

#include <QDeadlineTimer>
#include <QJsonDocument>

AiosmtpdServer::AiosmtpdServer(const QStringList& options) {
    m_process.start(QStringLiteral(PELMO_PYTHON3),
                    QStringList{QStringLiteral(PELMO_SMTP_SERVER), QStringLiteral("--lifetime"),
                                QStringLiteral("60")} +
                        options);
    if (const auto line = nextLine(15000); line && line->startsWith("PORT "))
        m_port = line->mid(5).trimmed().toUShort();
}

AiosmtpdServer::~AiosmtpdServer() {
    stop();
}

QString AiosmtpdServer::failure() {
    return QStringLiteral("smtp_server.py did not start: %1 %2")
        .arg(m_process.errorString(), QString::fromLocal8Bit(m_process.readAllStandardError()));
}

std::optional<QJsonObject> AiosmtpdServer::nextMessage() {
    const auto line = nextLine(10000);
    if (!line)
        return std::nullopt;
    return QJsonDocument::fromJson(*line).object();
}

bool AiosmtpdServer::stopAndCheckIdle() {
    stop();
    return !m_process.canReadLine();
}

std::optional<QByteArray> AiosmtpdServer::nextLine(int waitMs) {
    const QDeadlineTimer deadline(waitMs);
    while (!m_process.canReadLine() && !deadline.hasExpired() &&
           m_process.waitForReadyRead(int(deadline.remainingTime()))) {
    }
    if (!m_process.canReadLine())
        return std::nullopt;
    return m_process.readLine();
}

void AiosmtpdServer::stop() {
    if (m_process.state() == QProcess::NotRunning)
        return;
    m_process.closeWriteChannel();
    if (!m_process.waitForFinished(5000)) {
        m_process.kill();
        m_process.waitForFinished(5000);
    }
}
