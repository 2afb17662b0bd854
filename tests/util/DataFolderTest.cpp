#include "util/DataFolder.h"

#include "util/CLog.h"
#include "util/PrivateFiles.h"

#include "RowName.h"

#include <QFile>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <string>
#include <vector>

namespace {

TEST(DataFolder, IsTwoLevelsBelowTheDataHome) {
    QTemporaryDir home;
    ASSERT_TRUE(home.isValid());
    const QByteArray saved = qgetenv("XDG_DATA_HOME");
    qputenv("XDG_DATA_HOME", home.path().toUtf8());
    std::filesystem::path folder;
    EXPECT_TRUE(GetOurApplicationSupportFolder(folder));
    qputenv("XDG_DATA_HOME", saved);
    EXPECT_EQ(folder,
              std::filesystem::path(home.path().toStdString()) / "Orvale Software" / "Pelmo");
    EXPECT_TRUE(std::filesystem::is_directory(folder));
}

// What a row puts in the data home before it acts; files hold kKept.
struct Made {
    enum Kind { Folder, File, Link, Pipe };
    const char* path;
    Kind kind;
    mode_t mode; // for a link, unused
    const char* target = nullptr;
};

// The mode stat(2) must find afterwards, or kAbsent.
struct Mode {
    const char* path;
    mode_t mode;
};

enum class Action { DataFolder, StartLog, PrivateFolder, PrivateFile };

struct Act {
    Action action;
    const char* on = nullptr; // the path given to MakePrivateFolder or MakePrivateFile
    bool succeeds = true;
};

struct PrivacyRow {
    std::string name;
    std::vector<Made> before;
    Act act;
    std::vector<Mode> after;
};

constexpr mode_t kAbsent = 01000000;
constexpr char kKept[] = "kept";

class Privacy : public ::testing::TestWithParam<PrivacyRow> {
protected:
    void SetUp() override {
        ASSERT_TRUE(home.isValid());
        saved = qgetenv("XDG_DATA_HOME");
        qputenv("XDG_DATA_HOME", home.path().toUtf8());
        // With no umask to narrow them, the modes seen are the ones the code asked for.
        savedMask = ::umask(0);
    }
    void TearDown() override {
        StopLogging();
        ::umask(savedMask);
        qputenv("XDG_DATA_HOME", saved);
    }

    std::string at(const char* path) const { return (home.path() + '/').toStdString() + path; }

    void make(const Made& made) const {
        const std::string path = at(made.path);
        switch (made.kind) {
        case Made::Folder:
            ASSERT_EQ(::mkdir(path.c_str(), made.mode), 0) << path;
            break;
        case Made::File: {
            const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL, made.mode);
            ASSERT_GE(fd, 0) << path;
            ASSERT_EQ(::write(fd, kKept, sizeof kKept - 1), ssize_t(sizeof kKept - 1));
            ::close(fd);
            break;
        }
        case Made::Link:
            ASSERT_EQ(::symlink(made.target, path.c_str()), 0) << path;
            break;
        case Made::Pipe:
            ASSERT_EQ(::mkfifo(path.c_str(), made.mode), 0) << path;
            break;
        }
    }

    bool run(const Act& act) const {
        std::filesystem::path folder;
        switch (act.action) {
        case Action::DataFolder:
            return GetOurApplicationSupportFolder(folder);
        case Action::StartLog:
            StartLogging();
            return gLogger && gLogger->is_open();
        case Action::PrivateFolder:
            return MakePrivateFolder(at(act.on));
        case Action::PrivateFile:
            return MakePrivateFile(at(act.on));
        }
        return false;
    }

    QTemporaryDir home;
    QByteArray saved;
    mode_t savedMask = 0;
};

TEST_P(Privacy, Modes) {
    const PrivacyRow& row = GetParam();
    for (const Made& made : row.before)
        ASSERT_NO_FATAL_FAILURE(make(made));
    EXPECT_EQ(run(row.act), row.act.succeeds);
    for (const Mode& want : row.after) {
        struct stat status {};
        const mode_t mode =
            ::stat(at(want.path).c_str(), &status) == 0 ? status.st_mode & 07777 : kAbsent;
        EXPECT_EQ(mode, want.mode) << want.path << std::oct << ": " << mode << " not " << want.mode;
    }
    // Making a file private must not cost its content.
    for (const Made& made : row.before) {
        if (made.kind != Made::File)
            continue;
        QFile file(QString::fromStdString(at(made.path)));
        ASSERT_TRUE(file.open(QIODevice::ReadOnly)) << made.path;
        EXPECT_TRUE(file.readAll().startsWith(kKept)) << made.path;
    }
}

INSTANTIATE_TEST_SUITE_P(
    Files, Privacy,
    ::testing::Values(
        PrivacyRow{"FreshFoldersAre0700",
                   {},
                   {Action::DataFolder},
                   {{"Orvale Software", 0700}, {"Orvale Software/Pelmo", 0700}}},
        PrivacyRow{"Folders0755AreTightened",
                   {{"Orvale Software", Made::Folder, 0755},
                    {"Orvale Software/Pelmo", Made::Folder, 0755}},
                   {Action::DataFolder},
                   {{"Orvale Software", 0700}, {"Orvale Software/Pelmo", 0700}}},
        PrivacyRow{"NarrowerFolderIsNotLoosened",
                   {{"Orvale Software", Made::Folder, 0700},
                    {"Orvale Software/Pelmo", Made::Folder, 0500}},
                   {Action::DataFolder},
                   {{"Orvale Software/Pelmo", 0500}}},
        // An older Pelmo left these readable by all; starting the log protects every one.
        PrivacyRow{"OldFilesAreTightenedAtStartUp",
                   {{"Orvale Software", Made::Folder, 0755},
                    {"Orvale Software/Pelmo", Made::Folder, 0755},
                    {"Orvale Software/Pelmo/Pelmo.log", Made::File, 0644},
                    {"Orvale Software/Pelmo/AddressBook.sqlite", Made::File, 0644},
                    {"Orvale Software/Pelmo/AddressBook.sqlite-wal", Made::File, 0664},
                    {"Orvale Software/Pelmo/notes.txt", Made::File, 0666}},
                   {Action::StartLog},
                   {{"Orvale Software/Pelmo/Pelmo.log", 0600},
                    {"Orvale Software/Pelmo/AddressBook.sqlite", 0600},
                    {"Orvale Software/Pelmo/AddressBook.sqlite-wal", 0600},
                    {"Orvale Software/Pelmo/notes.txt", 0600}}},
        // Setting 0600 outright would make a read-only file writable and a program not one.
        PrivacyRow{"OwnerBitsAreKept",
                   {{"Orvale Software", Made::Folder, 0700},
                    {"Orvale Software/Pelmo", Made::Folder, 0700},
                    {"Orvale Software/Pelmo/old.log", Made::File, 0444},
                    {"Orvale Software/Pelmo/tool", Made::File, 0755}},
                   {Action::DataFolder},
                   {{"Orvale Software/Pelmo/old.log", 0400}, {"Orvale Software/Pelmo/tool", 0700}}},
        PrivacyRow{"LinkOutOfTheFolderIsNotFollowed",
                   {{"outside.txt", Made::File, 0644},
                    {"Orvale Software", Made::Folder, 0700},
                    {"Orvale Software/Pelmo", Made::Folder, 0700},
                    {"Orvale Software/Pelmo/link", Made::Link, 0, "../../outside.txt"}},
                   {Action::DataFolder},
                   {{"outside.txt", 0644}}},
        PrivacyRow{
            "NewLogIs0600", {}, {Action::StartLog}, {{"Orvale Software/Pelmo/Pelmo.log", 0600}}},
        PrivacyRow{"NewFileIs0600", {}, {Action::PrivateFile, "new"}, {{"new", 0600}}},
        PrivacyRow{"ExistingFileIsTightened",
                   {{"plain", Made::File, 0664}},
                   {Action::PrivateFile, "plain"},
                   {{"plain", 0600}}},
        PrivacyRow{"SymlinkIsRefused",
                   {{"target", Made::File, 0644}, {"link", Made::Link, 0, "target"}},
                   {Action::PrivateFile, "link", false},
                   {{"target", 0644}}},
        // Creating through the link would put a file wherever the link points.
        PrivacyRow{"DanglingSymlinkIsRefused",
                   {{"link", Made::Link, 0, "nowhere"}},
                   {Action::PrivateFile, "link", false},
                   {{"nowhere", kAbsent}}},
        PrivacyRow{"FolderIsRefusedAsAFile",
                   {{"folder", Made::Folder, 0755}},
                   {Action::PrivateFile, "folder", false},
                   {{"folder", 0755}}},
        // Opening a pipe to change it would wait for a writer for ever.
        PrivacyRow{"PipeIsRefused",
                   {{"pipe", Made::Pipe, 0644}},
                   {Action::PrivateFile, "pipe", false},
                   {{"pipe", 0644}}},
        // The folder above may be the user's home or ~/.config, which other programs share.
        PrivacyRow{"ExistingParentsAreLeftAlone",
                   {{"share", Made::Folder, 0755}},
                   {Action::PrivateFolder, "share/new/Pelmo"},
                   {{"share", 0755}, {"share/new", 0700}, {"share/new/Pelmo", 0700}}},
        PrivacyRow{"FileIsRefusedAsAFolder",
                   {{"plain", Made::File, 0644}},
                   {Action::PrivateFolder, "plain", false},
                   {{"plain", 0644}}}),
    RowName());

} // namespace
