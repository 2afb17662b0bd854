#include "addressbook/ContactsFile.h"

#include "ImportExpectations.h"
#include "addressbook/AddressBook.h"

#include <QTemporaryDir>

namespace {

QString dataPath(const char* name) {
    return QStringLiteral(PELMO_TEST_DATA "/") + QLatin1String(name);
}

TEST(ContactsFile, KindFromNameOrText) {
    EXPECT_TRUE(ContactsFile::isVCard(QStringLiteral("a.VCF"), "x"));
    EXPECT_TRUE(ContactsFile::isVCard(QStringLiteral("a.vcard"), "x"));
    EXPECT_TRUE(ContactsFile::isVCard(QStringLiteral("a.txt"), "\xef\xbb\xbf\r\nbegin:vcard\r\n"));
    EXPECT_FALSE(ContactsFile::isVCard(QStringLiteral("a.csv"), "email\n"));
    EXPECT_FALSE(ContactsFile::isVCard(QStringLiteral("a.txt"), "first name,email\n"));
}

TEST(ContactsFile, UnreadableFileIsRefused) {
    const auto [line, reason] =
        importFailure([] { ContactsFile::read(QStringLiteral("/nonexistent/friends.vcf")); });
    EXPECT_EQ(line, 0);
    EXPECT_TRUE(reason.startsWith(QStringLiteral("the file cannot be read: ")));
}

// Each malformed file fails half-way through its text; the book keeps what it had.
TEST(ContactsFile, FileFailingHalfWayLeavesTheBookUnchanged) {
    QTemporaryDir folder;
    ASSERT_TRUE(folder.isValid());
    AddressBook book(folder.filePath(QStringLiteral("book.sqlite")));
    book.add(ContactsFile::read(dataPath("v30.vcf")));
    const qsizetype persons = book.persons().size();
    const qsizetype groups = book.groups().size();
    const qint64 friends = book.groupNamed(QStringLiteral("Friends"))->id;
    const qsizetype members = book.members(friends)->size();
    for (const auto& [file, line] : {std::pair{"halfway.vcf", 10}, std::pair{"halfway.csv", 3}}) {
        const auto failure =
            importFailure([&, f = file] { book.add(ContactsFile::read(dataPath(f))); });
        EXPECT_EQ(failure.first, line) << file;
        EXPECT_EQ(book.persons().size(), persons) << file;
        EXPECT_EQ(book.groups().size(), groups) << file;
        EXPECT_EQ(book.members(friends)->size(), members) << file;
    }
}

} // namespace
