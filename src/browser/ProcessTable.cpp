#include "browser/ProcessTable.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace {

QByteArray readAll(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

// proc(5): "pid (comm) state ppid ... starttime"; comm may hold spaces and parentheses, so
// the fields are counted from the last ')'.
bool readStat(const QByteArray& stat, ProcessTable::Process& process) {
    const qsizetype close = stat.lastIndexOf(')');
    if (close < 0)
        return false;
    const QList<QByteArray> fields = stat.mid(close + 1).simplified().split(' ');
    // fields[0] is the state (field 3); the parent is field 4, the start time field 22.
    if (fields.size() < 20)
        return false;
    bool ok = false, okStarted = false;
    process.parent = fields[1].toLongLong(&ok);
    process.started = fields[19].toULongLong(&okStarted);
    return ok && okStarted;
}

} // namespace

ProcessTable::ProcessTable(const QString& procRoot) {
    const QDir root(procRoot);
    for (const QString& entry : root.entryList(QDir::Dirs | QDir::NoDotAndDotDot)) {
        Process process;
        bool isPid = false;
        process.pid = entry.toLongLong(&isPid);
        const QString dir = root.filePath(entry) + QLatin1Char('/');
        if (!isPid || !readStat(readAll(dir + QLatin1String("stat")), process))
            continue;
        process.comm = QString::fromUtf8(readAll(dir + QLatin1String("comm"))).trimmed();
        process.exe = QFileInfo(QFile::symLinkTarget(dir + QLatin1String("exe"))).fileName();
        QByteArray cmdline = readAll(dir + QLatin1String("cmdline"));
        if (cmdline.endsWith('\0'))
            cmdline.chop(1);
        if (!cmdline.isEmpty())
            for (const QByteArray& argument : cmdline.split('\0'))
                process.arguments.append(QString::fromUtf8(argument));
        m_processes.append(process);
    }
}

const ProcessTable::Process* ProcessTable::find(qint64 pid) const {
    for (const Process& process : m_processes)
        if (process.pid == pid)
            return &process;
    return nullptr;
}
