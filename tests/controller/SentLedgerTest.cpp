#include "controller/SentLedger.h"
#include "RowName.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <sys/stat.h>

namespace {

struct ReadRow {
    std::string name;
    QByteArray bytes;
    QString unfinished; // addresses, space-separated
    int ignored;
};

constexpr char kT[] = "2026-11-23T20:00:00.000Z";

QByteArray sent(const char* run, const char* address) {
    return QByteArray("sent\t") + kT + '\t' + run + '\t' + address + "\t<id@x>\n";
}
QByteArray mark(const char* kind, const char* run) {
    return QByteArray(kind) + '\t' + kT + '\t' + run + '\n';
}

class LedgerReading : public ::testing::TestWithParam<ReadRow> {};

TEST_P(LedgerReading, RestoresOnlyWhatAnUnfinishedRunMailed) {
    const SentLedger::Reading reading = SentLedger::read(GetParam().bytes);
    QStringList addresses;
    for (const SentLedger::Entry& entry : reading.unfinished)
        addresses << entry.address;
    EXPECT_EQ(addresses.join(' ').toStdString(), GetParam().unfinished.toStdString());
    EXPECT_EQ(reading.ignoredLines, GetParam().ignored);
}

const ReadRow kReadRows[] = {
    {"Empty", "", "", 0},
    {"UnfinishedRun", mark("start", "r1") + sent("r1", "a@x") + sent("r1", "b@x"), "a@x b@x", 0},
    {"CompletedRunHasNothing", mark("start", "r1") + sent("r1", "a@x") + mark("end", "r1"), "", 0},
    {"SecondRunOfTheSession",
     sent("r1", "a@x") + mark("end", "r1") + sent("r2", "b@x") + sent("r2", "c@x"), "b@x c@x", 0},
    {"ResetThenGoesOn", sent("r1", "a@x") + mark("end", "r1") + sent("r1", "b@x"), "b@x", 0},
    {"TornLastLineIgnored", sent("r1", "a@x") + "sent\t2026-11-23T20:00:01.000Z\tr1\tb@", "a@x", 0},
    {"LetterCaseOnce", sent("r1", "Ann@X") + sent("r2", "ann@x"), "Ann@X", 0},
    {"GarbageCounted",
     "hello\n" + sent("r1", "a@x") + "sent\tyesterday\tr1\tb@x\t\n" + "sent\t" + kT +
         "\tr1\tno-at\t\n" + "end\t" + kT + "\t\n" + "\n" + mark("start", "r1").chopped(1) +
         "\textra\n",
     "a@x", 6},
    {"CarriageReturnIsNoLineEnd", sent("r1", "a@x").replace('\n', "\r\n"), "", 1},
};
INSTANTIATE_TEST_SUITE_P(SentLedger, LedgerReading, ::testing::ValuesIn(kReadRows), RowName());

QByteArray contents(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

// A journal held by a running Pelmo is never taken; one whose Pelmo died without a clean quit
// is, once; a clean quit leaves nothing behind.
TEST(SentLedger, OnlyAnUncleanSessionLeavesItsRunToRestore) {
    QTemporaryDir folder;
    auto crashed = std::make_unique<SentLedger>(folder.path());
    ASSERT_TRUE(crashed->recordSent("r1", "a@x", "<1@x>"));
    ASSERT_TRUE(crashed->recordSent("r1", "b@x", "<2@x>"));
    struct stat status {};
    ASSERT_EQ(::stat(QFile::encodeName(crashed->path()).constData(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600u);
    const QByteArray written = contents(crashed->path());
    EXPECT_EQ(SentLedger::read(written).unfinished.size(), 2) << written.toStdString();

    SentLedger next(folder.path());
    EXPECT_TRUE(next.claimInterrupted().isEmpty()) << "taken while its Pelmo runs";
    crashed.reset(); // the process ends without close(): its lock goes, its file stays
    const QList<SentLedger::Entry> restored = next.claimInterrupted();
    ASSERT_EQ(restored.size(), 2);
    EXPECT_EQ(restored[1].messageId, "<2@x>");
    SentLedger third(folder.path());
    EXPECT_TRUE(third.claimInterrupted().isEmpty()) << "claimed by two Pelmos";
    next.removeClaimed();
    next.recordSent("r2", "c@x", "<3@x>");
    next.close();
    EXPECT_EQ(QDir(folder.path()).entryList(QDir::Files), QStringList());
}

TEST(SentLedger, AnUnwritableFolderIsReportedOnceAndMailingGoesOn) {
    SentLedger ledger(QStringLiteral("/proc/no-such-folder"));
    QStringList lines;
    QObject::connect(&ledger, &SentLedger::statusMessage,
                     [&lines](const QString& line) { lines << line; });
    EXPECT_FALSE(ledger.recordSent("r1", "a@x", "<1@x>"));
    EXPECT_FALSE(ledger.recordSent("r1", "b@x", "<2@x>"));
    EXPECT_EQ(ledger.state(), SentLedger::State::Failed);
    EXPECT_EQ(lines, QStringList("The sent ledger cannot be written (No such file or directory): "
                                 "mailing goes on, but if Pelmo stops unexpectedly it will not "
                                 "know who was mailed."));
}

} // namespace
