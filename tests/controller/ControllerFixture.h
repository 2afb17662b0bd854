#pragma once

#include "RecordingView.h"
#include "addressbook/AddressBook.h"
#include "controller/MailSettings.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"

#include <QEventLoop>
#include <QSettings>
#include <QTemporaryDir>
#include <QTimer>
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <ostream>

// Failures show text, not UTF-16 code units.
inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}

// A keyring that answers later on the main loop, as a real one does, with what the test put in
// it; with answers false it behaves as a machine without a keyring.
class FakeKeyring : public PasswordStore {
public:
    QString stored;
    bool answers = true;
    void readPassword(const QString&, QObject* context, ReadAnswer answer) override {
        later(context, [this, answer] { answer(answers ? stored : QString()); });
    }
    void writePassword(const QString&, const QString& password, QObject* context,
                       WriteAnswer answer) override {
        later(context, [=, this] { answer(answers && (stored = password, true)); });
    }
    void deletePassword(const QString&, QObject* context, WriteAnswer answer) override {
        later(context, [this, answer] { stored.clear(), answer(answers); });
    }
    bool keyringAnswers() const override { return answers; }
    static void later(QObject* context, std::function<void()> call) {
        QTimer::singleShot(1, context, std::move(call));
    }
};

// The settings file the controller reads, for tests to write.
struct TestSettings {
    static QSettings& settings() {
        static QSettings store(QStringLiteral("Orvale Software"), QStringLiteral("Pelmo"));
        return store;
    }
    /** An invalid value stands for a key the file does not have. */
    static void set(const char* key, const QVariant& value) {
        value.isValid() ? settings().setValue(QLatin1String(key), value)
                        : settings().remove(QLatin1String(key));
        settings().sync();
    }
    static void clearSettings() { settings().clear(), settings().sync(); }
    /** Runs the event loop until done() holds or a generous deadline passes; answers done(). */
    static bool waitUntil(const std::function<bool()>& done, int ms = 5000) {
        QTimer deadline;
        deadline.setSingleShot(true);
        deadline.start(ms);
        while (!done() && deadline.isActive())
            QEventLoop().processEvents(QEventLoop::WaitForMoreEvents, 20);
        return done();
    }
};

// A controller over a recording view, a fresh SQLite address book and empty settings.
class ControllerFixture : public ::testing::Test, public TestSettings {
public:
    void SetUp() override {
        ASSERT_TRUE(folder.isValid());
        clearSettings();
        book = std::make_unique<AddressBook>(folder.filePath(QStringLiteral("book.sqlite")));
        controller = std::make_unique<PelmoController>(view, *book, keyring, mailSettings);
    }
    /** Presses Send and waits until the run has nothing under way. */
    void runUntilSettled(int ms = 5000) {
        bool settled = false;
        QObject context;
        QObject::connect(controller.get(), &PelmoController::runSettled, &context,
                         [&settled] { settled = true; });
        controller->send();
        ASSERT_TRUE(waitUntil([&settled] { return settled; }, ms)) << "the run never settled";
    }

    QTemporaryDir folder;
    RecordingView view;
    FakeKeyring keyring;
    MailSettings mailSettings;
    std::unique_ptr<AddressBook> book;
    std::unique_ptr<PelmoController> controller;
};
