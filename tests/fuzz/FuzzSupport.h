#pragma once

// What the fuzz targets share: a failed property aborts, which libFuzzer reports as a crash and
// keeps as an artifact.

#include <QByteArray>

#include <cstdint>
#include <cstdio>
#include <cstdlib>

namespace fuzz {

inline void require(bool ok, const char* what) {
    if (!ok) {
        std::fprintf(stderr, "property failed: %s\n", what);
        std::abort();
    }
}

inline QByteArray bytesOf(const uint8_t* data, size_t size) {
    return QByteArray(reinterpret_cast<const char*>(data), static_cast<qsizetype>(size));
}

} // namespace fuzz
