#pragma once

// The relinking algorithm written plainly, one rescan of the page per reference: slow on large
// pages, easy to check by reading. The production path must give byte-identical results.

#include "relink/Hrefs.h"

#include <string>
#include <string_view>
#include <vector>

namespace reference {

void relink(const CString256& pageURL, CText& page);

/** The page relinked, the suffix scan's words and the href map, by either algorithm. */
std::vector<std::string> outcome(const CString256& pageURL, std::string_view page, bool plain);

CText textOf(std::string_view bytes);
std::string bytesOf(const CText& text);
/** The list's texts, or the map's entries as "key -> value", appended to out. */
std::vector<std::string> lines(const CList<CString256>& list, std::vector<std::string> out = {});
std::vector<std::string> lines(const HrefMap& map, std::vector<std::string> out = {});

} // namespace reference
