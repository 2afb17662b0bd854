#include "browser/FirefoxSession.h"
#include "RowName.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <cstring>

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

// A row's file is its json as mozLz4, else the recorded one cut to cut bytes (less -cut) and
// patched at at (mid-file when -1). It gives "url|title" (a null title shown as ~), or why not.
struct SessionRow {
    std::string name;
    int cut, at;
    const char *patch, *json, *result;
};

class SessionRows : public testing::TestWithParam<SessionRow> {};

// The recorded session has two open windows, a closed one and a private one (which Firefox
// leaves out); in front is the first window's second tab, taken back one page. Its header
// says 4689 bytes (0x1251).
const SessionRow sessionRows[] = {
    {"RecordedSecondTabBackOnePage", 0, 0, "", "", "http://127.0.0.1:18931/beta.html|Page beta"},
    {"CutInSize", 10, 0, "", "", "truncated mozLz4 header"},
    {"NoBlock", 12, 0, "", "", "truncated LZ4 block"},
    {"LastByteCut", -1, 0, "", "", "corrupt or truncated LZ4 block"},
    {"WrongMagic", 0, 3, "Z", "", "not a mozLz4 file"},
    {"SizeOneMore", 0, 8, "\x52", "", "LZ4 block of 4689 bytes where the header says 4690"},
    {"HostileSize", 0, 8, "\xff\xff\xff\x7f", "", "session too large"},
    {"SizeBeyondAnyBlock", 0, 10, "\x80", "", "truncated LZ4 block"},
    {"CorruptBlock", 0, -1, "\xff\xff\xff\xff", "", "corrupt or truncated LZ4 block"},
    {"NotJson", 0, 0, "", "windows", "not a session: illegal value"},
    {"ArrayNotObject", 0, 0, "", "[]", "not a session: no object at the top"},
    {"OnlyClosedWindows", 0, 0, "", R"({"windows":[],"_closedWindows":[{}]})",
     "no windows in the session"},
    {"SelectedWindowOutOfRange", 0, 0, "", R"({"selectedWindow":2,"windows":[{"tabs":[{}]}]})",
     "selectedWindow out of range of the windows"},
    {"SelectedWindowBeyondInt", 0, 0, "",
     R"({"selectedWindow":4294967297,"windows":[{"tabs":[{}]}]})",
     "selectedWindow out of range of the windows"},
    {"IndexOutOfRange", 0, 0, "", R"({"windows":[{"tabs":[{"index":2,"entries":[{"url":"a"}]}]}]})",
     "index out of range of the entries"},
    {"DefaultsFirstWindowLastEntryNullTitle", 0, 0, "",
     R"({"selectedWindow":0,"windows":[{"tabs":[{"entries":[{"url":"a"},{"url":"b"}]}]},{}]})",
     "b|~"},
    {"EmptyUrl", 0, 0, "", R"({"windows":[{"tabs":[{"entries":[{"url":""}]}]}]})",
     "the front page has no address"},
};

TEST_P(SessionRows, FrontPage) {
    const SessionRow& row = GetParam();
    QByteArray file = *row.json ? mozLz4(row.json) : recorded();
    file = row.cut < 0 ? file.chopped(-row.cut) : row.cut ? file.left(row.cut) : file;
    if (*row.patch)
        file.replace(row.at < 0 ? file.size() / 2 : row.at, qsizetype(strlen(row.patch)),
                     row.patch);
    QString why;
    const QByteArray json = FirefoxSession::decodeMozLz4(file, &why);
    const auto page = json.isNull() ? std::nullopt : FirefoxSession::frontPage(json, &why);
    const QString result =
        page ? page->url + '|' + (page->title.isNull() ? "~" : page->title) : why;
    EXPECT_EQ(result.toStdString(), row.result);
}
INSTANTIATE_TEST_SUITE_P(Firefox, SessionRows, testing::ValuesIn(sessionRows), RowName());

// A fake home: its ini files, the command line, and files: "folder:+pid" makes a lock, and a
// bare folder the recorded session, each listed one minute newer than the one before. The row
// gives the folder found (~ is the home) and the title read there, or why none was found.
struct ProfileRow {
    std::string name;
    const char *profiles, *installs, *args, *files, *folder;
};

class ProfileRows : public testing::TestWithParam<ProfileRow> {};

const char* const twoProfiles =
    "[General]\nStartWithLastProfile=1\n[Profile1]\nName=home\nIsRelative=1\nPath=a.home\n"
    "Default=1\n\n[Profile0]\nName=work\nIsRelative=0\nPath=/srv/w.work\n";
const ProfileRow profileRows[] = {
    {"ProfileWithEquals", twoProfiles, "", "ff --profile=/x/y", "", "/x/y"},
    {"ProfileBeforeUrl", twoProfiles, "", "ff -profile /x/p http://a", "", "/x/p"},
    {"NamedByP", twoProfiles, "", "ff -P work", "", "/srv/w.work"},
    {"UnknownName", twoProfiles, "", "ff -P play", "", "no profile named play in profiles.ini"},
    {"LockNamesThisPid",
     "[Profile0]\nIsRelative=1\nPath=a\nDefault=1\n[Profile1]\nIsRelative=1\nPath=b\n", "", "ff",
     "a:+424 b:+4242", "~/b"},
    {"NewestInstallDefault", twoProfiles, "[X]\nDefault=a\n[Y]\nDefault=b\n[Z]\nDefault=c\n", "ff",
     "a c b", "~/b Page beta"},
    {"InstallInProfilesIni", "[Profile0]\nIsRelative=1\nPath=a\n[InstallX]\nDefault=c\n", "", "ff",
     "", "~/c"},
    {"DefaultOne", twoProfiles, "", "ff", "", "~/a.home"},
    {"NoProfilesIni", "", "", "ff", "", "no profiles.ini in ~"},
};

TEST_P(ProfileRows, ProfileFolder) {
    const ProfileRow& row = GetParam();
    QTemporaryDir home;
    const auto write = [&](const QString& name, const char* text) {
        QFile file(home.filePath(name));
        return !*text || (file.open(QIODevice::WriteOnly) && file.write(text) >= 0);
    };
    ASSERT_TRUE(write("profiles.ini", row.profiles) && write("installs.ini", row.installs));
    const QStringList files = QString(row.files).split(' ', Qt::SkipEmptyParts);
    for (qsizetype i = 0; i < files.size(); ++i) {
        const QString folder = files[i].section(':', 0, 0);
        QDir(home.path()).mkpath(folder + "/sessionstore-backups");
        QFile file(home.filePath(folder + "/sessionstore-backups/recovery.jsonlz4"));
        ASSERT_TRUE(files[i].contains(':')
                        ? QFile::link("127.0.0.1:" + files[i].section(':', 1),
                                      home.filePath(folder + "/lock"))
                        : file.open(QIODevice::WriteOnly) && file.write(recorded()) > 0 &&
                              file.setFileTime(QDateTime::currentDateTime().addSecs(i * 60),
                                               QFileDevice::FileModificationTime));
    }
    QString why;
    const QString folder =
        FirefoxSession::profileFolder(home.path(), QString(row.args).split(' '), 4242, &why);
    const auto page = folder.isNull() ? std::nullopt : FirefoxSession::read(folder, &why);
    const QString result = folder.isNull() ? why : page ? folder + ' ' + page->title : folder;
    EXPECT_EQ(result.toStdString(), QString(row.folder).replace("~", home.path()).toStdString());
}
INSTANTIATE_TEST_SUITE_P(Firefox, ProfileRows, testing::ValuesIn(profileRows), RowName());

} // namespace
