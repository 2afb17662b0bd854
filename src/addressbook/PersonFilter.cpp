#include "addressbook/PersonFilter.h"

#include <algorithm>

PersonFilter::PersonFilter(const QString& query)
    : words(query.simplified().split(QLatin1Char(' '), Qt::SkipEmptyParts)) {}

bool PersonFilter::matches(const Person& person) const {
    // contains() with Qt::CaseInsensitive compares case-folded characters without making folded
    // copies, which is what keeps a search over thousands of persons fast.
    for (const QString& word : words) {
        const auto holds = [&](const QString& text) {
            return text.contains(word, Qt::CaseInsensitive);
        };
        if (!holds(person.firstName) && !holds(person.lastName) &&
            std::none_of(person.emails.cbegin(), person.emails.cend(), holds))
            return false;
    }
    return true;
}

QList<Person> PersonFilter::filter(const QList<Person>& persons) const {
    if (words.isEmpty())
        return persons;
    QList<Person> found;
    for (const Person& person : persons)
        if (matches(person))
            found.append(person);
    return found;
}

QList<Person> PersonFilter::filter(const QList<Person>& persons, const QString& query) {
    return PersonFilter(query).filter(persons);
}
