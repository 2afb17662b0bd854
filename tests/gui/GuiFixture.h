#pragma once

#include "addressbook/AddressBook.h"
#include "controller/ControllerFixture.h"
#include "controller/PelmoController.h"
#include "gui/MainWindow.h"
#include "gui/PeoplePicker.h"

#include <QApplication>
#include <QCoreApplication>
#include <QEventLoop>
#include <QListWidget>
#include <QSettings>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>
#include <gtest/gtest.h>

#include <functional>
#include <memory>

// The real main window over a fresh address book, empty settings and a fake keyring, shown on
// the offscreen platform.
class GuiFixture : public ::testing::Test, protected TestSettings {
protected:
    void SetUp() override {
        ASSERT_TRUE(folder.isValid());
        clearSettings();
        book = std::make_unique<AddressBook>(folder.filePath(QStringLiteral("book.sqlite")));
        window = std::make_unique<MainWindow>(*book, keyring, mailSettings);
        pelmo = std::make_unique<PelmoController>(*window, *book, keyring, mailSettings);
        window->setController(*pelmo);
        controller().startUp();
        window->show();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(window.get()));
    }

    void TearDown() override {
        window.reset();
        pelmo.reset();
        // Message boxes and dialogs that deleted themselves later go now.
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    PelmoController& controller() const { return *pelmo; }
    PeoplePicker& picker() const { return window->peoplePicker(); }

    /** The child of parent (the main window by default) with that object name. */
    template <class T>
    T* child(const char* name, QObject* parent = nullptr) const {
        T* found = (parent ? parent : window.get())->findChild<T*>(QLatin1String(name));
        EXPECT_NE(found, nullptr) << "no " << name;
        return found;
    }

    /** Makes w the active window, as a click on it would. */
    static bool activate(QWidget* w) {
        w->show();
        w->raise();
        w->activateWindow();
        // The platform window turns active first, the widget's a few events later.
        return waitUntil([w] { return w->isActiveWindow(); });
    }

    /** Clicks the row of list showing text, the way a user does. */
    static void clickRow(QListWidget* list, const QString& text,
                         Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        const QList<QListWidgetItem*> found = list->findItems(text, Qt::MatchExactly);
        ASSERT_EQ(found.size(), 1) << text.toStdString();
        QTest::mouseClick(list->viewport(), Qt::LeftButton, modifiers,
                          list->visualItemRect(found.constFirst()).center());
    }

    /** Adds a person to the book, in the given groups, creating missing ones. */
    qint64 addPerson(const char* first, const char* last, QStringList emails,
                     const QStringList& groups = {}) {
        Person person;
        person.firstName = QString::fromUtf8(first);
        person.lastName = QString::fromUtf8(last);
        person.emails = std::move(emails);
        person.primary = person.emails.isEmpty() ? -1 : 0;
        const qint64 id = book->addPerson(person);
        for (const QString& name : groups) {
            const std::optional<Group> group = book->groupNamed(name);
            book->addMember(group ? group->id : book->addGroup(name), id);
        }
        return id;
    }

    QTemporaryDir folder;
    FakeKeyring keyring;
    MailSettings mailSettings;
    std::unique_ptr<AddressBook> book;
    std::unique_ptr<MainWindow> window;
    std::unique_ptr<PelmoController> pelmo;
};
