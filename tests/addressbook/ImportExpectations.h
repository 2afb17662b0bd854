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

// A table row: a text and the contacts it gives.
struct ParseCase {
    const char* name;
    QByteArray text;
    QList<ExpectedContact> expected;
};

// A table row: a malformed text, the line blamed and the whole reason.
struct BadCase {
    const char* name;
    QByteArray text;
    int line;
    const char* reason;
};

inline void PrintTo(const ParseCase& row, std::ostream* out) {
    *out << row.name;
}
inline void PrintTo(const BadCase& row, std::ostream* out) {
    *out << row.name;
}

using Parser = QList<ImportedContact> (*)(const QByteArray&);

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

inline void expectRefused(Parser parse, const BadCase& row) {
    const auto [line, reason] = importFailure([&] { parse(row.text); });
    EXPECT_EQ(line, row.line);
    EXPECT_EQ(reason, QString::fromUtf8(row.reason));
}
