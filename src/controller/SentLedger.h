#pragma once

#include <QByteArray>
#include <QList>
#include <QObject>
#include <QString>

#include <memory>

/**
 * The sent list on disk, so that a Pelmo that is killed, crashes or loses power in the middle
 * of a run still knows whom it mailed. Each session that mails keeps a journal of its own,
 * "Sent-<id>.ledger" in the data folder (0600), locked (flock) for as long as the session
 * runs; the kernel drops the lock when the process ends, however it ends. A clean quit
 * removes the journal. A journal found at start-up that nobody holds locked is therefore the
 * leftover of a session that ended uncleanly.
 *
 * Format: UTF-8 lines ending in "\n", fields separated by a tab, the time in ISO 8601 (UTC):
 *   start <time> <run>                      the run's first accepted copy follows
 *   sent  <time> <run> <address> <Message-Id>   the server accepted this copy (250 after DATA)
 *   end   <time> <run>                      the run completed, or the sent list was reset:
 *                                           nothing the run mailed before it is restored
 * Each copy's lines are written with one write() at once, so that a Pelmo that is killed loses
 * none, and synced on a thread of their own meanwhile; the run calls waitUntilDurable() before
 * the next copy goes to the server, so that a power loss can cost at most the record of the one
 * copy just accepted, as it could with a wait right after the write. A
 * last line without its "\n" was torn by the crash and is ignored, as is any line that is not
 * one of the three above. What an unclean session leaves to restore are the addresses of its
 * runs that have no end line.
 *
 * A journal that cannot be written does not stop the mailing: the failure is reported once,
 * by statusMessage(), and the session goes on without one (state Failed). Main thread only.
 */
class SentLedger : public QObject {
    Q_OBJECT

public:
    enum class State {
        Unopened, ///< nothing accepted yet in this session: no journal on disk
        Open,     ///< the journal is written and locked
        Failed,   ///< the journal could not be written; the failure was reported
        Closed,   ///< a clean quit removed the journal
    };
    Q_ENUM(State)

    /** One accepted copy read back. */
    struct Entry {
        QString address;
        QString messageId;
    };
    /** What a journal's bytes tell. */
    struct Reading {
        /** The copies of the runs that have no end line, in the order mailed, each address
         * once (ignoring letter case). */
        QList<Entry> unfinished;
        /** Complete lines that are none of the three kinds, or malformed. */
        int ignoredLines = 0;
    };

    /** A journal in folder (the data folder; empty when there is none, which fails the first
     * write). */
    explicit SentLedger(const QString& folder, QObject* parent = nullptr);
    ~SentLedger() override;

    static Reading read(const QByteArray& bytes);

    /** Appends and syncs an accepted copy of run; false (and Failed) when it cannot. */
    bool recordSent(const QString& run, const QString& address, const QString& messageId);
    /** The run completed: an end line, when the run has any line at all. */
    void finishRun(const QString& run);
    /** The sent list was emptied: every run's copies so far are no longer to be restored. */
    void forgetAll();
    /** Returns once every line written is on disk; false (and Failed) when the disk refused
     * them. Blocks only for the rest of a sync already under way. */
    bool waitUntilDurable();
    /** A clean quit: the journal is removed. */
    void close();

    /**
     * The journals of sessions that ended uncleanly, locked so that no other Pelmo takes them
     * too: their unfinished copies. Journals with nothing unfinished are removed at once.
     */
    QList<Entry> claimInterrupted();
    /** Removes the claimed journals, once their copies are restored or not wanted. */
    void removeClaimed();

    State state() const { return m_state; }
    const QString& path() const { return m_path; }

Q_SIGNALS:
    /** A line for the status line and the activity log. */
    void statusMessage(const QString& text);

private:
    bool open();
    bool append(const QByteArray& lines);
    void fail(const QString& why);
    void closeJournal();

    class Syncer;

    QString m_folder;
    QString m_path;
    int m_fd = -1;
    /** Syncs m_fd in the background while the journal is open. */
    std::unique_ptr<Syncer> m_syncer;
    State m_state = State::Unopened;
    /** Runs that have a start line in the journal. */
    QList<QString> m_started;
    struct Claimed {
        QString path;
        int fd;
    };
    QList<Claimed> m_claimed;
};
