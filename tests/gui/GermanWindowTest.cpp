#include "GuiFixture.h"
#include "QtTestMain.h"
#include "util/Translations.h"

#include <QDialogButtonBox>
#include <QMenuBar>

namespace {

using GermanWindow = GuiFixture;

TEST_F(GermanWindow, ShowsItsTextsInGerman) {
    EXPECT_EQ(child<QPushButton>("sendButton")->text(), "Senden");
    QStringList menus;
    for (const QAction* menu : window->menuBar()->actions())
        menus << menu->text();
    EXPECT_EQ(menus, QStringList({"&Datei", "&Nachricht", "&Fenster", "&Hilfe"}));
    EXPECT_EQ(child<QLineEdit>("subject")->placeholderText(), "Worum es in der Nachricht geht");
    EXPECT_EQ(child<QAction>("preferencesAction")->text(), "Einstellungen");
}

TEST_F(GermanWindow, StandardButtonsAreQtsGermanOnes) {
    QDialogButtonBox buttons(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    EXPECT_EQ(buttons.button(QDialogButtonBox::Cancel)->text(), "Abbrechen");
}

} // namespace

// The texts are looked up once per process, so the German catalogs go in before any window
// exists; hence a program of its own.
int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv, [] {
        installTranslations(QLocale(QLocale::German, QLocale::Germany), {PELMO_TRANSLATIONS});
    });
}
