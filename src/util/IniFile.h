#pragma once

#include <QHash>
#include <QList>
#include <QString>

/**
 * A plain ini file as the desktop writes them (Firefox's profiles.ini, mimeapps.list, .desktop
 * files): [groups] and key=value lines, no quoting, no escapes, read as UTF-8. Lines before
 * the first group, and lines holding a NUL byte, are left out; at most 1 MiB is read. A file
 * that cannot be read has no groups.
 */
class IniFile {
public:
    struct Group {
        QString name;
        QHash<QString, QString> keys;
    };

    explicit IniFile(const QString& path);

    const QList<Group>& groups() const { return m_groups; }
    /** The value of key in the first group named group that has it; null when none has. */
    QString value(const QString& group, const QString& key) const;

private:
    QList<Group> m_groups;
};
