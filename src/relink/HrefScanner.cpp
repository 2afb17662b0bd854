#include "relink/HrefScanner.h"

#include "relink/FoldTable.h"
#include "relink/SuffixMap.h"
#include "util/TextUtilities.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstring>

namespace {

constexpr size_t kMaxReference = 255;

constexpr std::array<bool, 256> makeTerminators() {
    std::array<bool, 256> table{};
    for (unsigned char c : std::string_view("'\"()<>\r\n"))
        table[c] = true;
    return table;
}
constexpr std::array<bool, 256> kTerminator = makeTerminators();

bool mapKnows(std::string_view suffix) {
    // The probe is a fixed string: "." and the lower-cased suffix, cut at 255 bytes.
    char probe[kMaxReference + 1];
    probe[0] = '.';
    const size_t n = std::min(suffix.size(), kMaxReference - 1);
    for (size_t i = 0; i < n; ++i)
        probe[i + 1] = static_cast<char>(std::tolower(static_cast<unsigned char>(suffix[i])));
    probe[n + 1] = 0;
    return gSuffixMap.lookup(CString256(probe)) != nullptr;
}

} // namespace

bool IsURLSafe(unsigned char c) {
    // The suffix scan asks this of every byte of the page: a table taken once from the
    // character classes, instead of their string searches per byte.
    static const std::array<bool, 256> safe = [] {
        std::array<bool, 256> table{};
        for (int i = 0; i < 256; ++i) {
            const auto b = static_cast<unsigned char>(i);
            table[b] = isHiorLoAlpha(b) || isDig(b) || isSafe(b) || isExtra(b) || isReserved(b) ||
                       isPunctuation(b);
        }
        return table;
    }();
    return safe[c];
}

bool IsResourceSuffix(std::string_view suffix) {
    if (suffix.empty() || mapKnows(suffix))
        return true;
    if (suffix.size() > 4)
        return false;
    // The first character is deliberately left unexamined: "7z" passes only through the map.
    bool letter = false;
    for (size_t i = 1; i < suffix.size(); ++i) {
        const auto c = static_cast<unsigned char>(suffix[i]);
        if (!isHiorLoAlpha(c) && !isDig(c))
            return false;
        letter = letter || isHiorLoAlpha(c);
    }
    return letter;
}

HrefScanner::HrefScanner(std::string_view page)
    : m_text(page.substr(0, std::min(page.size(), page.find('\0')))) {}

void HrefScanner::collectSuffixed(const Found& found) const {
    const std::string_view t = m_text;
    // Cursors that only move forward keep the scan linear however many dots a run holds.
    size_t lastTerminator = 0; // the last terminator before the dot (0 when none)
    size_t lastUnsafe = 0;     // one past the last unsafe byte before the dot (0 when none)
    size_t scanned = 0;        // bytes before this index have been classified
    size_t nextTerminator = 0; // first terminator after the dot, or t.size()
    size_t nextUnsafe = 0;     // first unsafe byte after the dot, or t.size()
    for (size_t dot = t.find('.'); dot != std::string_view::npos; dot = t.find('.', dot + 1)) {
        for (; scanned < dot; ++scanned) {
            const auto c = static_cast<unsigned char>(t[scanned]);
            if (kTerminator[c])
                lastTerminator = scanned;
            if (!IsURLSafe(c))
                lastUnsafe = scanned + 1;
        }
        if (nextTerminator <= dot) {
            nextTerminator = dot + 1;
            while (nextTerminator < t.size() &&
                   !kTerminator[static_cast<unsigned char>(t[nextTerminator])])
                ++nextTerminator;
        }
        if (nextTerminator == t.size())
            return; // no terminator after this dot, nor after any later one
        const std::string_view suffix = t.substr(dot + 1, nextTerminator - dot - 1);
        if (dot <= 1 || suffix.empty() || !IsResourceSuffix(suffix))
            continue;
        const size_t prefixStart = lastTerminator + 1; // the first byte of the page is never taken
        if (prefixStart >= dot || lastUnsafe > prefixStart)
            continue;
        if (nextUnsafe <= dot) {
            nextUnsafe = dot + 1;
            while (nextUnsafe < t.size() && IsURLSafe(static_cast<unsigned char>(t[nextUnsafe])))
                ++nextUnsafe;
        }
        if (nextUnsafe < nextTerminator)
            continue;
        found(t.substr(prefixStart, std::min(kMaxReference, nextTerminator - prefixStart)));
    }
}

void HrefScanner::extractBetween(std::string& work, std::string_view open, std::string_view close,
                                 const Found& found) {
    // work[0, kept) is settled text in which open no longer starts; work[read, end) is still to
    // scan. A removed match leaves the gap between them, closed once at the end.
    const FoldTable fold;
    size_t kept = 0;
    size_t read = 0;
    for (;;) {
        // The settled tail may now run on into the text after the gap and start a match.
        const size_t back = std::min(kept, open.size() - 1);
        kept -= back;
        read -= back;
        std::memmove(&work[read], &work[kept], back);
        const size_t at = fold.find(work, open, read);
        const size_t end = at == std::string::npos ? at : fold.find(work, close, at + open.size());
        if (end == std::string::npos)
            break;
        const size_t inner = at + open.size();
        found(std::string_view(work).substr(inner, std::min(kMaxReference, end - inner)));
        std::memmove(&work[kept], &work[read], at - read);
        kept += at - read;
        read = end + close.size();
    }
    work.erase(kept, read - kept);
}
