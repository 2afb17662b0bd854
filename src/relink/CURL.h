#pragma once

#include "text/CString256.h"
#include "text/Containers.h"

#include <cstdint>

/** The schemes a page URL may have; any other scheme counts as http. */
enum ip_protocols : int32_t {
    ip_http = 1,
    ip_ftp = 2,
    ip_https = 3,
};

/**
 * A URL taken apart by plain character searches, for relinking a page against its own address.
 *
 * Deliberately not a general URL parser: it knows three schemes, cuts on fixed characters,
 * never decodes escapes, and cuts every part to 255 bytes. Path arguments are introduced by "$"
 * (not ";"). init() drops the anchor before parsing, so `anchor` stays empty for a URL given as
 * text. Each extractor works on its own copy of the URL and leaves its output untouched when its
 * delimiter is absent.
 */
struct CURL {
    CString256 url; ///< the URL as given, without its anchor
    ip_protocols protocol = ip_http;
    CString256 host;            ///< between "://" and the next "/" (port and user part kept)
    CString256 path;            ///< the directories, without leading or trailing "/"
    CList<CString256> pathList; ///< `path` split on "/", empty segments dropped
    CString256 fileAndArgs;     ///< last path component with its "$" and "?" parts
    CString256 filename;        ///< last path component alone
    CString256 suffix;          ///< from the file name's last "." on, dot included
    CString256 searchArgs;      ///< after the last "?"
    CString256 pathArgs;        ///< after the last "$"
    CString256 anchor;          ///< after the last "#"
    uint32_t fileType = 0;      ///< from the suffix map, else 0
    uint32_t fileCreator = 0;   ///< from the suffix map, else 0

    CURL() = default;
    explicit CURL(const char* s);
    CURL(const CURL& other);
    CURL& operator=(const CURL& other);
    /** Replaces every field by those of a fresh parse of s. */
    CURL& operator=(const char* s);

    /** Parses s, anchor removed; an empty or null s sets nothing. */
    void init(const char* s);
    /** Runs every extractor on s, in a fixed order, then looks the suffix up in the suffix map. */
    void parse(const char* s);

    static void extract_protocol(const char* s, ip_protocols& p);
    static void extract_host(const char* s, CString256& h);
    static void extract_path(const char* s, CString256& p);
    static void extract_filename(const char* s, CString256& f, CString256& x, CString256& fa);
    /** 1 when s has a "$", with what follows it (up to "?" or "#") in a. */
    static int extract_pathArgs(const char* s, CString256& a);
    /** 1 when s has a "?", with what follows it (up to "$" or "#") in a. */
    static int extract_searchArgs(const char* s, CString256& a);
    static void extract_anchor(const char* s, CString256& a);
    /** Appends the non-empty "/"-separated segments of p to out (out is not cleared). */
    static void parse_path(const CString256& p, CList<CString256>& out);
};
