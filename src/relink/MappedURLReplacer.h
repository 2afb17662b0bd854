#pragma once

#include "relink/FoldTable.h"

#include <array>
#include <bitset>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

/**
 * Rewrites the quoted and parenthesised references of a page in one near-linear pass, with the
 * same result as replacing, entry after entry in map order, every case-insensitive occurrence of
 * "K", 'K' and (K) by "V", 'V' and (V), each replacement never rescanned.
 *
 * Why it may work piecewise: every pattern and every replacement is a delimiter, a key or value,
 * and a delimiter. A byte that is no letter, no delimiter and stands in no key and no value is
 * therefore never inside a match, never removed and never inserted, so the text between two such
 * bytes is rewritten independently of the rest. Within such a segment only the entries whose
 * patterns occur in it are replayed, in map order, found through a hash of every key.
 */
class MappedURLReplacer {
public:
    struct Entry {
        std::string key;
        std::string value;
    };

    /** entries in map order; empty keys are ignored. The replacer keeps its own copy. */
    explicit MappedURLReplacer(std::vector<Entry> entries);

    /** The page rewritten. Only the text before a NUL byte is looked at; the rest is kept as is. */
    std::string apply(std::string_view page) const;

    /** Whether the page is cut at byte c. */
    bool cutsAt(unsigned char c) const { return m_barrier[c]; }

private:
    void indexKeys();
    void chooseBarriers();
    void rewriteSegment(std::string_view segment, std::string& out) const;
    /** Appends to found the entries whose patterns occur in text; sorted, unique. */
    void entriesIn(std::string_view text, std::vector<int>& found) const;

    FoldTable m_fold;
    std::vector<Entry> m_entries;
    std::vector<std::string> m_folded;              ///< keys folded with toupper
    std::vector<std::pair<uint64_t, int>> m_hashes; ///< (hash of folded key, entry), sorted
    std::bitset<256> m_keyLengths;                  ///< lengths some key has
    size_t m_longestKey = 0;
    std::array<bool, 256> m_barrier{};
};
