#include "relink/CURL.h"

#include "relink/SuffixMap.h"

#include <cstring>
#include <string>

namespace {

// Position of the last c in text, or npos.
size_t lastOf(const std::string& text, char c) {
    return text.rfind(c);
}

void terminateAt(std::string& text, size_t position) {
    if (position != std::string::npos)
        text[position] = 0;
}

void copyList(const CList<CString256>& from, CList<CString256>& to) {
    to.clear();
    for (const elem<CString256>* node = from.first; node != nullptr; node = node->next)
        to.append(node->data);
}

// The text after the last `mark`, cut at the last occurrences of the two other delimiters.
int extractAfter(const char* s, char mark, char other1, char other2, CString256& out) {
    std::string copy(s);
    const size_t at = lastOf(copy, mark);
    if (at == std::string::npos)
        return 0;
    terminateAt(copy, lastOf(copy, other1));
    terminateAt(copy, lastOf(copy, other2));
    out = copy.c_str() + at + 1;
    return 1;
}

} // namespace

CURL::CURL(const char* s) {
    init(s);
}

CURL::CURL(const CURL& other)
    : url(other.url), protocol(other.protocol), host(other.host), path(other.path),
      fileAndArgs(other.fileAndArgs), filename(other.filename), suffix(other.suffix),
      searchArgs(other.searchArgs), pathArgs(other.pathArgs), anchor(other.anchor),
      fileType(other.fileType), fileCreator(other.fileCreator) {
    copyList(other.pathList, pathList);
}

CURL& CURL::operator=(const CURL& other) {
    if (this == &other)
        return *this;
    url = other.url;
    protocol = other.protocol;
    host = other.host;
    path = other.path;
    copyList(other.pathList, pathList);
    fileAndArgs = other.fileAndArgs;
    filename = other.filename;
    suffix = other.suffix;
    searchArgs = other.searchArgs;
    pathArgs = other.pathArgs;
    anchor = other.anchor;
    fileType = other.fileType;
    fileCreator = other.fileCreator;
    return *this;
}

CURL& CURL::operator=(const char* s) {
    return *this = CURL(s);
}

void CURL::init(const char* s) {
    if (s == nullptr || *s == 0)
        return;
    std::string copy(s);
    terminateAt(copy, lastOf(copy, '#'));
    url = copy.c_str();
    parse(copy.c_str());
}

void CURL::parse(const char* s) {
    extract_protocol(s, protocol);
    extract_host(s, host);
    extract_path(s, path);
    parse_path(path, pathList);
    extract_filename(s, filename, suffix, fileAndArgs);
    extract_pathArgs(s, pathArgs);
    extract_searchArgs(s, searchArgs);
    extract_anchor(s, anchor);
    fileType = 0;
    fileCreator = 0;
    if (suffix.length() == 0)
        return;
    if (const Link<CString256, ICMapEntry>* entry = gSuffixMap.lookup(suffix)) {
        fileType = entry->value.fileType;
        fileCreator = entry->value.fileCreator;
    }
}

void CURL::extract_protocol(const char* s, ip_protocols& p) {
    p = ip_http;
    const char* start = s + std::strspn(s, ":");
    const std::string token(start, std::strcspn(start, ":"));
    if (token == "ftp")
        p = ip_ftp;
    else if (token == "https")
        p = ip_https;
}

void CURL::extract_host(const char* s, CString256& h) {
    const char* scheme = std::strstr(s, "://");
    if (scheme == nullptr) {
        h = static_cast<const char*>(nullptr);
        return;
    }
    const char* start = scheme + 3;
    h = std::string(start, std::strcspn(start, "/")).c_str();
}

void CURL::extract_path(const char* s, CString256& p) {
    const char* scheme = std::strstr(s, "://");
    const size_t from = scheme != nullptr ? static_cast<size_t>(scheme - s) + 3 : 0;
    std::string copy(s);
    const size_t firstSlash = copy.find('/', from);
    if (firstSlash == std::string::npos)
        return;
    const size_t query = copy.rfind('?');
    if (query != std::string::npos && query > firstSlash)
        copy.resize(query);
    copy.resize(std::min(copy.size(), lastOf(copy, '#')));
    copy.resize(std::min(copy.size(), lastOf(copy, '$')));
    const size_t lastSlash = copy.rfind('/');
    // An anchor or "$" before the host's end leaves no slash after it: no path then.
    if (lastSlash == std::string::npos || lastSlash <= firstSlash + 1)
        return;
    p = copy.substr(firstSlash + 1, lastSlash - firstSlash - 1).c_str();
}

void CURL::parse_path(const CString256& p, CList<CString256>& out) {
    char copy[CString256::max_length + 1];
    std::strcpy(copy, p.c_str());
    char* state = nullptr;
    for (char* segment = strtok_r(copy, "/", &state); segment != nullptr;
         segment = strtok_r(nullptr, "/", &state))
        out.append(CString256(segment));
}

void CURL::extract_filename(const char* s, CString256& f, CString256& x, CString256& fa) {
    std::string copy(s);
    const size_t dollar = lastOf(copy, '$');
    const size_t query = lastOf(copy, '?');
    terminateAt(copy, dollar);
    terminateAt(copy, query);
    terminateAt(copy, lastOf(copy, '#'));

    const char* text = copy.c_str();
    const char* lastSlash = std::strrchr(text, '/');
    const char* firstSlash = std::strchr(text, '/');
    // The "//" of "://" never yields a file name.
    const bool exists = lastSlash != nullptr && (lastSlash == text || lastSlash != firstSlash + 1);
    if (exists) {
        f = lastSlash + 1;
        if (const char* dot = std::strrchr(lastSlash + 1, '.'))
            x = dot;
    }
    if (dollar != std::string::npos)
        copy[dollar] = '$';
    if (query != std::string::npos)
        copy[query] = '?';
    if (exists)
        fa = copy.c_str() + (lastSlash - text) + 1;
}

int CURL::extract_pathArgs(const char* s, CString256& a) {
    return extractAfter(s, '$', '?', '#', a);
}

int CURL::extract_searchArgs(const char* s, CString256& a) {
    return extractAfter(s, '?', '$', '#', a);
}

void CURL::extract_anchor(const char* s, CString256& a) {
    extractAfter(s, '#', '$', '?', a);
}
