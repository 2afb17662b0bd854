#include "addressbook/AddressBook.h"

#include "util/PelmoException.h"

#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <functional>
#include <memory>

namespace {

Person person(const char* first, const char* last, QStringList emails = {}, int primary = 0) {
    Person made;
    made.firstName = first ? QString::fromUtf8(first) : QString();
    made.lastName = last ? QString::fromUtf8(last) : QString();
    made.emails = std::move(emails);
    made.primary = made.emails.isEmpty() ? -1 : primary;
    return made;
}

QStringList names(const QList<Person>& persons) {
    QStringList list;
    for (const Person& one : persons)
        list << one.fullName();
    return list;
}

QStringList names(const QList<Group>& groups) {
    QStringList list;
    for (const Group& group : groups)
        list << group.name;
    return list;
}

// The name of the failure change throws, or "" when it throws none.
QString failureOf(const std::function<void()>& change) {
    try {
        change();
    } catch (const PelmoException& failure) {
        EXPECT_FALSE(failure.reason().isEmpty());
        return failure.name();
    }
    return {};
}

class Editing : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(folder.isValid());
        book = std::make_unique<AddressBook>(folder.filePath(QStringLiteral("book.sqlite")));
    }

    QTemporaryDir folder;
    std::unique_ptr<AddressBook> book;
};

TEST_F(Editing, AddsAPersonWithAPrimaryAddress) {
    const qint64 id =
        book->addPerson(person("Ada", "Lovelace", {"ada@work.example", "ada@example.org"}, 1));
    const std::optional<Person> ada = book->person(id);
    ASSERT_TRUE(ada.has_value());
    EXPECT_EQ(ada->fullName(), QStringLiteral("Ada Lovelace"));
    EXPECT_EQ(ada->emails, QStringList({"ada@work.example", "ada@example.org"}));
    EXPECT_EQ(ada->primaryEmail(), QStringLiteral("ada@example.org"));
}

TEST_F(Editing, APersonWithoutAddressesHasNoPrimary) {
    const qint64 id = book->addPerson(person("Cher", nullptr));
    EXPECT_EQ(book->person(id)->primary, -1);
    EXPECT_TRUE(book->person(id)->lastName.isNull());
}

TEST_F(Editing, RefusesPersonsItCannotMail) {
    EXPECT_EQ(failureOf([&] { book->addPerson(person(" ", "")); }), QStringLiteral("NoPersonName"));
    EXPECT_EQ(failureOf([&] { book->addPerson(person("Eve", "Evil\r\nBcc: all")); }),
              QStringLiteral("BadName"));
    EXPECT_EQ(failureOf([&] { book->addPerson(person("Ada", "L", {"ada at example.org"})); }),
              QStringLiteral("BadAddress"));
    EXPECT_EQ(failureOf([&] { book->addPerson(person("Ada", "L", {"a@example.org"}, 1)); }),
              QStringLiteral("BadPrimaryAddress"));
    EXPECT_TRUE(book->persons().isEmpty());
}

TEST_F(Editing, UpdateReplacesNamesAndAddresses) {
    const qint64 id = book->addPerson(person("Ada", "Byron", {"ada@old.example"}));
    Person changed = person("Ada", "Lovelace", {"ada@example.org", "ada@work.example"}, 1);
    changed.id = id;
    book->updatePerson(changed);
    const Person ada = *book->person(id);
    EXPECT_EQ(ada.lastName, QStringLiteral("Lovelace"));
    EXPECT_EQ(ada.emails, QStringList({"ada@example.org", "ada@work.example"}));
    EXPECT_EQ(ada.primaryEmail(), QStringLiteral("ada@work.example"));
}

TEST_F(Editing, AFailedUpdateKeepsThePersonAsItWas) {
    const qint64 id = book->addPerson(person("Ada", "Byron", {"ada@old.example"}));
    Person changed = person("Ada", "Lovelace", {"ada@example.org", "not an address"});
    changed.id = id;
    EXPECT_EQ(failureOf([&] { book->updatePerson(changed); }), QStringLiteral("BadAddress"));
    EXPECT_EQ(book->person(id)->lastName, QStringLiteral("Byron"));
    EXPECT_EQ(book->person(id)->emails, QStringList({"ada@old.example"}));
    changed = person("Nobody", "Here");
    changed.id = id + 100;
    EXPECT_EQ(failureOf([&] { book->updatePerson(changed); }), QStringLiteral("NoSuchPerson"));
}

TEST_F(Editing, RemovingAPersonTakesItOutOfItsGroups) {
    const qint64 ada = book->addPerson(person("Ada", "Lovelace", {"ada@example.org"}));
    const qint64 alan = book->addPerson(person("Alan", "Turing", {"alan@example.org"}));
    const qint64 club = book->addGroup(QStringLiteral("Club"));
    book->addMember(club, ada);
    book->addMember(club, alan);
    book->removePerson(ada);
    EXPECT_FALSE(book->person(ada).has_value());
    EXPECT_EQ(names(*book->members(club)), QStringList({"Alan Turing"}));
    EXPECT_EQ(failureOf([&] { book->removePerson(ada); }), QStringLiteral("NoSuchPerson"));
}

TEST_F(Editing, GroupsAreNamedOnceIgnoringCase) {
    const qint64 club = book->addGroup(QStringLiteral("  Chess Club "));
    EXPECT_EQ(book->group(club)->name, QStringLiteral("Chess Club"));
    EXPECT_EQ(failureOf([&] { book->addGroup(QStringLiteral("chess club")); }),
              QStringLiteral("GroupNameTaken"));
    EXPECT_EQ(failureOf([&] { book->addGroup(QStringLiteral("  ")); }),
              QStringLiteral("NoGroupName"));
    EXPECT_EQ(book->groups().size(), 1);
}

TEST_F(Editing, RenamesAGroup) {
    const qint64 club = book->addGroup(QStringLiteral("Chess"));
    const qint64 other = book->addGroup(QStringLiteral("Go"));
    book->renameGroup(club, QStringLiteral("CHESS")); // its own name in other letters
    EXPECT_EQ(book->group(club)->name, QStringLiteral("CHESS"));
    book->renameGroup(club, QStringLiteral("Bridge"));
    EXPECT_EQ(book->groupNamed(QStringLiteral("bridge"))->id, club);
    EXPECT_EQ(failureOf([&] { book->renameGroup(club, QStringLiteral("go")); }),
              QStringLiteral("GroupNameTaken"));
    EXPECT_EQ(failureOf([&] { book->renameGroup(other + club, QStringLiteral("X")); }),
              QStringLiteral("NoSuchGroup"));
}

TEST_F(Editing, RemovingAGroupKeepsItsMembers) {
    const qint64 ada = book->addPerson(person("Ada", "Lovelace", {"ada@example.org"}));
    const qint64 club = book->addGroup(QStringLiteral("Club"));
    book->addMember(club, ada);
    book->removeGroup(club);
    EXPECT_TRUE(book->groups().isEmpty());
    EXPECT_TRUE(book->person(ada).has_value());
    EXPECT_TRUE(book->groupsOf(ada).isEmpty());
    EXPECT_EQ(failureOf([&] { book->removeGroup(club); }), QStringLiteral("NoSuchGroup"));
}

TEST_F(Editing, MembersJoinAtTheEndOnceAndLeave) {
    const qint64 ada = book->addPerson(person("Ada", "Lovelace", {"ada@example.org"}));
    const qint64 alan = book->addPerson(person("Alan", "Turing", {"alan@example.org"}));
    const qint64 club = book->addGroup(QStringLiteral("Club"));
    const qint64 work = book->addGroup(QStringLiteral("Work"));
    book->addMember(club, alan);
    book->addMember(club, ada);
    book->addMember(club, alan);
    book->addMember(work, ada);
    EXPECT_EQ(names(*book->members(club)), QStringList({"Alan Turing", "Ada Lovelace"}));
    EXPECT_EQ(names(book->groupsOf(ada)), QStringList({"Club", "Work"}));
    book->removeMember(club, alan);
    book->removeMember(club, alan);
    EXPECT_EQ(names(*book->members(club)), QStringList({"Ada Lovelace"}));
    EXPECT_EQ(failureOf([&] { book->addMember(club, alan + ada); }),
              QStringLiteral("NoSuchPerson"));
    EXPECT_EQ(failureOf([&] { book->addMember(club + work, ada); }), QStringLiteral("NoSuchGroup"));
}

TEST_F(Editing, ChangesAreSeenByAnotherConnection) {
    AddressBook other(folder.filePath(QStringLiteral("book.sqlite")));
    const qint64 ada = book->addPerson(person("Ada", "Lovelace", {"ada@example.org"}));
    EXPECT_EQ(names(other.persons()), QStringList({"Ada Lovelace"}));
    other.removePerson(ada);
    EXPECT_TRUE(book->persons().isEmpty());
}

} // namespace
