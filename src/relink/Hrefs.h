#pragma once

#include "relink/CURL.h"
#include "text/CString256.h"
#include "text/CText.h"
#include "text/Containers.h"

/** Map from a reference as written in a page to its absolute URL, walked in first-insertion order.
 */
using HrefMap = CMap<CString256, CString256>;

/** One row of the attribute table: the patterns around a value and whether the scans use it. */
struct delimiters {
    CString256 opening; ///< matched without regard to case
    CString256 closing;
    unsigned char enabled = 1;

    delimiters() = default;
    delimiters(const char* open, const char* close, unsigned char on = 1)
        : opening(open), closing(close), enabled(on) {}
};

/**
 * The attribute table of the delimiter scan, in the order it is tried. Each match is removed
 * from the scanned copy, so quoted forms come before bare ones, and SRC= up to a blank comes
 * before the background and ">" rows.
 */
struct CDelimiters : CList<delimiters> {
    CDelimiters();

    /** Appends the rows as "delimiterList open<TAB>close,...", ended by the bullet and CR. */
    void operator>>(CText& t) const;
    /** Appends the rows as an indented report line. */
    void Print(CText& t) const;
    /** Replaces the rows by the "delimiterList" read (and removed) from t; rows read are enabled.
     */
    void operator<<(CText& t);

private:
    void rowTexts(CList<CString256>& out) const;
};

/** True when "." and the text, lower-cased, is a suffix map key. Lower-cases the text in place. */
int IsSuffixMapSuffix(CText& s);

/** True when s, the text after a dot, makes the dotted word a file reference. */
int IsSuffix(const CText& s);

/**
 * The suffix scan: appends every "prefix.suffix" word of the page that looks like a file
 * reference, in page order, duplicates included; "#..." and "mailto:..." words are left out.
 * When mailtoNames is given, each mailto: word's link text is entered under its address.
 */
void collect_all_urls(const CText& page, CList<CString256>& urls, HrefMap* mailtoNames);

/** The delimiter scan: every enabled attribute value, resolved against pageURL into map. */
void classic_extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                           HrefMap& map);

/** Both scans: suffix-scan references first, in page order, then new ones from the delimiter scan.
 */
void extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page, HrefMap& map);

/** The scans with the scheme always "http:". */
void extract_hrefs(const CText& page, const CString256& pageURL, HrefMap& map);
void classic_extract_hrefs(const CText& page, const CString256& pageURL, HrefMap& map);

/** Every raw value of the enabled rows, unresolved and unfiltered, appended to out. */
void classic_extract_hrefs(const CText& page, CList<CString256>& out);
