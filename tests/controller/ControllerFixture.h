#pragma once

#include "RecordingView.h"
#include "addressbook/AddressBook.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"

#include <QSettings>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <memory>
#include <ostream>

// Failures show text, not UTF-16 code units.
inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}

// A keyring that answers what the test put in it and counts the questions; with answers
// false it behaves as a machine without a keyring.
class FakeKeyring : public PasswordStore {
public:
    QString stored;
    int reads = 0;
    bool answers = true;
    QString readPassword(const QString&) override { return ++reads, answers ? stored : QString(); }
    bool writePassword(const QString&, const QString& password) override {
        if (answers)
            stored = password;
        return answers;
    }
    bool deletePassword(const QString&) override {
        if (answers)
            stored.clear();
        return answers;
    }
    bool keyringAnswers() const override { return answers; }
};

// The settings file the controller reads, for tests to write.
struct TestSettings {
    static QSettings& settings() {
        static QSettings store(QStringLiteral("Orvale Software"), QStringLiteral("Pelmo"));
        return store;
    }
    static void set(const char* key, const QVariant& value) {
        settings().setValue(QLatin1String(key), value);
        settings().sync();
    }
    static void clearSettings() {
        settings().clear();
        settings().sync();
    }
};

// A controller over a recording view, a fresh SQLite address book and empty settings.
class ControllerFixture : public ::testing::Test, protected TestSettings {
protected:
    void SetUp() override {
        ASSERT_TRUE(folder.isValid());
        clearSettings();
        book = std::make_unique<AddressBook>(folder.filePath(QStringLiteral("book.sqlite")));
        controller = std::make_unique<PelmoController>(view, *book, keyring);
    }

    QTemporaryDir folder;
    RecordingView view;
    FakeKeyring keyring;
    std::unique_ptr<AddressBook> book;
    std::unique_ptr<PelmoController> controller;
};
