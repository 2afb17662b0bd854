#include <QDir>
#include <QProcess>
#include <QProcessEnvironment>
#include <QTemporaryDir>
#include <gtest/gtest.h>

namespace {

struct Outcome {
    int status;
    QString out;
    QString err;
};

// Runs the pelmo program as a user would, with its data folder in a temporary home.
class ContactsCommand : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(home.isValid()); }

    Outcome pelmo(const QStringList& args) {
        QProcess process;
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("XDG_DATA_HOME"), home.path());
        environment.insert(QStringLiteral("XDG_CONFIG_HOME"), home.path());
        process.setProcessEnvironment(environment);
        process.start(QStringLiteral(PELMO_EXECUTABLE), args);
        EXPECT_TRUE(process.waitForFinished(60000));
        return {process.exitCode(), QString::fromUtf8(process.readAllStandardOutput()),
                QString::fromUtf8(process.readAllStandardError())};
    }

    static QString sample(const char* name) {
        return QDir(QStringLiteral(PELMO_TEST_DATA "/../../samples")).filePath(QLatin1String(name));
    }

    QTemporaryDir home;
};

TEST_F(ContactsCommand, ImportThenListAGroup) {
    const Outcome imported = pelmo({"contacts", "import", sample("friends.vcf")});
    EXPECT_EQ(imported.status, 0) << imported.err.toStdString();
    EXPECT_EQ(imported.out, QStringLiteral("Imported 4 persons and 2 groups from friends.vcf.\n"));
    const Outcome listed = pelmo({"contacts", "list", "--group", "Friends"});
    EXPECT_EQ(listed.status, 0);
    EXPECT_EQ(listed.out, QStringLiteral("Ada Lovelace <ada@example.org>\n"
                                         "Charles Babbage <charles@example.org>\n"
                                         "Alan Turing <alan@example.org>\n"));
    const Outcome everyone = pelmo({"contacts", "list"});
    EXPECT_EQ(everyone.out.count(QLatin1Char('\n')), 4);
    EXPECT_TRUE(everyone.out.startsWith(QStringLiteral("Charles Babbage <charles@example.org>\n")));
}

TEST_F(ContactsCommand, ImportingAgainAddsNobodyTwice) {
    pelmo({"contacts", "import", sample("friends.vcf")});
    const Outcome again = pelmo({"contacts", "import", sample("friends.vcf")});
    EXPECT_EQ(again.status, 0);
    EXPECT_EQ(again.out, QStringLiteral("Imported 0 persons and 2 groups from friends.vcf. "
                                        "4 were already in the address book.\n"));
    EXPECT_EQ(pelmo({"contacts", "list"}).out.count(QLatin1Char('\n')), 4);
}

TEST_F(ContactsCommand, CsvImport) {
    const Outcome imported = pelmo({"contacts", "import", sample("contacts.csv")});
    EXPECT_EQ(imported.status, 0) << imported.err.toStdString();
    EXPECT_EQ(imported.out, QStringLiteral("Imported 2 persons and 2 groups from contacts.csv.\n"));
    EXPECT_EQ(
        pelmo({"contacts", "list", "--group", "scientists"}).out,
        QStringLiteral("Marie Curie <marie@example.org>\nPierre Curie <pierre@example.org>\n"));
}

TEST_F(ContactsCommand, MalformedFileNamesTheLineAndImportsNothing) {
    const Outcome failed =
        pelmo({"contacts", "import", QStringLiteral(PELMO_TEST_DATA "/halfway.vcf")});
    EXPECT_EQ(failed.status, 1);
    EXPECT_TRUE(failed.out.isEmpty());
    EXPECT_TRUE(failed.err.contains(
        QStringLiteral("halfway.vcf: line 10: \"pierre at example.org\" is not an e-mail address")))
        << failed.err.toStdString();
    EXPECT_TRUE(pelmo({"contacts", "list"}).out.isEmpty());
}

TEST_F(ContactsCommand, UnknownGroupIsAnErrorNamingTheGroups) {
    pelmo({"contacts", "import", sample("friends.vcf")});
    const Outcome failed = pelmo({"contacts", "list", "--group", "Chess"});
    EXPECT_EQ(failed.status, 1);
    EXPECT_EQ(failed.err, QStringLiteral("pelmo: the address book has no group \"Chess\"; its "
                                         "groups are: Engineers, Friends.\n"));
}

TEST_F(ContactsCommand, UsageErrors) {
    for (const QStringList& args :
         {QStringList{"contacts"}, QStringList{"contacts", "import"},
          QStringList{"contacts", "list", "--group"}, QStringList{"contacts", "list", "extra"},
          QStringList{"contacts", "remove", "x"}}) {
        const Outcome run = pelmo(args);
        EXPECT_EQ(run.status, 2) << args.join(' ').toStdString();
        EXPECT_TRUE(run.err.contains(QStringLiteral("pelmo contacts import FILE")));
    }
}

} // namespace
