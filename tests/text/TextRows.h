#pragma once

#include "text/CText.h"

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>

// A table row: what an operation gave, written out as text, and what it should give.
struct TextRow {
    const char* name;
    std::string got, want;
};

inline void expectRows(std::initializer_list<TextRow> rows) {
    for (const TextRow& row : rows) {
        SCOPED_TRACE(row.name);
        EXPECT_EQ(row.got, row.want);
    }
}

inline std::string n(long v) {
    return std::to_string(v);
}

inline std::string bytes(const CText& t) { // "none" in the no-buffer state
    return t.buffer() == nullptr ? "none" : std::string(t.buffer(), size_t(t.length()));
}
