#include "controller/SentLedger.h"

#include "util/LocalizedStrings.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QHash>
#include <QSet>
#include <QUuid>

#include <algorithm>
#include <cerrno>
#include <condition_variable>
#include <cstdint>
#include <cstring>
#include <mutex>
#include <optional>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace {

constexpr char kStart[] = "start";
constexpr char kSent[] = "sent";
constexpr char kEnd[] = "end";

QByteArray timeNow() {
    return QDateTime::currentDateTimeUtc().toString(Qt::ISODateWithMs).toUtf8();
}

QByteArray line(std::initializer_list<QByteArray> fields) {
    QByteArray joined;
    for (const QByteArray& field : fields)
        joined += (joined.isEmpty() ? QByteArray() : QByteArray("\t")) + field;
    return joined + '\n';
}

bool plainField(const QString& field) {
    for (const QChar c : field)
        if (c.category() == QChar::Other_Control)
            return false;
    return true;
}

QString systemError() {
    return QString::fromLocal8Bit(std::strerror(errno));
}

QByteArray readAll(int fd) {
    QByteArray bytes;
    char buffer[65536];
    for (;;) {
        const ssize_t got = ::read(fd, buffer, sizeof buffer);
        if (got < 0 && errno == EINTR)
            continue;
        if (got <= 0)
            return bytes;
        bytes.append(buffer, got);
    }
}

} // namespace

// One thread per open journal, asleep between copies: a sync takes longer than the rest of a
// copy's work on the main thread, and asked for as soon as a line is written it is most often
// over by the time the next copy is ready.
class SentLedger::Syncer {
public:
    explicit Syncer(int fd) : m_fd(fd), m_thread([this] { work(); }) {}

    // Ends once the last sync asked for is done.
    ~Syncer() {
        {
            const std::lock_guard lock(m_mutex);
            m_stopping = true;
        }
        m_wake.notify_one();
        m_thread.join();
    }

    void request() {
        {
            const std::lock_guard lock(m_mutex);
            ++m_asked;
        }
        m_wake.notify_one();
    }

    /** The errno of a sync that failed since the last call, or 0. */
    int wait() {
        std::unique_lock lock(m_mutex);
        m_done.wait(lock, [this] { return m_synced == m_asked; });
        return std::exchange(m_error, 0);
    }

private:
    void work() {
        std::unique_lock lock(m_mutex);
        for (;;) {
            m_wake.wait(lock, [this] { return m_stopping || m_synced != m_asked; });
            if (m_synced == m_asked)
                return;
            // A sync covers every write made before it starts, those asked for meanwhile too;
            // fdatasync leaves out the times, which nothing reads back.
            const std::uint64_t target = m_asked;
            lock.unlock();
            int failed = 0;
            while (::fdatasync(m_fd) != 0 && (failed = errno) == EINTR)
                failed = 0;
            lock.lock();
            if (failed != 0 && m_error == 0)
                m_error = failed;
            m_synced = target;
            m_done.notify_all();
        }
    }

    const int m_fd;
    std::mutex m_mutex;
    std::condition_variable m_wake;
    std::condition_variable m_done;
    std::uint64_t m_asked = 0;
    std::uint64_t m_synced = 0;
    int m_error = 0;
    bool m_stopping = false;
    std::thread m_thread;
};

SentLedger::SentLedger(const QString& folder, QObject* parent)
    : QObject(parent), m_folder(folder) {}

SentLedger::~SentLedger() {
    closeJournal();
    for (const Claimed& claimed : std::as_const(m_claimed))
        ::close(claimed.fd);
}

SentLedger::Reading SentLedger::read(const QByteArray& bytes) {
    Reading reading;
    QList<std::optional<Entry>> sent;
    QHash<QString, QList<qsizetype>> sentOfRun;
    QList<QByteArray> lines = bytes.split('\n');
    lines.removeLast(); // torn by a crash when not empty: it lacks its "\n"
    for (const QByteArray& raw : std::as_const(lines)) {
        const QList<QByteArray> fields = raw.split('\t');
        const QByteArray& kind = fields.value(0);
        const qsizetype wanted = kind == kSent ? 5 : kind == kStart || kind == kEnd ? 3 : -1;
        const QString run = QString::fromUtf8(fields.value(2));
        const QString address = QString::fromUtf8(fields.value(3));
        const bool control = std::any_of(raw.begin(), raw.end(), [](char c) {
            return static_cast<unsigned char>(c) < 0x20 && c != '\t';
        });
        if (control || fields.size() != wanted || run.isEmpty() ||
            (kind == kSent && !address.contains(QLatin1Char('@'))) ||
            !QDateTime::fromString(QString::fromUtf8(fields.value(1)), Qt::ISODateWithMs)
                 .isValid()) {
            ++reading.ignoredLines;
            continue;
        }
        if (kind == kSent) {
            sentOfRun[run].append(sent.size());
            sent.append(Entry{address, QString::fromUtf8(fields.value(4))});
        } else if (kind == kEnd) {
            // What the run mailed up to here is done with; it may go on after a reset.
            for (const qsizetype at : sentOfRun.take(run))
                sent[at].reset();
        }
    }
    QSet<QString> seen;
    for (const std::optional<Entry>& entry : std::as_const(sent)) {
        if (!entry || seen.contains(entry->address.toCaseFolded()))
            continue;
        seen.insert(entry->address.toCaseFolded());
        reading.unfinished.append(*entry);
    }
    return reading;
}

// Made under a name no scan looks at and locked before it gets its real one, so that another
// Pelmo starting at this moment never takes a journal in use for a leftover.
bool SentLedger::open() {
    if (m_folder.isEmpty()) {
        errno = ENOENT;
        return false;
    }
    const QString id = QUuid::createUuid().toString(QUuid::WithoutBraces);
    const QString making = QDir(m_folder).filePath(QStringLiteral("Sent-%1.part").arg(id));
    const QString path = QDir(m_folder).filePath(QStringLiteral("Sent-%1.ledger").arg(id));
    const int fd = ::open(QFile::encodeName(making).constData(),
                          O_WRONLY | O_CREAT | O_EXCL | O_APPEND | O_CLOEXEC, 0600);
    if (fd < 0)
        return false;
    if (::flock(fd, LOCK_EX | LOCK_NB) != 0 ||
        ::rename(QFile::encodeName(making).constData(), QFile::encodeName(path).constData()) != 0) {
        const int why = errno;
        ::close(fd);
        ::unlink(QFile::encodeName(making).constData());
        errno = why;
        return false;
    }
    m_fd = fd;
    m_path = path;
    m_syncer = std::make_unique<Syncer>(fd);
    m_state = State::Open;
    return true;
}

bool SentLedger::append(const QByteArray& lines) {
    if (m_state == State::Failed || m_state == State::Closed)
        return false;
    if (m_state == State::Unopened && !open()) {
        fail(systemError());
        return false;
    }
    // One write of whole lines: a crash can tear only the last one.
    const char* at = lines.constData();
    qsizetype left = lines.size();
    while (left > 0) {
        const ssize_t written = ::write(m_fd, at, static_cast<size_t>(left));
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0) {
            fail(systemError());
            return false;
        }
        at += written;
        left -= written;
    }
    m_syncer->request();
    return true;
}

bool SentLedger::waitUntilDurable() {
    if (!m_syncer || m_state != State::Open)
        return m_state != State::Failed;
    if (const int failed = m_syncer->wait(); failed != 0) {
        errno = failed;
        fail(systemError());
        return false;
    }
    return true;
}

void SentLedger::closeJournal() {
    m_syncer.reset();
    if (m_fd >= 0)
        ::close(m_fd);
    m_fd = -1;
}

void SentLedger::fail(const QString& why) {
    m_state = State::Failed;
    Q_EMIT statusMessage(
        LocalizedStringNS("The sent ledger cannot be written (%1): mailing goes on, but if Pelmo "
                          "stops unexpectedly it will not know who was mailed.")
            .arg(why));
}

bool SentLedger::recordSent(const QString& run, const QString& address, const QString& messageId) {
    // A control character would break the line apart; the server refuses such an address
    // anyway.
    if (!plainField(address) || !plainField(messageId) || !plainField(run))
        return false;
    QByteArray lines;
    if (!m_started.contains(run))
        lines = line({kStart, timeNow(), run.toUtf8()});
    lines += line({kSent, timeNow(), run.toUtf8(), address.toUtf8(), messageId.toUtf8()});
    if (!append(lines))
        return false;
    if (!m_started.contains(run))
        m_started.append(run);
    return true;
}

void SentLedger::finishRun(const QString& run) {
    if (m_started.removeAll(run) > 0)
        append(line({kEnd, timeNow(), run.toUtf8()}));
}

void SentLedger::forgetAll() {
    QByteArray lines;
    for (const QString& run : std::as_const(m_started))
        lines += line({kEnd, timeNow(), run.toUtf8()});
    m_started.clear();
    if (!lines.isEmpty())
        append(lines);
}

void SentLedger::close() {
    if (m_fd >= 0) {
        ::unlink(QFile::encodeName(m_path).constData());
        closeJournal();
    }
    m_state = State::Closed;
}

QList<SentLedger::Entry> SentLedger::claimInterrupted() {
    QList<Entry> entries;
    if (m_folder.isEmpty())
        return entries;
    const QDir folder(m_folder);
    for (const QString& name :
         folder.entryList({QStringLiteral("Sent-*.ledger")}, QDir::Files, QDir::Name)) {
        const QString path = folder.filePath(name);
        if (path == m_path)
            continue;
        const int fd = ::open(QFile::encodeName(path).constData(), O_RDONLY | O_CLOEXEC);
        if (fd < 0)
            continue;
        // Held by a Pelmo that is running.
        if (::flock(fd, LOCK_EX | LOCK_NB) != 0) {
            ::close(fd);
            continue;
        }
        const Reading reading = read(readAll(fd));
        if (reading.unfinished.isEmpty()) {
            ::unlink(QFile::encodeName(path).constData());
            ::close(fd);
            continue;
        }
        entries += reading.unfinished;
        m_claimed.append({path, fd});
    }
    return entries;
}

void SentLedger::removeClaimed() {
    for (const Claimed& claimed : std::as_const(m_claimed)) {
        ::unlink(QFile::encodeName(claimed.path).constData());
        ::close(claimed.fd);
    }
    m_claimed.clear();
}
