#pragma once

#include "text/CString256.h"
#include "text/Containers.h"

#include <cstdint>

/**
 * What the system knows of one file-name suffix. Plain bytes: copied byte for byte, and an
 * all-zero record is the valid "nothing known" default.
 */
struct ICMapEntry {
    uint32_t fileType; ///< the suffix's first four bytes upper-cased, blank-padded ('HTML', 'GIF ')
    uint32_t fileCreator; ///< always 0 here: no creator codes on this platform
    char extension[32];   ///< the suffix with its dot, as the MIME database stores it
    char MIMEType[96];    ///< the MIME type the suffix maps to
};

/**
 * The process-wide map from a suffix with its dot (".html", case as stored) to what the system
 * knows of it. Filled once by InitializeSuffixMap() before any page is relinked; read-only after,
 * so Link pointers from lookups stay valid until exit.
 */
extern CMap<CString256, ICMapEntry> gSuffixMap;

/**
 * Fills gSuffixMap from the shared MIME database: one entry per simple "*.ext" glob. When a
 * suffix is claimed by several MIME types, the last one read wins and the key keeps its place.
 * Calling it again refreshes the entries.
 */
void InitializeSuffixMap();

/** Fills gSuffixMap unless it was filled before: for code that relinks on demand. */
void EnsureSuffixMap();

/** This program's four-character signature, as StrToFourCharCode reads it. */
uint32_t GetOurSignature();

/** Copies the first four bytes of s into code unchanged (no byte-order conversion). */
void StrToFourCharCode(const char* s, uint32_t& code);
