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
    const auto answered = [&](qsizetype count) {
        return TestSettings::waitUntil([&] { return answers.size() == count; });
    };
    const auto read = [&] {
        store.readPassword(key, &context, [&](const QString& password) {
            answers << (password.isNull() ? QStringLiteral("null") : password);
        });
    };
    const auto done = [&answers](const QString& what) {
        return [&answers, what](bool ok) { answers << what + (ok ? " ok" : " failed"); };
    };
    read(); // an entry nobody stored is not found
    store.writePassword(key, QStringLiteral("s3cret"), &context, done("written"));
    ASSERT_TRUE(answered(2));
    const bool keyring = answers.last() == QLatin1String("written ok");
    EXPECT_EQ(store.keyringAnswers(), keyring);
    read();
    ASSERT_TRUE(answered(3));
    store.deletePassword(key, &context, done("deleted"));
    ASSERT_TRUE(answered(4));
    read();
    ASSERT_TRUE(answered(5));
    const QString outcome = keyring ? QStringLiteral("ok") : QStringLiteral("failed");
    EXPECT_EQ(answers.join(' '), QStringLiteral("null written %1 %2 deleted %1 null")
                                     .arg(outcome, keyring ? "s3cret" : "null"));
}

} // namespace
