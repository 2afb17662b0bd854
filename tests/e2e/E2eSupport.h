#pragma once

// What the end-to-end tests share: servers run as child processes on 127.0.0.1, a throw-away
// certificate authority, the pelmo program itself, and received messages parsed back.

#include <QByteArray>
#include <QProcess>
#include <QString>
#include <QStringList>
#include <QTemporaryDir>

/** A server script started with python3; it prints "PORT n" once listening. */
class ServerProcess {
public:
    ServerProcess(const QString& script, const QStringList& arguments);
    ~ServerProcess();
    int port() const { return m_port; }
    /** Every line the server printed after its port (one JSON record per accepted message). */
    QList<QByteArray> records();

private:
    QProcess m_process;
    QByteArray m_output;
    int m_port = 0;
};

/** A CA and a certificate for localhost/127.0.0.1 signed by it, made with openssl. */
struct Certificates {
    explicit Certificates(const QString& folder);
    QString ca, cert, key;
    bool ok = false;
};

/**
 * A headless browser of Debian's on a profile of its own, showing urls in tabs (Firefox selects the
 * first); ended by its own PID when destroyed. Chromium opens its DevTools endpoint on a port it
 * chooses.
 */
class HeadlessBrowser {
public:
    enum class Kind { Chromium, FirefoxEsr };
    HeadlessBrowser(Kind kind, const QStringList& urls);
    ~HeadlessBrowser();
    qint64 pid() const { return m_process.processId(); }
    QString profile() const { return m_profile.path(); }
    /** Chromium: opens url in a new tab, which comes to the front. */
    void openTab(const QString& url);

private:
    QTemporaryDir m_profile;
    QProcess m_process;
};

struct PelmoRun {
    int status = -1;
    QString out, err;
};

/** Runs the pelmo program with arguments in environment; never waits for input. */
PelmoRun runPelmo(const QStringList& arguments, const QProcessEnvironment& environment);

/** One MIME part of a received message, decoded. */
struct ReceivedPart {
    QString mimeType, charset, encoding, filename;
    QByteArray content;
};

/** A message as the server received it, parsed with GMime. */
struct ReceivedMessage {
    QString subject, from, to, topType, date, messageId, mimeVersion, listUnsubscribe;
    QList<ReceivedPart> parts;
    bool bareLineFeed = false;
};

ReceivedMessage parseMessage(const QByteArray& bytes);
/** The message bytes of one server record. */
QByteArray messageOf(const QByteArray& record);
