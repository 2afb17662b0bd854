#pragma once

#include <algorithm>
#include <array>
#include <cctype>
#include <cstring>
#include <string_view>

/**
 * The C library's toupper for every byte, taken once, and a case-insensitive search built on
 * it: the relinker's comparisons without a library call per byte. Built from the locale in force
 * when it is made, like the toupper calls it stands for.
 */
class FoldTable {
public:
    FoldTable() {
        for (int c = 0; c < 256; ++c)
            m_upper[c] = static_cast<unsigned char>(std::toupper(c));
        for (int c = 0; c < 256; ++c) {
            const unsigned char u = m_upper[c];
            if (m_twinCount[u] < 2)
                m_twins[u][m_twinCount[u]] = static_cast<char>(c);
            ++m_twinCount[u];
        }
    }

    unsigned char operator()(char c) const { return m_upper[static_cast<unsigned char>(c)]; }

    bool equal(std::string_view a, std::string_view b) const {
        if (a.size() != b.size())
            return false;
        for (size_t i = 0; i < a.size(); ++i) {
            if ((*this)(a[i]) != (*this)(b[i]))
                return false;
        }
        return true;
    }

    /** First position at or after from where pattern (not empty) matches, or npos. */
    size_t find(std::string_view text, std::string_view pattern, size_t from) const {
        const unsigned char first = (*this)(pattern[0]);
        if (pattern.size() > text.size())
            return std::string_view::npos;
        const size_t last = text.size() - pattern.size(); // the last position a match may start
        if (m_twinCount[first] > 2)
            return findByteByByte(text, pattern, from, last);
        // The one or two bytes that fold to the pattern's first one are found with memchr, which
        // runs far ahead of a loop over single bytes. Each is looked for a window ahead at a time
        // and again only once passed, so that every byte is searched once per call and a byte
        // absent from the rest of the text costs a window, not the whole text.
        constexpr size_t kWindow = 256;
        const int twins = m_twinCount[first];
        size_t at[2] = {0, 0}; // the twin's next occurrence, or where its search stopped
        bool found[2] = {false, false};
        bool searched[2] = {false, false};
        for (size_t i = from; i <= last;) {
            size_t candidate = std::string_view::npos;
            bool isMatchStart = false;
            for (int k = 0; k < twins; ++k) {
                if (!searched[k] || at[k] < i || (!found[k] && at[k] == i)) {
                    const size_t stop = std::min(last + 1, i + kWindow);
                    const void* hit = std::memchr(text.data() + i, m_twins[first][k], stop - i);
                    found[k] = hit != nullptr;
                    at[k] = found[k]
                                ? static_cast<size_t>(static_cast<const char*>(hit) - text.data())
                                : stop;
                    searched[k] = true;
                }
                if (at[k] < candidate || (at[k] == candidate && found[k])) {
                    candidate = at[k];
                    isMatchStart = found[k];
                }
            }
            if (candidate > last)
                return std::string_view::npos;
            if (!isMatchStart) {
                i = candidate; // a window's end: search on from there
                continue;
            }
            if (equal(text.substr(candidate + 1, pattern.size() - 1), pattern.substr(1)))
                return candidate;
            i = candidate + 1;
        }
        return std::string_view::npos;
    }

private:
    size_t findByteByByte(std::string_view text, std::string_view pattern, size_t from,
                          size_t last) const {
        const unsigned char first = (*this)(pattern[0]);
        const std::string_view rest = pattern.substr(1);
        for (size_t i = from; i <= last; ++i) {
            if ((*this)(text[i]) == first && equal(text.substr(i + 1, rest.size()), rest))
                return i;
        }
        return std::string_view::npos;
    }

    std::array<unsigned char, 256> m_upper{};
    /** For each upper-case byte, how many bytes fold to it, and the first two of them. */
    std::array<int, 256> m_twinCount{};
    std::array<std::array<char, 2>, 256> m_twins{};
};
