#include "browser/FirefoxSession.h"
#include "RowName.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <cstring>
#include <functional>

namespace {

QByteArray recorded() {
    QFile file(QStringLiteral(PELMO_TEST_DATA "/browser/two-windows.jsonlz4"));
    EXPECT_TRUE(file.open(QIODevice::ReadOnly));
    return file.readAll();
}

// text as a mozLz4 file whose LZ4 block is one run of literals.
QByteArray mozLz4(const QByteArray& text) {
    QByteArray out("mozLz40\0", 8);
    for (int shift = 0; shift < 32; shift += 8)
        out += char(text.size() >> shift);
    out += char(std::min<qsizetype>(text.size(), 15) << 4);
    for (qsizetype rest = text.size() - 15; rest >= 0; rest -= 255)
        out += char(std::min<qsizetype>(rest, 255));
    return out + text;
}

struct SessionRow {
    std::string name;
    std::function<QByteArray(QByteArray)> make;
    const char *url, *title, *why;
};
void PrintTo(const SessionRow& row, std::ostream* out) {
    *out << row.name;
}

class SessionRows : public testing::TestWithParam<SessionRow> {};

// The recorded session has two open windows, a closed one and a private one (which Firefox
// leaves out); the front is the first window's second tab, taken back one page.
const char* const beta = "http://127.0.0.1:18931/beta.html";
const SessionRow sessionRows[] = {
    {"RecordedSecondTabBackOnePage", [](QByteArray f) { return f; }, beta, "Page beta", ""},
    {"CutInMagic", [](QByteArray f) { return f.left(5); }, "", "", "not a mozLz4 file"},
    {"CutInSize", [](QByteArray f) { return f.left(10); }, "", "", "truncated mozLz4 header"},
    {"NoBlock", [](QByteArray f) { return f.left(12); }, "", "", "truncated LZ4 block"},
    {"CutInBlock", [](QByteArray f) { return f.left(900); }, "", "", "corrupt or truncated"},
    {"LastByteCut", [](QByteArray f) { return f.chopped(1); }, "", "", "corrupt or truncated"},
    {"WrongMagic", [](QByteArray f) { return f.replace(3, 1, "Z"); }, "", "", "not a mozLz4"},
    {"SizeOneMore", [](QByteArray f) { return f.replace(8, 1, QByteArray(1, f[8] + 1)); }, "", "",
     "LZ4 block of 4689 bytes where the header says 4690"},
    {"HostileSize", [](QByteArray f) { return f.replace(8, 4, "\xff\xff\xff\x7f"); }, "", "",
     "session too large"},
    {"CorruptOffset", [](QByteArray f) { return f.replace(f.size() / 2, 4, "\xff\xff\xff\xff"); },
     "", "", "corrupt or truncated"},
    {"NotJson", [](QByteArray) { return mozLz4("windows"); }, "", "", "not a session"},
    {"NoWindows", [](QByteArray) { return mozLz4(R"({"windows":[],"_closedWindows":[{}]})"); }, "",
     "", "no windows in the session"},
    {"SelectedWindowOutOfRange",
     [](QByteArray) { return mozLz4(R"({"selectedWindow":2,"windows":[{"tabs":[{}]}]})"); }, "", "",
     "selectedWindow out of range of the windows"},
    {"DefaultsFirstWindowLastEntryNullTitle",
     [](QByteArray) {
         return mozLz4(R"({"selectedWindow":0,"windows":[{"tabs":[{"entries":[{"url":"a"},)"
                       R"({"url":"b"}]}]}, {}],"padding":")" +
                       QByteArray(300, 'x') + "\"}");
     },
     "b", nullptr, ""},
    {"EmptyUrl", [](QByteArray) { return mozLz4(R"({"windows":[{"tabs":[{"entries":[{}]}]}]})"); },
     "", "", "the front page has no address"},
};

TEST_P(SessionRows, FrontPage) {
    const SessionRow& row = GetParam();
    QString why;
    const QByteArray json = FirefoxSession::decodeMozLz4(row.make(recorded()), &why);
    const auto page = json.isNull() ? std::nullopt : FirefoxSession::frontPage(json, &why);
    EXPECT_EQ(why.left(qsizetype(strlen(row.why))), row.why);
    EXPECT_EQ(page.has_value(), !*row.why);
    if (page) {
        EXPECT_EQ(page->url, row.url);
        EXPECT_EQ(page->title, row.title);
        EXPECT_EQ(page->title.isNull(), !row.title);
    }
}
INSTANTIATE_TEST_SUITE_P(Firefox, SessionRows, testing::ValuesIn(sessionRows), RowName());

struct ProfileRow {
    std::string name;
    const char *profiles, *installs, *args, *locks, *sessions, *folder;
};
void PrintTo(const ProfileRow& row, std::ostream* out) {
    *out << row.name;
}

class ProfileRows : public testing::TestWithParam<ProfileRow> {};

const char* const twoProfiles =
    "[General]\nStartWithLastProfile=1\n[Profile1]\nName=home\nIsRelative=1\nPath=a.home\n"
    "Default=1\n\n[Profile0]\nName=work\nIsRelative=0\nPath=/srv/w.work\n";
const ProfileRow profileRows[] = {
    {"ProfileWithEquals", twoProfiles, "", "ff --profile=/x/y", "", "", "/x/y"},
    {"ProfileBeforeUrl", twoProfiles, "", "ff -profile /x/p http://a", "", "", "/x/p"},
    {"NamedByP", twoProfiles, "", "ff -P work", "", "", "/srv/w.work"},
    {"UnknownName", twoProfiles, "", "ff -P play", "", "", "no profile named play in"},
    {"LockNamesThisPid",
     "[Profile0]\nIsRelative=1\nPath=a\nDefault=1\n[Profile1]\nIsRelative=1\nPath=b\n", "", "ff",
     "a:+424 b:+4242", "", "b"},
    {"NewestInstallDefault", twoProfiles, "[X]\nDefault=a\n[Y]\nDefault=b\n[Z]\nDefault=c\n", "ff",
     "", "a c b", "b"},
    {"InstallInProfilesIni", "[Profile0]\nIsRelative=1\nPath=a\n[InstallX]\nDefault=c\n", "", "ff",
     "", "", "c"},
    {"DefaultOne", twoProfiles, "", "ff", "", "", "a.home"},
    {"NoProfilesIni", "", "", "ff", "", "", "no profiles.ini in"},
};

TEST_P(ProfileRows, ProfileFolder) {
    const ProfileRow& row = GetParam();
    QTemporaryDir home;
    const auto write = [&](const QString& name, const char* text) {
        QFile file(home.filePath(name));
        return !*text || (file.open(QIODevice::WriteOnly) && file.write(text) >= 0);
    };
    ASSERT_TRUE(write("profiles.ini", row.profiles) && write("installs.ini", row.installs));
    for (const QString& lock : QString(row.locks).split(' ', Qt::SkipEmptyParts)) {
        QDir(home.path()).mkpath(lock.section(':', 0, 0));
        QFile::link("127.0.0.1:" + lock.section(':', 1),
                    home.filePath(lock.section(':', 0, 0)) + "/lock");
    }
    const QStringList sessions = QString(row.sessions).split(' ', Qt::SkipEmptyParts);
    for (qsizetype i = 0; i < sessions.size(); ++i) {
        QDir(home.path()).mkpath(sessions[i] + "/sessionstore-backups");
        QFile file(home.filePath(sessions[i] + "/sessionstore-backups/recovery.jsonlz4"));
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.setFileTime(QDateTime::currentDateTime().addSecs(i * 60 - 600),
                         QFileDevice::FileModificationTime);
    }
    QString why;
    const QString folder =
        FirefoxSession::profileFolder(home.path(), QString(row.args).split(' '), 4242, &why);
    const QString expected =
        QString(row.folder).startsWith("/") || QString(row.folder).contains(' ')
            ? row.folder
            : home.filePath(row.folder);
    EXPECT_EQ(folder.isNull() ? why.left(expected.size()) : folder, expected);
}
INSTANTIATE_TEST_SUITE_P(Firefox, ProfileRows, testing::ValuesIn(profileRows), RowName());

} // namespace
