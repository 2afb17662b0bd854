#include "gui/PreferencesDialog.h"
#include "GuiFixture.h"
#include "util/PelmoException.h"

#include <QAction>
#include <QCheckBox>
#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QSpinBox>

namespace {

class Preferences : public GuiFixture {
protected:
    PreferencesDialog* open() {
        child<QAction>("preferencesAction")->trigger();
        auto* dialog = window->findChild<PreferencesDialog*>();
        EXPECT_NE(dialog, nullptr);
        if (dialog) {
            EXPECT_TRUE(dialog->isVisible());
            EXPECT_EQ(dialog->windowModality(), Qt::WindowModal);
        }
        return dialog;
    }

    template <class T>
    T* field(PreferencesDialog* dialog, const char* key) const {
        return child<T>(key, dialog);
    }

    static void retype(QLineEdit* edit, const QString& text) {
        edit->selectAll();
        QTest::keyClick(edit, Qt::Key_Delete);
        QTest::keyClicks(edit, text);
    }

    static QVariant stored(const char* key) {
        settings().sync();
        return settings().value(QLatin1String(key));
    }
};

TEST_F(Preferences, ShowsTheStoredSettings) {
    set("senderEmail", QStringLiteral("me@example.org"));
    set("serverPort", 587);
    set("useSSL", true);
    set("selectedAuthentication", 3);
    set("completionAction", 2);
    keyring.stored = QStringLiteral("s3cret");
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    EXPECT_EQ(field<QLineEdit>(dialog, "senderEmail")->text(), QStringLiteral("me@example.org"));
    EXPECT_EQ(field<QSpinBox>(dialog, "serverPort")->value(), 587);
    EXPECT_TRUE(field<QCheckBox>(dialog, "useSSL")->isChecked());
    EXPECT_EQ(field<QComboBox>(dialog, "selectedAuthentication")->currentText(),
              QStringLiteral("CRAM-MD5"));
    EXPECT_EQ(field<QComboBox>(dialog, "completionAction")->currentIndex(), 2);
    EXPECT_EQ(field<QLineEdit>(dialog, "loginPassword")->echoMode(), QLineEdit::Password);
    // The keyring answers in the background.
    EXPECT_TRUE(waitUntil([&] {
        return field<QLabel>(dialog, "passwordNote")->text() ==
               QStringLiteral("The password is kept in the system keyring.");
    }));
    EXPECT_EQ(field<QLineEdit>(dialog, "loginPassword")->text(), QStringLiteral("s3cret"));
}

TEST_F(Preferences, OkStoresWhatTheControllerReads) {
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    QTest::keyClicks(field<QLineEdit>(dialog, "senderName"), QStringLiteral("Me"));
    QTest::keyClicks(field<QLineEdit>(dialog, "senderEmail"), QStringLiteral("me@example.org"));
    QTest::keyClicks(field<QLineEdit>(dialog, "serverAddress"), QStringLiteral("smtp.example.org"));
    field<QSpinBox>(dialog, "serverPort")->setValue(465);
    field<QCheckBox>(dialog, "useSSL")->setChecked(true);
    field<QComboBox>(dialog, "selectedAuthentication")->setCurrentIndex(2);
    field<QComboBox>(dialog, "selectedContentType")->setCurrentIndex(1);
    field<QComboBox>(dialog, "selectedCharacterSet")->setCurrentIndex(2);
    QTest::keyClicks(field<QLineEdit>(dialog, "loginUsername"), QStringLiteral("me"));
    QTest::keyClicks(field<QLineEdit>(dialog, "loginPassword"), QStringLiteral("s3cret"));
    dialog->accept();
    EXPECT_FALSE(dialog->isVisible());

    EXPECT_EQ(controller().getFromName(), QStringLiteral("Me"));
    EXPECT_EQ(controller().getFrom(), QStringLiteral("me@example.org"));
    EXPECT_EQ(controller().getServer(), QStringLiteral("smtp.example.org"));
    EXPECT_EQ(controller().getPort(), 465);
    EXPECT_TRUE(controller().useSSL());
    EXPECT_EQ(controller().getSelectedLoginMechanism(), 2);
    EXPECT_EQ(controller().getSelectedContentType(), 1);
    EXPECT_EQ(controller().getSelectedCharacterSet(), 2);
    EXPECT_EQ(controller().getUsername(), QStringLiteral("me"));
    // The keyring took the password: the settings file holds no copy of it.
    EXPECT_TRUE(waitUntil([&] { return keyring.stored == QStringLiteral("s3cret"); }));
    EXPECT_FALSE(stored("loginPassword").isValid());
}

TEST_F(Preferences, WithoutAKeyringThePasswordGoesToTheSettingsAndTheDialogSaysSo) {
    keyring.answers = false;
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    auto* note = field<QLabel>(dialog, "passwordNote");
    EXPECT_TRUE(note->text().startsWith(QStringLiteral("No keyring answered")));
    QTest::keyClicks(field<QLineEdit>(dialog, "loginPassword"), QStringLiteral("s3cret"));
    dialog->save();
    EXPECT_TRUE(waitUntil([] { return stored("loginPassword").toString() == "s3cret"; }));
    EXPECT_TRUE(note->text().contains(settings().fileName())) << note->text().toStdString();
    EXPECT_TRUE(note->text().contains(QStringLiteral("the password is kept")));
}

TEST_F(Preferences, ClearingThePasswordRemovesItEverywhere) {
    keyring.stored = QStringLiteral("old");
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    ASSERT_TRUE(
        waitUntil([&] { return !field<QLineEdit>(dialog, "loginPassword")->text().isEmpty(); }));
    retype(field<QLineEdit>(dialog, "loginPassword"), QString());
    dialog->accept();
    EXPECT_TRUE(waitUntil([&] { return keyring.stored.isEmpty(); }));
    EXPECT_FALSE(stored("loginPassword").isValid());
}

TEST_F(Preferences, CancelStoresNothing) {
    set("senderName", QStringLiteral("Me"));
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    retype(field<QLineEdit>(dialog, "senderName"), QStringLiteral("Somebody else"));
    dialog->reject();
    EXPECT_EQ(stored("senderName").toString(), QStringLiteral("Me"));
    EXPECT_FALSE(stored("serverPort").isValid());
}

TEST_F(Preferences, AChoiceWithoutAnItemIsKeptAsItWas) {
    set("selectedCharacterSet", 9);
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    EXPECT_EQ(field<QComboBox>(dialog, "selectedCharacterSet")->currentIndex(), -1);
    dialog->accept();
    EXPECT_EQ(stored("selectedCharacterSet").toInt(), 9);
}

TEST_F(Preferences, AnOutOfRangePortIsLeftForTheControllerToRefuse) {
    PreferencesDialog* dialog = open();
    ASSERT_NE(dialog, nullptr);
    field<QSpinBox>(dialog, "serverPort")->setValue(65366);
    dialog->accept();
    EXPECT_EQ(stored("serverPort").toInt(), 65366);
    EXPECT_THROW(controller().getPort(), PelmoException);
}

} // namespace
