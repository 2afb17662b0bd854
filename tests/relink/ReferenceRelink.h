#pragma once

// The relinking algorithm written plainly, one rescan of the page per reference: slow on large
// pages, easy to check by reading. The production path must give byte-identical results.

#include "relink/Hrefs.h"

namespace reference {

void collect_all_urls(const CText& page, CList<CString256>& urls);
void classic_extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                           HrefMap& map);
void extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page, HrefMap& map);
void ReplaceMappedURLs(CText& page, const HrefMap& map);
void relink(const CString256& pageURL, CText& page);

} // namespace reference
