#pragma once

#include "addressbook/ImportError.h"
#include "addressbook/ImportedContact.h"

#include <QList>
#include <QStringList>
#include <gtest/gtest.h>

#include <functional>

// One parsed contact as a test expects it; a null name part is written as nullptr.
struct ExpectedContact {
    const char* first;
    const char* last;
    QStringList emails;
    int primary;
    QStringList groups;
};

inline void expectContacts(const QList<ImportedContact>& actual,
                           const QList<ExpectedContact>& expected) {
    ASSERT_EQ(actual.size(), expected.size());
    for (qsizetype i = 0; i < actual.size(); ++i) {
        const Person& person = actual[i].person;
        const ExpectedContact& want = expected[i];
        SCOPED_TRACE("contact " + std::to_string(i));
        EXPECT_EQ(person.firstName, want.first ? QString::fromUtf8(want.first) : QString());
        EXPECT_EQ(person.firstName.isNull(), want.first == nullptr);
        EXPECT_EQ(person.lastName, want.last ? QString::fromUtf8(want.last) : QString());
        EXPECT_EQ(person.lastName.isNull(), want.last == nullptr);
        EXPECT_EQ(person.emails, want.emails);
        EXPECT_EQ(person.primary, want.primary);
        EXPECT_EQ(actual[i].groups, want.groups);
    }
}

// Runs parse and answers the failure it raises; a parse that succeeds fails the test.
inline std::pair<int, QString> importFailure(const std::function<void()>& parse) {
    try {
        parse();
    } catch (const ImportError& error) {
        EXPECT_EQ(error.name(), QStringLiteral("MalformedContactsFile"));
        return {error.line(), error.reason()};
    }
    ADD_FAILURE() << "the text was accepted";
    return {-1, QString()};
}
