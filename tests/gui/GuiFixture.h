#pragma once

#include "controller/ControllerFixture.h"
#include "gui/MainWindow.h"
#include "gui/PeoplePicker.h"

#include <QAction>
#include <QApplication>
#include <QLineEdit>
#include <QListWidget>
#include <QMessageBox>
#include <QPushButton>
#include <QTest>

// The real main window over a fresh address book, empty settings and a fake keyring, shown on
// the offscreen platform.
class GuiFixture : public ::testing::Test, protected TestSettings {
protected:
    void SetUp() override {
        clearSettings();
        book = std::make_unique<AddressBook>(folder.filePath("book.sqlite"));
        window = std::make_unique<MainWindow>(*book, keyring, mailSettings);
        pelmo = std::make_unique<PelmoController>(*window, *book, keyring, mailSettings);
        window->setController(*pelmo);
        pelmo->startUp();
        window->show();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(window.get()));
    }
    PeoplePicker& picker() const { return window->peoplePicker(); }
    template <class T>
    T* child(const char* name, QObject* parent = nullptr) const {
        T* found = (parent ? parent : window.get())->findChild<T*>(QLatin1String(name));
        EXPECT_NE(found, nullptr) << "no " << name;
        return found;
    }
    /** The dialog or box on top, which blocks its window until answered. */
    template <class T>
    static T* asked() {
        return qobject_cast<T*>(QApplication::activeModalWidget());
    }
    static void clickRow(QListWidget* list, const QString& text, Qt::KeyboardModifiers keys = {}) {
        const QList<QListWidgetItem*> found = list->findItems(text, Qt::MatchExactly);
        ASSERT_EQ(found.size(), 1) << text.toStdString();
        QTest::mouseClick(list->viewport(), Qt::LeftButton, keys,
                          list->visualItemRect(found[0]).center());
    }
    qint64 addPerson(const QString& first, const QString& last, const QString& group) {
        const qint64 id = book->addPerson({0, first, last, {first.toLower() + "@example.org"}, 0});
        const std::optional<Group> known = book->groupNamed(group);
        book->addMember(known ? known->id : book->addGroup(group), id);
        return id;
    }

    QTemporaryDir folder;
    FakeKeyring keyring;
    MailSettings mailSettings;
    std::unique_ptr<AddressBook> book;
    std::unique_ptr<PelmoController> pelmo;
    std::unique_ptr<MainWindow> window; // goes first, with its dialogs, then the controller
};
