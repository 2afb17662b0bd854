#include "controller/PasswordStore.h"

#include <QPointer>
#include <QTimer>
#include <qt6keychain/keychain.h>

#include <memory>

PasswordStore::PasswordStore(QString serviceName, int timeout)
    : service(std::move(serviceName)), timeoutMs(timeout) {}

void PasswordStore::runJob(QKeychain::Job* job, QObject* context,
                           std::function<void(int, QKeychain::Job*)> onFinished) {
    // Whichever comes first, the job's answer or the time-out, answers; the other is ignored.
    // The job deletes itself once finished, also when that is after the time-out.
    job->setAutoDelete(true);
    auto answered = std::make_shared<bool>(false);
    auto* timer = new QTimer(context);
    timer->setSingleShot(true);
    const QPointer<QObject> guard(context);
    auto answer = [this, answered, timer, guard, onFinished](int error, QKeychain::Job* finished) {
        if (*answered)
            return;
        *answered = true;
        timer->deleteLater();
        if (error != QKeychain::NoError && error != QKeychain::EntryNotFound) {
            // No keyring, no backend or access refused: the settings key serves from now on.
            keyringAbsent = true;
            error = QKeychain::OtherError;
        }
        if (guard)
            onFinished(error, finished);
    };
    QObject::connect(timer, &QTimer::timeout, context,
                     [answer] { answer(QKeychain::OtherError, nullptr); });
    QObject::connect(job, &QKeychain::Job::finished, context,
                     [answer](QKeychain::Job* finished) { answer(finished->error(), finished); });
    timer->start(timeoutMs);
    job->start();
}

void PasswordStore::readPassword(const QString& key, QObject* context, ReadAnswer answer) {
    if (keyringAbsent) {
        QTimer::singleShot(0, context, [answer] { answer(QString()); });
        return;
    }
    auto* job = new QKeychain::ReadPasswordJob(service);
    job->setKey(key);
    runJob(job, context, [answer](int error, QKeychain::Job* finished) {
        answer(error == QKeychain::NoError
                   ? static_cast<QKeychain::ReadPasswordJob*>(finished)->textData()
                   : QString());
    });
}

void PasswordStore::writePassword(const QString& key, const QString& password, QObject* context,
                                  WriteAnswer answer) {
    if (keyringAbsent) {
        QTimer::singleShot(0, context, [answer] { answer(false); });
        return;
    }
    auto* job = new QKeychain::WritePasswordJob(service);
    job->setKey(key);
    job->setTextData(password);
    runJob(job, context,
           [answer](int error, QKeychain::Job*) { answer(error == QKeychain::NoError); });
}

void PasswordStore::deletePassword(const QString& key, QObject* context, WriteAnswer answer) {
    if (keyringAbsent) {
        QTimer::singleShot(0, context, [answer] { answer(false); });
        return;
    }
    auto* job = new QKeychain::DeletePasswordJob(service);
    job->setKey(key);
    // A missing entry is as good as a deleted one.
    runJob(job, context, [answer](int error, QKeychain::Job*) {
        answer(error == QKeychain::NoError || error == QKeychain::EntryNotFound);
    });
}
