#include "util/DataFolder.h"

#include <QTemporaryDir>
#include <gtest/gtest.h>

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

} // namespace
