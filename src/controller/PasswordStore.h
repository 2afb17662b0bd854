#pragma once

#include <QString>

#include <functional>

namespace QKeychain {
class Job;
}

/**
 * Keeps the login password in the system keyring (Secret Service or KWallet through
 * QtKeychain). Each call waits in a local event loop for at most timeoutMs; a keyring that
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
    /** Stores password under key; false when no keyring took it. */
    virtual bool writePassword(const QString& key, const QString& password);
    /** Removes the entry under key; true when the keyring no longer holds one. */
    virtual bool deletePassword(const QString& key);
    /** False once a keyring failed to answer; a fresh object assumes one answers. */
    virtual bool keyringAnswers() const { return !keyringAbsent; }

private:
    /**
     * Runs job to its end or the time-out and answers its error, OtherError for no answer.
     * onFinished sees the job while it still exists.
     */
    int runJob(QKeychain::Job* job, const std::function<void(QKeychain::Job&)>& onFinished = {});

    QString service;
    int timeoutMs;
    bool keyringAbsent = false;
};
