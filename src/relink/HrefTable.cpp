#include "relink/HrefTable.h"

#include "relink/HrefScanner.h"
#include "relink/Hrefs.h"

#include <cstring>

namespace {

const char* schemeText(ip_protocols scheme) {
    switch (scheme) {
    case ip_http:
        return "http:";
    case ip_ftp:
        return "ftp:";
    case ip_https:
        return "https:";
    }
    return "";
}

// Appends the first count directories of the page's path, each with its slash.
void appendDirectories(const CList<CString256>& directories, int count, CString256& out) {
    for (const elem<CString256>* node = directories.first; node != nullptr && count > 0;
         node = node->next, --count) {
        out += node->data;
        out += "/";
    }
}

// "../" counted anywhere, left to right without overlap; only the leading ones are skipped.
int countParents(const char* reference) {
    int count = 0;
    for (const char* p = std::strstr(reference, "../"); p != nullptr; p = std::strstr(p + 3, "../"))
        ++count;
    return count;
}

} // namespace

bool IsLocalOrMailto(std::string_view reference) {
    return reference.starts_with('#') ||
           (reference.size() >= 7 && STRNCMP(reference.data(), "mailto:", 7) == 0);
}

void ResolveHref(const CURL& base, ip_protocols scheme, const CString256& href, CString256& out) {
    const char* s = schemeText(scheme);
    CString256 reference;
    if (href.beginsWith("./", 1)) {
        reference = href.c_str() + 2;
    } else if (href.beginsWith("//", 0)) {
        reference = s; // a scheme-relative reference takes the page's scheme
        reference += href;
    } else {
        reference = href;
    }
    if (std::strstr(reference.c_str(), "://") != nullptr) {
        out = reference;
        return;
    }
    CString256 result(s);
    result += "//";
    result += base.host;
    if (reference[0] == '/') {
        result += reference;
    } else if (reference.beginsWith("../", 0)) {
        const int parents = countParents(reference.c_str());
        result += "/";
        appendDirectories(base.pathList, base.pathList.count - parents, result);
        result += reference.c_str() + 3 * parents;
    } else {
        if (base.path.length() > 0) {
            result += "/";
            result += base.path;
        }
        result += "/";
        result += reference;
    }
    out = result;
}

HrefTable::HrefTable(const CString256& pageURL, ip_protocols scheme)
    : m_base(pageURL.c_str()), m_scheme(scheme) {}

void HrefTable::add(std::string_view href) {
    // Exactly what a CString256 of it keeps: up to its first NUL, at most 255 bytes.
    std::string_view cut = href.substr(0, CString256::max_length);
    cut = cut.substr(0, cut.find('\0'));
    if (m_index.find(cut) != m_index.end())
        return;
    m_index.emplace(std::string(cut), m_entries.size());
    const CString256 key(std::string(cut).c_str());
    CString256 full;
    ResolveHref(m_base, m_scheme, key, full);
    m_entries.push_back({key.c_str(), full.c_str()});
}

void HrefTable::addUnlessLocal(std::string_view value) {
    if (!IsLocalOrMailto(value))
        add(value);
}

void HrefTable::collect(const CText& page) {
    const std::string_view text(page.buffer() != nullptr ? page.buffer() : "",
                                page.buffer() != nullptr ? page.length() : 0);
    const HrefScanner scanner(text);
    scanner.collectSuffixed([this](std::string_view candidate) { addUnlessLocal(candidate); });
    std::string work(scanner.text());
    const CDelimiters rows;
    for (const elem<delimiters>* row = rows.first; row != nullptr; row = row->next) {
        if (row->data.enabled == 0)
            continue;
        HrefScanner::extractBetween(work, row->data.opening.c_str(), row->data.closing.c_str(),
                                    [this](std::string_view value) { addUnlessLocal(value); });
    }
}
