#pragma once

#include <array>
#include <cctype>
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
        const std::string_view rest = pattern.substr(1);
        for (size_t i = from; i + pattern.size() <= text.size(); ++i) {
            if ((*this)(text[i]) == first && equal(text.substr(i + 1, rest.size()), rest))
                return i;
        }
        return std::string_view::npos;
    }

private:
    std::array<unsigned char, 256> m_upper{};
};
