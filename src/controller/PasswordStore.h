#pragma once

#include <QString>

#include <functional>

class QObject;

namespace QKeychain {
class Job;
}

/**
 * Keeps the login password in the system keyring (Secret Service or KWallet through
 * QtKeychain). Every call answers later, on the main loop, through its callback, which is
 * dropped when context is destroyed first; nothing waits in a local event loop. A keyring that
 * does not answer within the time-out, or has no backend at all, counts as absent and is not
 * asked again by this object. The password is never logged. Tests derive from it to stand in
 * for a keyring.
 */
class PasswordStore {
public:
    using ReadAnswer = std::function<void(const QString& password)>;
    using WriteAnswer = std::function<void(bool done)>;

    /** Entries are looked up as key within service. */
    explicit PasswordStore(QString service = QStringLiteral("Pelmo"), int timeoutMs = 3000);
    virtual ~PasswordStore() = default;

    /** The password stored under key; a null QString when the keyring has none or is absent. */
    virtual void readPassword(const QString& key, QObject* context, ReadAnswer answer);
    /** Stores password under key; false when no keyring took it. */
    virtual void writePassword(const QString& key, const QString& password, QObject* context,
                               WriteAnswer answer);
    /** Removes the entry under key; true when the keyring no longer holds one. */
    virtual void deletePassword(const QString& key, QObject* context, WriteAnswer answer);
    /** False once a keyring failed to answer; a fresh object assumes one answers. */
    virtual bool keyringAnswers() const { return !keyringAbsent; }

private:
    /**
     * Starts job and calls onFinished with its error (OtherError when it did not answer in
     * time, which marks the keyring absent) while the job still exists, or with null.
     */
    void runJob(QKeychain::Job* job, QObject* context,
                std::function<void(int error, QKeychain::Job* job)> onFinished);

    QString service;
    int timeoutMs;
    bool keyringAbsent = false;
};
