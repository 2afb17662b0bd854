#include "controller/PasswordStore.h"

#include <QUuid>
#include <gtest/gtest.h>

namespace {

// Whatever keyring this machine has (none, in CI), an entry nobody stored is not found, and
// the read returns instead of waiting for a keyring that never answers.
TEST(PasswordStore, UnknownEntryIsNull) {
    PasswordStore store(QStringLiteral("pelmo-test-") + QUuid::createUuid().toString(), 2000);
    EXPECT_TRUE(store.readPassword(QStringLiteral("loginPassword")).isNull());
    EXPECT_TRUE(store.readPassword(QStringLiteral("loginPassword")).isNull());
}

// With a keyring the password comes back and goes away again; without one every call says
// so at once, and the store stops asking.
TEST(PasswordStore, WritesReadsAndDeletesOrSaysThereIsNoKeyring) {
    PasswordStore store(QStringLiteral("pelmo-test-") + QUuid::createUuid().toString(), 2000);
    const QString key = QStringLiteral("loginPassword");
    if (store.writePassword(key, QStringLiteral("s3cret"))) {
        EXPECT_TRUE(store.keyringAnswers());
        EXPECT_EQ(store.readPassword(key), QStringLiteral("s3cret"));
        EXPECT_TRUE(store.deletePassword(key));
        EXPECT_TRUE(store.readPassword(key).isNull());
        EXPECT_TRUE(store.deletePassword(key)); // already gone
    } else {
        EXPECT_FALSE(store.keyringAnswers());
        EXPECT_TRUE(store.readPassword(key).isNull());
        EXPECT_FALSE(store.writePassword(key, QStringLiteral("s3cret")));
        EXPECT_FALSE(store.deletePassword(key));
    }
}

} // namespace
