#include "ThrowAwayPki.h"

#include <QFile>
#include <QProcess>

namespace {

// Elliptic-curve keys: made in a few milliseconds, where RSA would slow every test down.
const QStringList newKey = {"-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes"};

} // namespace

ThrowAwayPki::ThrowAwayPki() {
    if (!m_dir.isValid()) {
        m_error = QStringLiteral("no temporary folder for the certificates");
        return;
    }
    const bool made =
        openssl(QStringList{"req", "-x509", "-days", "2", "-subj", "/CN=Pelmo throw-away test CA",
                            "-keyout", file("ca.key"), "-out", caCertificate()} +
                newKey) &&
        makeServer(QStringLiteral("server"), "DNS:localhost,IP:127.0.0.1") &&
        makeServer(QStringLiteral("stranger"), "DNS:mail.invalid");
    if (!made && m_error.isEmpty())
        m_error = QStringLiteral("the certificates could not be made");
}

bool ThrowAwayPki::makeServer(const QString& name, const QByteArray& subjectAltName) {
    QFile extensions(file(name + QStringLiteral(".ext")));
    if (!extensions.open(QIODevice::WriteOnly) ||
        extensions.write("subjectAltName=" + subjectAltName + '\n') < 0)
        return false;
    extensions.close();
    const QString request = file(name + QStringLiteral(".csr"));
    return openssl(
               QStringList{"req", "-subj", "/CN=" + name, "-keyout", key(name), "-out", request} +
               newKey) &&
           openssl({"x509", "-req", "-days", "2", "-in", request, "-CA", caCertificate(), "-CAkey",
                    file("ca.key"), "-CAcreateserial", "-extfile", extensions.fileName(), "-out",
                    certificate(name)});
}

bool ThrowAwayPki::openssl(const QStringList& arguments) {
    QProcess process;
    process.start(QStringLiteral(PELMO_OPENSSL), arguments);
    if (process.waitForFinished(30000) && process.exitStatus() == QProcess::NormalExit &&
        process.exitCode() == 0)
        return true;
    m_error = QStringLiteral("openssl %1 failed: %2")
                  .arg(arguments.first(), QString::fromLocal8Bit(process.readAllStandardError()));
    return false;
}
