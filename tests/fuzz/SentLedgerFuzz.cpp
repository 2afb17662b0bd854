// A sent ledger left by a crash may end anywhere and hold anything: reading it never crashes,
// a torn last line changes nothing, and every copy restored is an address, once.

#include "FuzzSupport.h"

#include "controller/SentLedger.h"

#include <QSet>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const QByteArray bytes = fuzz::bytesOf(data, size);
    const SentLedger::Reading reading = SentLedger::read(bytes);
    QSet<QString> seen;
    for (const SentLedger::Entry& entry : reading.unfinished) {
        fuzz::require(entry.address.contains(QLatin1Char('@')), "an address without @");
        fuzz::require(!seen.contains(entry.address.toCaseFolded()), "an address twice");
        seen.insert(entry.address.toCaseFolded());
    }
    fuzz::require(reading.ignoredLines <= bytes.count('\n'), "more lines ignored than read");
    const QByteArray whole = bytes.left(bytes.lastIndexOf('\n') + 1);
    const SentLedger::Reading untorn = SentLedger::read(whole);
    fuzz::require(untorn.unfinished.size() == reading.unfinished.size() &&
                      untorn.ignoredLines == reading.ignoredLines,
                  "the torn last line counts");
    return 0;
}
