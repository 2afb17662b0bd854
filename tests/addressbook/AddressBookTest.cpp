#include "addressbook/AddressBook.h"

#include "util/PelmoException.h"

#include "RowName.h"

#include <QSqlDatabase>
#include <QSqlQuery>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <memory>
#include <string>

namespace {

ImportedContact contact(const char* first, const char* last, QStringList emails,
                        QStringList groups = {}) {
    Person person;
    person.firstName = first ? QString::fromUtf8(first) : QString();
    person.lastName = last ? QString::fromUtf8(last) : QString();
    person.emails = std::move(emails);
    person.primary = person.emails.isEmpty() ? -1 : static_cast<int>(person.emails.size()) - 1;
    return {person, std::move(groups)};
}

QStringList names(const QList<Person>& persons) {
    QStringList list;
    for (const Person& person : persons)
        list << person.fullName();
    return list;
}

class Book : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(folder.isValid());
        book = std::make_unique<AddressBook>(path());
    }
    QString path() const { return folder.filePath(QStringLiteral("AddressBook.sqlite")); }

    QTemporaryDir folder;
    std::unique_ptr<AddressBook> book;
};

TEST_F(Book, StoresPersonsWithTheirPrimaryAddress) {
    const ImportSummary summary =
        book->add({contact("Ada", "Lovelace", {"ada@work.example", "ada@example.org"}),
                   contact("Cher", nullptr, {}), contact("Alan", "Turing", {"alan@example.org"})});
    EXPECT_EQ(summary.personsAdded, 3);
    EXPECT_EQ(summary.personsKnown, 0);
    EXPECT_EQ(summary.groups, 0);
    const QList<Person> persons = book->persons();
    EXPECT_EQ(names(persons), QStringList({"Cher", "Ada Lovelace", "Alan Turing"}));
    const Person& ada = persons.at(1);
    EXPECT_EQ(ada.emails, QStringList({"ada@work.example", "ada@example.org"}));
    EXPECT_EQ(ada.primaryEmail(), QStringLiteral("ada@example.org"));
    const Person& cher = persons.at(0);
    EXPECT_TRUE(cher.lastName.isNull());
    EXPECT_TRUE(cher.primaryEmail().isNull());
    EXPECT_EQ(book->person(ada.id)->emails, ada.emails);
    EXPECT_FALSE(book->person(999999).has_value());
}

TEST_F(Book, GroupsKeepTheirMembersInOrder) {
    book->add({contact("Grace", "Hopper", {"g@example.com"}, {"Friends"}),
               contact("Ada", "Lovelace", {"a@example.org"}, {"friends", "Work"})});
    book->add({contact("Alan", "Turing", {"t@example.org"}, {"FRIENDS"})});
    const QList<Group> groups = book->groups();
    ASSERT_EQ(groups.size(), 2);
    EXPECT_EQ(groups.at(0).name, QStringLiteral("Friends"));
    EXPECT_EQ(groups.at(1).name, QStringLiteral("Work"));
    const std::optional<Group> friends = book->groupNamed(QStringLiteral("fRiEnDs"));
    ASSERT_TRUE(friends.has_value());
    EXPECT_EQ(names(*book->members(friends->id)),
              QStringList({"Grace Hopper", "Ada Lovelace", "Alan Turing"}));
    EXPECT_EQ(book->group(friends->id)->name, QStringLiteral("Friends"));
    EXPECT_FALSE(book->members(999999).has_value());
    EXPECT_FALSE(book->groupNamed(QStringLiteral("Nobody")).has_value());
}

TEST_F(Book, GroupNamesIgnoreCaseBeyondAscii) {
    book->add({contact("A", "B", {"a@example.org"}, {QString::fromUtf8("Élèves")})});
    EXPECT_TRUE(book->groupNamed(QString::fromUtf8("éLÈVES")).has_value());
}

TEST_F(Book, AKnownPersonIsNotAddedTwiceButJoinsNewGroups) {
    book->add({contact("Ada", "Lovelace", {"ada@example.org"}, {"Friends"})});
    const ImportSummary summary =
        book->add({contact("Ada", "Lovelace", {"ADA@example.org"}, {"Friends", "Chess"}),
                   contact("Ada", "Lovelace", {"other@example.org"}, {})});
    EXPECT_EQ(summary.personsAdded, 1); // a different primary address is another person
    EXPECT_EQ(summary.personsKnown, 1);
    EXPECT_EQ(summary.groups, 2);
    EXPECT_EQ(book->persons().size(), 2);
    EXPECT_EQ(book->members(book->groupNamed(QStringLiteral("Friends"))->id)->size(), 1);
    EXPECT_EQ(book->members(book->groupNamed(QStringLiteral("Chess"))->id)->size(), 1);
}

TEST_F(Book, KeptAcrossOpenings) {
    book->add({contact("Ada", "Lovelace", {"ada@example.org"}, {"Friends"})});
    book.reset();
    AddressBook reopened(path());
    EXPECT_EQ(names(reopened.persons()), QStringList({"Ada Lovelace"}));
    AddressBook second(path()); // two connections on one file at once
    EXPECT_EQ(second.groups().size(), 1);
}

// A failure in the middle of an import leaves nothing of it behind.
TEST_F(Book, FailureHalfWayKeepsNothing) {
    book->add({contact("Ada", "Lovelace", {"ada@example.org"}, {"Friends"})});
    {
        QSqlDatabase raw =
            QSqlDatabase::addDatabase(QStringLiteral("QSQLITE"), QStringLiteral("raw"));
        raw.setDatabaseName(path());
        ASSERT_TRUE(raw.open());
        QSqlQuery trigger(raw);
        ASSERT_TRUE(trigger.exec(QStringLiteral(
            "CREATE TRIGGER refuse BEFORE INSERT ON persons WHEN NEW.first_name = 'Boom' "
            "BEGIN SELECT RAISE(ABORT, 'refused by the test'); END")));
        raw.close();
    }
    QSqlDatabase::removeDatabase(QStringLiteral("raw"));
    try {
        book->add({contact("Alan", "Turing", {"alan@example.org"}, {"Friends", "New"}),
                   contact("Boom", "Bang", {"boom@example.org"}, {"Friends"})});
        ADD_FAILURE() << "the import went through";
    } catch (const PelmoException& failure) {
        EXPECT_EQ(failure.name(), QStringLiteral("AddressBookUnavailable"));
        EXPECT_TRUE(failure.reason().contains(QStringLiteral("refused by the test")));
    }
    EXPECT_EQ(names(book->persons()), QStringList({"Ada Lovelace"}));
    EXPECT_EQ(book->groups().size(), 1);
    EXPECT_EQ(book->members(book->groupNamed(QStringLiteral("Friends"))->id)->size(), 1);
}

TEST(AddressBookFile, UnopenableFileIsANamedFailure) {
    try {
        AddressBook book(QStringLiteral("/nonexistent-folder/AddressBook.sqlite"));
        ADD_FAILURE() << "opened";
    } catch (const PelmoException& failure) {
        EXPECT_EQ(failure.name(), QStringLiteral("AddressBookUnavailable"));
        EXPECT_TRUE(failure.reason().contains(QStringLiteral("/nonexistent-folder/")));
    }
}

struct BookFileRow {
    std::string name;
    bool inDataFolder; // or at a path in a 0755 folder of the user's
    mode_t existing;   // the mode of an empty file already there; 0 for none
    mode_t expected;
};

class BookFile : public ::testing::TestWithParam<BookFileRow> {
protected:
    void SetUp() override {
        ASSERT_TRUE(home.isValid());
        saved = qgetenv("XDG_DATA_HOME");
        qputenv("XDG_DATA_HOME", home.path().toUtf8());
        // With no umask to narrow them, the modes seen are the ones the code asked for.
        savedMask = ::umask(0);
        ASSERT_EQ(::mkdir(given().c_str(), 0755), 0);
    }
    void TearDown() override {
        ::umask(savedMask);
        qputenv("XDG_DATA_HOME", saved);
    }
    std::string given() const { return home.path().toStdString() + "/given"; }

    static mode_t modeOf(const std::string& path) {
        struct stat status {};
        return ::stat(path.c_str(), &status) == 0 ? status.st_mode & 07777 : 0;
    }

    QTemporaryDir home;
    QByteArray saved;
    mode_t savedMask = 0;
};

TEST_P(BookFile, Mode) {
    const BookFileRow& row = GetParam();
    const std::string path = given() + "/AddressBook.sqlite";
    if (row.existing != 0) {
        const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL, row.existing);
        ASSERT_GE(fd, 0);
        ::close(fd);
    }
    std::unique_ptr<AddressBook> book =
        row.inDataFolder ? std::make_unique<AddressBook>()
                         : std::make_unique<AddressBook>(QString::fromStdString(path));
    book->add({contact("Ada", "Lovelace", {"ada@example.org"})});
    EXPECT_EQ(modeOf(book->path().toStdString()), row.expected);
    // A folder the book did not make is the user's to set.
    EXPECT_EQ(modeOf(given()), mode_t(0755));
}

INSTANTIATE_TEST_SUITE_P(
    Modes, BookFile,
    ::testing::Values(BookFileRow{"NewBookInTheDataFolderIs0600", true, 0, 0600},
                      BookFileRow{"NewBookAtAPathIs0600", false, 0, 0600},
                      // The user may share a book of their own on purpose.
                      BookFileRow{"ExistingBookAtAPathKeepsItsMode", false, 0640, 0640}),
    RowName());

} // namespace
