#pragma once

#include <QString>

/**
 * Reads the login password from the system keyring (Secret Service or KWallet through
 * QtKeychain). The read waits in a local event loop for at most timeoutMs; a keyring that
 * does not answer in time, or has no backend at all, is not asked again by this object.
 * The password is never logged. Tests derive from it to stand in for a keyring.
 */
class PasswordStore {
public:
    /** Entries are looked up as key within service. */
    explicit PasswordStore(QString service = QStringLiteral("Pelmo"), int timeoutMs = 3000);
    virtual ~PasswordStore() = default;

    /** The password stored under key, or a null QString when the keyring has none or is absent. */
    virtual QString readPassword(const QString& key);

private:
    QString service;
    int timeoutMs;
    bool keyringAbsent = false;
};
