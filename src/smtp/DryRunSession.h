#pragma once

#include "smtp/SmtpSession.h"

/**
 * A session that connects to nothing and writes the message it is given to a file instead of
 * sending it: `pelmo send --dry-run DIR` shows every personalised copy without mailing anyone.
 * It accepts every login and announces PLAIN, LOGIN and CRAM-MD5; signals come on the main
 * loop like a real session's.
 */
class DryRunSession : public SmtpSession {
    Q_OBJECT

public:
    /** The message goes to path, which is replaced when it exists. */
    explicit DryRunSession(const QString& path, QObject* parent = nullptr);

    void connectInBackgroundAndNotify() override;
    bool isSSL() const override { return m_tls; }
    void startSSL() override {}
    void startTLS() override;
    QStringList supportedMechanisms() const override;
    void authenticate(const QString& user, const QString& password,
                      const QString& mechanism) override;
    void setMessage(const QByteArray& message, const QString& sender,
                    const QStringList& recipients) override;
    void sendMessage() override;
    void close() override;
    QByteArray lastResponse() const override { return m_lastResponse; }
    QString errorString() const override { return m_error; }

private:
    void later(void (SmtpSession::*signal)());

    QString m_path;
    QByteArray m_message;
    QByteArray m_lastResponse;
    QString m_error;
    bool m_tls = false;
};
