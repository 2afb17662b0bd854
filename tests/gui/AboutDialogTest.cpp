#include "gui/AboutDialog.h"
#include "GuiFixture.h"

#include <QLabel>
#include <QRegularExpression>

namespace {

TEST_F(GuiFixture, AboutPelmoShowsTheVersionAndTheLibrariesItRunsWith) {
    child<QAction>("aboutAction")->trigger();
    auto* about = asked<AboutDialog>();
    ASSERT_NE(about, nullptr);
    EXPECT_EQ(child<QLabel>("aboutVersion", about)->text(),
              QStringLiteral("<b>Pelmo " PELMO_VERSION "</b>"));
    const QString libraries = child<QLabel>("aboutLibraries", about)->text();
    EXPECT_TRUE(libraries.contains(QStringLiteral("\nQt ") + QLatin1String(qVersion()) + '\n'))
        << libraries.toStdString();
    // SQLite and liblz4 answer at run time, from the libraries actually loaded.
    EXPECT_TRUE(libraries.contains(QRegularExpression("\nSQLite 3\\.\\d+\\.\\d+\n")))
        << libraries.toStdString();
    EXPECT_TRUE(libraries.contains(QRegularExpression("\nliblz4 1\\.\\d+\\.\\d+\n")))
        << libraries.toStdString();
}

// The test program is not installed, so no README lies where Help looks for it.
TEST_F(GuiFixture, PelmoHelpWithoutItsReadmeSaysWhereTheHelpIs) {
    child<QAction>("helpAction")->trigger();
    auto* box = asked<QMessageBox>();
    ASSERT_NE(box, nullptr);
    EXPECT_EQ(box->text(), "Pelmo's help is not installed here.");
    EXPECT_TRUE(box->informativeText().contains("/usr/share/doc/pelmo/README.md"))
        << box->informativeText().toStdString();
}

} // namespace
