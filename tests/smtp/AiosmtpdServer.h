#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QProcess>
#include <QStringList>

#include <optional>

/**
 * A real SMTP server for one test: tests/smtp/smtp_server.py (aiosmtpd) on 127.0.0.1, started
 * with the given options. It stops when this object goes, or by itself after a minute.
 */
class AiosmtpdServer {
public:
    explicit AiosmtpdServer(const QStringList& options);
    ~AiosmtpdServer();

    /** The port it listens on, 0 when it did not start (see failure()). */
    quint16 port() const { return m_port; }
    QString failure();

    /** The next message it accepted, waiting for it a bounded while. */
    std::optional<QJsonObject> nextMessage();
    /** Stops the server and tells whether it had accepted messages not yet taken. */
    bool stopAndCheckIdle();

private:
    std::optional<QByteArray> nextLine(int waitMs);
    void stop();

    QProcess m_process;
    quint16 m_port = 0;
};
