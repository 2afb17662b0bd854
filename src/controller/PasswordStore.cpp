#include "controller/PasswordStore.h"

#include <QEventLoop>
#include <QTimer>
#include <qt6keychain/keychain.h>

PasswordStore::PasswordStore(QString serviceName, int timeout)
    : service(std::move(serviceName)), timeoutMs(timeout) {}

int PasswordStore::runJob(QKeychain::Job* job,
                          const std::function<void(QKeychain::Job&)>& onFinished) {
    // The job deletes itself once finished, also when that happens after the time-out; the
    // connection dies with the loop, so a late answer touches nothing here.
    job->setAutoDelete(true);
    QEventLoop loop;
    bool finished = false;
    QKeychain::Error error = QKeychain::OtherError;
    QObject::connect(job, &QKeychain::Job::finished, &loop, [&] {
        finished = true;
        error = job->error();
        if (onFinished)
            onFinished(*job);
        loop.quit();
    });
    QTimer::singleShot(timeoutMs, &loop, &QEventLoop::quit);
    job->start();
    loop.exec(QEventLoop::ExcludeUserInputEvents);
    if (!finished || (error != QKeychain::NoError && error != QKeychain::EntryNotFound)) {
        // No keyring, no backend or access refused: the settings key serves from now on.
        keyringAbsent = true;
        return QKeychain::OtherError;
    }
    return error;
}

QString PasswordStore::readPassword(const QString& key) {
    if (keyringAbsent)
        return {};
    auto* job = new QKeychain::ReadPasswordJob(service);
    job->setKey(key);
    QString password;
    runJob(job, [&password](QKeychain::Job& finished) {
        if (finished.error() == QKeychain::NoError)
            password = static_cast<QKeychain::ReadPasswordJob&>(finished).textData();
    });
    return password;
}

bool PasswordStore::writePassword(const QString& key, const QString& password) {
    if (keyringAbsent)
        return false;
    auto* job = new QKeychain::WritePasswordJob(service);
    job->setKey(key);
    job->setTextData(password);
    return runJob(job) == QKeychain::NoError;
}

bool PasswordStore::deletePassword(const QString& key) {
    if (keyringAbsent)
        return false;
    auto* job = new QKeychain::DeletePasswordJob(service);
    job->setKey(key);
    const int error = runJob(job);
    // A missing entry is as good as a deleted one.
    return error == QKeychain::NoError || error == QKeychain::EntryNotFound;
}
