#include "ReferenceRelink.h"

#include "relink/Relink.h"

#include <cstring>

namespace reference {

namespace {

bool isTerminator(char c) {
    return c != 0 && std::strchr("'\"()<>\r\n", c) != nullptr;
}

bool urlSafe(const CText& t) {
    return t.length() > 0 && t.isSafeEncoded();
}

bool localOrMailto(const CString256& s) {
    return s[0] == '#' || s.beginsWith("mailto:", 1);
}

void setHref(HrefMap& map, const CString256& key, const CString256& value) {
    if (Link<CString256, CString256>* record = map.insert(key, value))
        record->value = value;
}

} // namespace

void collect_all_urls(const CText& page, CList<CString256>& urls) {
    const char* t = page.buffer();
    for (long dot = page.find_pattern(0, "."); dot >= 0; dot = page.find_pattern(dot + 1, ".")) {
        long end = dot + 1;
        while (t[end] != 0 && !isTerminator(t[end]))
            ++end;
        if (t[end] == 0)
            continue;
        CText suffix("");
        suffix.append(t + dot + 1, end - dot - 1);
        if (!IsSuffix(suffix) || dot <= 1)
            continue;
        CText prefix("");
        for (long k = dot - 1; k > 0 && !isTerminator(t[k]); --k)
            prefix += t[k];
        prefix.reverse();
        if (!urlSafe(prefix) || !urlSafe(suffix))
            continue;
        CString256 candidate(prefix.buffer());
        candidate += ".";
        candidate += suffix.buffer();
        if (!localOrMailto(candidate))
            urls.append(candidate);
    }
}

void classic_extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                           HrefMap& map) {
    CText copy(page);
    const CDelimiters rows;
    for (const elem<delimiters>* row = rows.first; row != nullptr; row = row->next) {
        if (row->data.enabled == 0)
            continue;
        CString256 value;
        while (copy.extract_and_remove_between_patterns_nocase(row->data.opening.c_str(),
                                                               row->data.closing.c_str(), value)) {
            if (localOrMailto(value))
                continue;
            CString256 full;
            partial_href_to_full_url(pageURL, scheme, value, full);
            setHref(map, value, full);
        }
    }
}

void extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                   HrefMap& map) {
    CList<CString256> urls;
    reference::collect_all_urls(page, urls);
    for (const elem<CString256>* node = urls.first; node != nullptr; node = node->next) {
        CString256 full;
        partial_href_to_full_url(pageURL, scheme, node->data, full);
        setHref(map, node->data, full);
    }
    reference::classic_extract_hrefs(pageURL, scheme, page, map);
}

void ReplaceMappedURLs(CText& page, const HrefMap& map) {
    static const char* const rows[3][2] = {{"\"", "\""}, {"'", "'"}, {"(", ")"}};
    for (const elem<Link<CString256, CString256>*>* node = map.list.first; node != nullptr;
         node = node->next) {
        const CString256& key = node->data->key;
        if (key.length() == 0 || page.find_pattern_nocase(key.c_str()) < 0)
            continue;
        for (const auto& row : rows) {
            CText pattern(row[0]), replacement(row[0]);
            pattern += key;
            pattern += row[1];
            replacement += node->data->value;
            replacement += row[1];
            page.replace_pattern_all_nocase(pattern.buffer(), replacement.buffer());
        }
    }
}

void relink(const CString256& pageURL, CText& page) {
    const CURL base(pageURL.c_str());
    HrefMap map;
    reference::extract_hrefs(pageURL, base.protocol, page, map);
    reference::ReplaceMappedURLs(page, map);
}

} // namespace reference
