#pragma once

#include "addressbook/Person.h"

#include <QList>
#include <QString>
#include <QStringList>

/**
 * What the user typed into a search field, as a test of persons. Each word of the query must
 * be part of the first name, the last name or one of the addresses, ignoring letter case; a
 * blank query matches everybody. Cheap enough to run on every key press over a large book.
 */
class PersonFilter {
public:
    explicit PersonFilter(const QString& query);

    bool matches(const Person& person) const;
    /** The persons that match, in their order. */
    QList<Person> filter(const QList<Person>& persons) const;
    /** The persons that match query, in their order. */
    static QList<Person> filter(const QList<Person>& persons, const QString& query);

private:
    QStringList words;
};
