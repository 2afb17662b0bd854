#include "controller/PasswordStore.h"

#include <QEventLoop>
#include <QTimer>
#include <qt6keychain/keychain.h>

PasswordStore::PasswordStore(QString serviceName, int timeout)
    : service(std::move(serviceName)), timeoutMs(timeout) {}

QString PasswordStore::readPassword(const QString& key) {
    if (keyringAbsent)
        return {};
    // The job deletes itself once finished, also when that happens after the time-out; the
    // connection dies with the loop, so a late answer touches nothing here.
    auto* job = new QKeychain::ReadPasswordJob(service);
    job->setAutoDelete(true);
    job->setKey(key);
    QEventLoop loop;
    bool finished = false;
    QKeychain::Error error = QKeychain::OtherError;
    QString password;
    QObject::connect(job, &QKeychain::Job::finished, &loop, [&] {
        finished = true;
        error = job->error();
        if (error == QKeychain::NoError)
            password = job->textData();
        loop.quit();
    });
    QTimer::singleShot(timeoutMs, &loop, &QEventLoop::quit);
    job->start();
    loop.exec(QEventLoop::ExcludeUserInputEvents);
    if (!finished || (error != QKeychain::NoError && error != QKeychain::EntryNotFound)) {
        // No keyring, no backend or access refused: the settings key serves from now on.
        keyringAbsent = true;
        return {};
    }
    return password;
}
