#pragma once

#include <QObject>
#include <QString>

#include <chrono>

class QLocalServer;

/**
 * One Pelmo per user and display. The running Pelmo listens on a local socket in the user's
 * runtime folder (0700); a later start hands it a link (or an empty one: "come to the front")
 * and ends. A socket left by a Pelmo that crashed is removed by the next start, which becomes
 * the running one. Callers hold lockPath() (a QLockFile) from before handOver() until
 * listen() has answered, so that two starts at the same moment end with one Pelmo.
 *
 * The wire: the link as a QDataStream QString, answered by one byte once it has been taken.
 */
class SingleInstance : public QObject {
    Q_OBJECT

public:
    enum class State {
        Idle,     ///< not listening (yet)
        Listening ///< this is the running Pelmo: links arrive through received()
    };
    Q_ENUM(State)

    /** What a later start's handOver() found. */
    enum class HandOver { Taken, NoneRunning, NoAnswer };

    explicit SingleInstance(QObject* parent = nullptr);

    /** The socket's path: per user (the runtime folder) and per display. */
    static QString socketPath();
    static QString lockPath() { return socketPath() + QLatin1String(".lock"); }

    /**
     * Gives link to the running Pelmo and waits for it to be taken. Blocking, for a start that
     * has no window yet; needs a Q(Core)Application.
     */
    static HandOver handOver(const QString& link, std::chrono::milliseconds timeout);

    /** Becomes the running Pelmo, replacing a stale socket; false when it cannot listen. */
    bool listen();
    State state() const { return m_state; }

Q_SIGNALS:
    /** A later start handed over link; empty when it had none. */
    void received(const QString& link);

private:
    void accept();

    QLocalServer* m_server;
    State m_state = State::Idle;
};
