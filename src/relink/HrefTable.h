#pragma once

#include "relink/CURL.h"
#include "relink/MappedURLReplacer.h"
#include "text/CString256.h"
#include "text/CText.h"

#include <string>
#include <unordered_map>
#include <vector>

/**
 * The references of one page, each once, in the order first found, with the absolute URL of
 * each: what the href map holds, without its cost. A reference found again keeps its place; its
 * URL would be the same, since it depends only on the reference and the page's address.
 */
class HrefTable {
public:
    /** References are resolved against pageURL with the scheme text of scheme. */
    HrefTable(const CString256& pageURL, ip_protocols scheme);

    /** Runs the suffix scan, then the delimiter scan, over page. */
    void collect(const CText& page);

    /** Adds href (cut to 255 bytes) unless it is already there. */
    void add(std::string_view href);

    const std::vector<MappedURLReplacer::Entry>& entries() const { return m_entries; }

private:
    void addUnlessLocal(std::string_view value);

    CURL m_base;
    ip_protocols m_scheme;
    std::vector<MappedURLReplacer::Entry> m_entries;
    /** Looked up by a view into the page, so that a reference seen before costs no copy. */
    struct Hash {
        using is_transparent = void;
        size_t operator()(std::string_view key) const { return std::hash<std::string_view>{}(key); }
    };
    std::unordered_map<std::string, size_t, Hash, std::equal_to<>> m_index;
};

/** Whether a reference stays in the page (an anchor) or leaves it for a mail client. */
bool IsLocalOrMailto(std::string_view reference);

/** The absolute URL of href against an already parsed page address. */
void ResolveHref(const CURL& base, ip_protocols scheme, const CString256& href, CString256& out);
