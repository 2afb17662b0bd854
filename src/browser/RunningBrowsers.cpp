#include "browser/RunningBrowsers.h"

#include <algorithm>

namespace {

const BrowserKind* kindOf(const ProcessTable::Process& process) {
    if (const BrowserKind* kind = BrowserNamed(process.comm))
        return kind;
    return process.exe.isEmpty() ? nullptr : BrowserNamed(process.exe);
}

std::optional<RunningBrowser> preferred(const QList<RunningBrowser>& running,
                                        const ProcessTable& processes,
                                        const QList<qint64>& frontPids,
                                        const QList<const BrowserKind*>& order) {
    // A window may belong to the browser itself or, for some, to a child it started.
    for (qint64 pid : frontPids) {
        const ProcessTable::Process* owner = processes.find(pid);
        for (const RunningBrowser& browser : running)
            if (owner && (browser.process.pid == pid || browser.process.pid == owner->parent))
                return browser;
    }
    for (const BrowserKind* kind : order)
        for (const RunningBrowser& browser : running)
            if (browser.kind == kind)
                return browser;
    return std::nullopt;
}

} // namespace

QList<RunningBrowser> FindRunningBrowsers(const ProcessTable& processes) {
    QList<RunningBrowser> running;
    for (const ProcessTable::Process& process : processes.processes()) {
        const BrowserKind* kind = kindOf(process);
        if (!kind)
            continue;
        const ProcessTable::Process* parent = processes.find(process.parent);
        if (parent && kindOf(*parent) == kind)
            continue;
        running.append({kind, process});
    }
    std::stable_sort(running.begin(), running.end(), [](const auto& a, const auto& b) {
        return a.process.started > b.process.started;
    });
    return running;
}

std::optional<RunningBrowser> GetRunningBrowserNameScript(const QList<RunningBrowser>& running,
                                                          const ProcessTable& processes,
                                                          const QList<qint64>& frontPids) {
    return preferred(running, processes, frontPids, TitleOrder());
}

std::optional<RunningBrowser> GetRunningBrowserURLScript(const QList<RunningBrowser>& running,
                                                         const ProcessTable& processes,
                                                         const QList<qint64>& frontPids) {
    return preferred(running, processes, frontPids, URLOrder());
}
