#pragma once

#include "relink/CURL.h"
#include "relink/Hrefs.h"
#include "text/CString256.h"
#include "text/CText.h"

/**
 * The absolute URL of href on the page at pageURL: "./x" and bare names against the page's
 * directory, "/x" against its host, each leading "../" one directory up (never above the host),
 * "//h/x" with the page's scheme. A reference with "://" is kept as it is. Cut at 255 bytes.
 */
void partial_href_to_full_url(const CString256& pageURL, ip_protocols scheme,
                              const CString256& href, CString256& out);

/** The same, the scheme always "http:". */
void partial_href_to_full_url(const CString256& pageURL, const CString256& href, CString256& out);

/** True when s holds no "://". */
bool href_is_relative(const CString256& s);

/**
 * Rewrites every "K", 'K' and (K) of the page, matched without regard to case, to "V", 'V' and
 * (V), entry by entry in the map's order. Unquoted references are left as they stand; an empty
 * key is skipped.
 */
void ReplaceMappedURLs(CText& page, const HrefMap& map);

/** Makes every reference of the page at pageURL absolute, in place. */
void relink(const CString256& pageURL, CText& page);
