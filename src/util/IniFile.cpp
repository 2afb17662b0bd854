#include "util/IniFile.h"

#include <QFile>

IniFile::IniFile(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return;
    for (const QByteArray& raw : file.read(1024 * 1024).split('\n')) {
        if (raw.contains('\0')) // no path or name holds one; Qt warns of every such name
            continue;
        const QString line = QString::fromUtf8(raw).trimmed();
        if (line.startsWith('[') && line.endsWith(']'))
            m_groups.append({line.mid(1, line.size() - 2), {}});
        else if (const qsizetype eq = line.indexOf('='); eq > 0 && !m_groups.isEmpty())
            m_groups.last().keys.insert(line.left(eq).trimmed(), line.mid(eq + 1).trimmed());
    }
}

QString IniFile::value(const QString& group, const QString& key) const {
    for (const Group& each : m_groups) {
        if (each.name == group && each.keys.contains(key))
            return each.keys.value(key);
    }
    return {};
}
