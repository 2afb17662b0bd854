#pragma once

#include <QString>
#include <QTemporaryDir>

/**
 * A certificate authority made up for one test run and two server certificates it signed:
 * "server" for localhost and 127.0.0.1, "stranger" for mail.invalid only. Made with openssl
 * in a temporary folder that goes with the object.
 */
class ThrowAwayPki {
public:
    ThrowAwayPki();

    bool ok() const { return m_error.isEmpty(); }
    const QString& error() const { return m_error; }

    QString folder() const { return m_dir.path(); }
    QString caCertificate() const { return file(QStringLiteral("ca.crt")); }
    QString certificate(const QString& name) const { return file(name + QStringLiteral(".crt")); }
    QString key(const QString& name) const { return file(name + QStringLiteral(".key")); }

private:
    QString file(const QString& name) const { return m_dir.filePath(name); }
    bool makeServer(const QString& name, const QByteArray& subjectAltName);
    bool openssl(const QStringList& arguments);

    QTemporaryDir m_dir;
    QString m_error;
};
