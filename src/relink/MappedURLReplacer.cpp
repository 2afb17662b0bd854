#include "relink/MappedURLReplacer.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstring>

namespace {

constexpr uint64_t kHashBase = 1099511628211ULL;

uint64_t hashFolded(std::string_view folded) {
    uint64_t h = 0;
    for (char c : folded)
        h = h * kHashBase + static_cast<unsigned char>(c) + 1;
    return h;
}

char closerOf(char open) {
    switch (open) {
    case '"':
        return '"';
    case '\'':
        return '\'';
    case '(':
        return ')';
    default:
        return 0;
    }
}

// The delimiter rows in the order they are applied.
constexpr std::array<std::pair<char, char>, 3> kRows = {{{'"', '"'}, {'\'', '\''}, {'(', ')'}}};

// Replaces every case-insensitive occurrence, resuming after each replacement so that it is
// never scanned again.
void replaceAllFolded(const FoldTable& fold, std::string& text, const std::string& pattern,
                      const std::string& replacement) {
    size_t at = fold.find(text, pattern, 0);
    while (at != std::string::npos) {
        text.replace(at, pattern.size(), replacement);
        at = fold.find(text, pattern, at + replacement.size());
    }
}

} // namespace

MappedURLReplacer::MappedURLReplacer(std::vector<Entry> entries) {
    for (Entry& entry : entries) {
        if (!entry.key.empty())
            m_entries.push_back(std::move(entry));
    }
    indexKeys();
    chooseBarriers();
}

void MappedURLReplacer::indexKeys() {
    for (size_t i = 0; i < m_entries.size(); ++i) {
        std::string folded(m_entries[i].key);
        for (char& c : folded)
            c = static_cast<char>(m_fold(c));
        m_hashes.emplace_back(hashFolded(folded), static_cast<int>(i));
        // Keys are fixed strings of at most 255 bytes; a longer one could never be stored.
        m_keyLengths.set(std::min<size_t>(folded.size(), 255));
        m_longestKey = std::max(m_longestKey, folded.size());
        m_folded.push_back(std::move(folded));
    }
    std::sort(m_hashes.begin(), m_hashes.end());
}

void MappedURLReplacer::chooseBarriers() {
    std::array<bool, 256> used{};
    for (const Entry& entry : m_entries) {
        for (const std::string* s : {&entry.key, &entry.value}) {
            for (char c : *s)
                used[static_cast<unsigned char>(c)] = true;
        }
    }
    // Letters match their other case and delimiters start and end patterns: never barriers.
    for (int c = 1; c < 256; ++c)
        m_barrier[c] =
            !used[c] && !std::isalpha(c) && closerOf(static_cast<char>(c)) == 0 && c != ')';
}

void MappedURLReplacer::entriesIn(std::string_view text, std::vector<int>& found) const {
    found.clear();
    for (size_t p = 0; p < text.size(); ++p) {
        const char close = closerOf(text[p]);
        if (close == 0)
            continue;
        uint64_t h = 0;
        for (size_t length = 1; length <= m_longestKey && p + length + 1 < text.size(); ++length) {
            h = h * kHashBase + m_fold(text[p + length]) + 1;
            if (!m_keyLengths[std::min<size_t>(length, 255)] || text[p + length + 1] != close)
                continue;
            auto it = std::lower_bound(m_hashes.begin(), m_hashes.end(), std::make_pair(h, -1));
            for (; it != m_hashes.end() && it->first == h; ++it) {
                if (m_fold.equal(text.substr(p + 1, length), m_folded[it->second]))
                    found.push_back(it->second);
            }
        }
    }
    std::sort(found.begin(), found.end());
    found.erase(std::unique(found.begin(), found.end()), found.end());
}

void MappedURLReplacer::rewriteSegment(std::string_view segment, std::string& out) const {
    std::vector<int> pending;
    entriesIn(segment, pending);
    if (pending.empty()) {
        out.append(segment);
        return;
    }
    std::string text(segment);
    int done = -1;
    for (;;) {
        auto next = std::upper_bound(pending.begin(), pending.end(), done);
        if (next == pending.end())
            break;
        const Entry& entry = m_entries[*next];
        for (const auto& [open, close] : kRows)
            replaceAllFolded(m_fold, text, open + entry.key + close, open + entry.value + close);
        done = *next;
        // A replacement may bring another entry's pattern into the segment, or take one away.
        entriesIn(text, pending);
    }
    out += text;
}

std::string MappedURLReplacer::apply(std::string_view page) const {
    const size_t end = std::min(page.size(), page.find('\0'));
    std::string out;
    out.reserve(page.size() + page.size() / 4);
    size_t start = 0;
    for (size_t i = 0; i < end; ++i) {
        const auto c = static_cast<unsigned char>(page[i]);
        if (!m_barrier[c])
            continue;
        rewriteSegment(page.substr(start, i - start), out);
        out += page[i];
        start = i + 1;
    }
    rewriteSegment(page.substr(start, end - start), out);
    out.append(page.substr(end));
    return out;
}
