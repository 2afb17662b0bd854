#pragma once

#include <QList>
#include <QString>
#include <QStringList>

/**
 * The processes of a /proc tree, read once when constructed. The root is a parameter so that
 * tests can hand in a tree of their own. A process that ends while it is read, or whose files
 * cannot be read, is left out.
 */
class ProcessTable {
public:
    struct Process {
        qint64 pid = 0;
        qint64 parent = 0;
        quint64 started = 0; ///< clock ticks after boot, from stat
        QString comm;        ///< the kernel's name, at most 15 bytes
        QString exe;         ///< the executable's file name, empty when unreadable
        QStringList arguments;
    };

    explicit ProcessTable(const QString& procRoot = QStringLiteral("/proc"));

    const QList<Process>& processes() const { return m_processes; }
    /** The process with that pid, or null. */
    const Process* find(qint64 pid) const;

private:
    QList<Process> m_processes;
};
