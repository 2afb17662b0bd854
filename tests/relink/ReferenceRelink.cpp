#include "ReferenceRelink.h"

#include "relink/Relink.h"

#include <cstring>

namespace reference {

const auto isTerminator = [](char c) { return c != 0 && std::strchr("'\"()<>\r\n", c); };
const auto urlSafe = [](const CText& t) { return t.length() > 0 && t.isSafeEncoded(); };
// Anchors stay in the page, and mail addresses leave it for a mail client.
const auto kept = [](const CString256& s) { return s[0] != '#' && !s.beginsWith("mailto:", 1); };

static void collectWords(const CText& page, CList<CString256>& urls) {
    const char* t = page.buffer();
    for (long dot = page.find_pattern(0, "."); dot >= 0; dot = page.find_pattern(dot + 1, ".")) {
        long start = dot, end = dot + 1; // the page's first byte is never taken
        while (start > 1 && !isTerminator(t[start - 1]))
            --start;
        while (t[end] != 0 && !isTerminator(t[end]))
            ++end;
        const CText prefix = textOf({t + start, size_t(dot - start)});
        const CText suffix = textOf({t + dot + 1, size_t(end - dot - 1)});
        const CString256 word(std::string(t + start, t + end).c_str());
        if (t[end] != 0 && dot > 1 && IsSuffix(suffix) && urlSafe(prefix) && urlSafe(suffix) &&
            kept(word))
            urls.append(word);
    }
}

static void extractHrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                         HrefMap& map) {
    const auto enter = [&](const CString256& href) {
        CString256 full;
        partial_href_to_full_url(pageURL, scheme, href, full);
        if (Link<CString256, CString256>* record = map.insert(href, full))
            record->value = full;
    };
    CList<CString256> urls;
    collectWords(page, urls);
    for (const elem<CString256>* node = urls.first; node != nullptr; node = node->next)
        enter(node->data);
    // Each value taken is cut out of the copy, so that no later row sees it again.
    CText copy(page);
    CString256 value;
    const CDelimiters rows;
    for (const elem<delimiters>* row = rows.first; row != nullptr; row = row->next) {
        while (row->data.enabled != 0 &&
               copy.extract_and_remove_between_patterns_nocase(row->data.opening.c_str(),
                                                               row->data.closing.c_str(), value)) {
            if (kept(value))
                enter(value);
        }
    }
}

void relink(const CString256& pageURL, CText& page) {
    HrefMap map;
    extractHrefs(pageURL, CURL(pageURL.c_str()).protocol, page, map);
    for (auto* node = map.list.first; node != nullptr; node = node->next) {
        const std::string key = node->data->key.c_str(), value = node->data->value.c_str();
        if (key.empty() || page.find_pattern_nocase(key.c_str()) < 0)
            continue;
        for (const std::string row : {"\"\"", "''", "()"})
            page.replace_pattern_all_nocase((row[0] + key + row[1]).c_str(),
                                            (row[0] + value + row[1]).c_str());
    }
}

std::vector<std::string> outcome(const CString256& pageURL, std::string_view page, bool plain) {
    const ip_protocols scheme = CURL(pageURL.c_str()).protocol;
    CText text = textOf(page);
    CList<CString256> urls;
    HrefMap map;
    plain ? collectWords(text, urls) : ::collect_all_urls(text, urls, nullptr);
    plain ? extractHrefs(pageURL, scheme, text, map) : ::extract_hrefs(pageURL, scheme, text, map);
    plain ? reference::relink(pageURL, text) : ::relink(pageURL, text);
    return lines(map, lines(urls, {bytesOf(text)}));
}

CText textOf(std::string_view bytes) {
    return CText().append(bytes.data(), static_cast<long>(bytes.size()));
}

std::string bytesOf(const CText& text) {
    return text.buffer() == nullptr ? "" : std::string(text.buffer(), text.length());
}

std::vector<std::string> lines(const CList<CString256>& list, std::vector<std::string> out) {
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
        out.emplace_back(node->data.c_str());
    return out;
}

std::vector<std::string> lines(const HrefMap& map, std::vector<std::string> out) {
    for (auto* node = map.list.first; node != nullptr; node = node->next)
        out.push_back(std::string(node->data->key.c_str()) + " -> " + node->data->value.c_str());
    return out;
}

} // namespace reference
