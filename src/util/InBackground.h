#pragma once

#include <QFuture>
#include <QPromise>
#include <QThreadPool>

#include <memory>
#include <utility>

/**
 * Runs work() on Qt's global thread pool and answers its result as a future; a QFutureWatcher
 * set to it reports on the watcher's thread. work must own everything it reads (copies, or
 * data that locks itself): it may outlive whoever started it, whose watcher then reports
 * nothing.
 */
template <class Result, class Work>
QFuture<Result> InBackground(Work work) {
    // QThreadPool takes copyable work only; the promise is shared with it.
    auto promise = std::make_shared<QPromise<Result>>();
    QFuture<Result> future = promise->future();
    QThreadPool::globalInstance()->start([promise, work = std::move(work)]() mutable {
        promise->start();
        promise->addResult(work());
        promise->finish();
    });
    return future;
}
