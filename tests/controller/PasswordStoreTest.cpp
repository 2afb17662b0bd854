#include "ControllerFixture.h"

#include <QUuid>

namespace {

// With a keyring the password comes back and goes away again; without one (CI) every call
// says so, without waiting, and the store stops asking.
TEST(PasswordStore, WritesReadsAndDeletesOrSaysThereIsNoKeyring) {
    PasswordStore store(QStringLiteral("pelmo-test-") + QUuid::createUuid().toString(), 2000);
    QObject context;
    const QString key = QStringLiteral("loginPassword");
    QStringList answers;
    const auto read = [&] {
        store.readPassword(key, &context, [&](const QString& password) {
            answers << (password.isNull() ? QStringLiteral("null") : password);
        });
    };
    const auto write = [&](bool* done) {
        store.writePassword(key, QStringLiteral("s3cret"), &context, [&answers, done](bool ok) {
            *done = ok;
            answers << QStringLiteral("written");
        });
    };
    read(); // an entry nobody stored is not found
    bool written = false;
    write(&written);
    ASSERT_TRUE(TestSettings::waitUntil([&] { return answers.size() == 2; }));
    EXPECT_EQ(answers.first(), QStringLiteral("null"));
    EXPECT_EQ(store.keyringAnswers(), written);
    read();
    ASSERT_TRUE(TestSettings::waitUntil([&] { return answers.size() == 3; }));
    EXPECT_EQ(answers.last(), written ? QStringLiteral("s3cret") : QStringLiteral("null"));
    bool deleted = false;
    store.deletePassword(key, &context, [&](bool ok) {
        deleted = ok;
        answers << QStringLiteral("deleted");
    });
    ASSERT_TRUE(TestSettings::waitUntil([&] { return answers.size() == 4; }));
    EXPECT_EQ(deleted, written);
}

} // namespace
