#pragma once

#include <QString>
#include <QStringList>
#include <QtGlobal>

/**
 * One person of the address book. A name part the record does not have is a null QString
 * (not an empty one), so that callers can tell "missing" from "blank". The addresses keep
 * their order; primary indexes the preferred one, or is -1 when there is no address.
 */
struct Person {
    qint64 id = 0;
    QString firstName;
    QString lastName;
    QStringList emails;
    int primary = -1;

    /** The primary address, or a null QString when the person has none. */
    QString primaryEmail() const {
        return primary >= 0 && primary < emails.size() ? emails.at(primary) : QString();
    }
    /** First and last name joined by one space, leaving out the missing ones. */
    QString fullName() const {
        QStringList parts;
        for (const QString& part : {firstName, lastName})
            if (!part.isEmpty())
                parts << part;
        return parts.join(QLatin1Char(' '));
    }
};
