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

} // namespace
