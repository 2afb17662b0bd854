#include "relink/Hrefs.h"

#include "relink/HrefScanner.h"
#include "relink/HrefTable.h"
#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <cstring>
#include <string>

namespace {

constexpr char kListName[] = "delimiterList";
// The end mark of a named list: a bullet in UTF-8 and a carriage return.
constexpr char kListEnd[] = "\xE2\x80\xA2\r";

std::string_view textOf(const CText& page) {
    if (page.buffer() == nullptr)
        return {};
    return std::string_view(page.buffer(), static_cast<size_t>(page.length()));
}

void setHref(HrefMap& map, const char* key, const char* full) {
    const CString256 k(key), v(full);
    if (Link<CString256, CString256>* record = map.insert(k, v))
        record->value = v;
}

void enterTable(const HrefTable& table, HrefMap& map) {
    for (const MappedURLReplacer::Entry& entry : table.entries())
        setHref(map, entry.key.c_str(), entry.value.c_str());
}

void eachEnabledValue(const CText& page, const HrefScanner::Found& found) {
    std::string work(HrefScanner(textOf(page)).text());
    const CDelimiters rows;
    for (const elem<delimiters>* row = rows.first; row != nullptr; row = row->next) {
        if (row->data.enabled != 0)
            HrefScanner::extractBetween(work, row->data.opening.c_str(), row->data.closing.c_str(),
                                        found);
    }
}

} // namespace

CDelimiters::CDelimiters() {
    static const delimiters rows[] = {
        {"HREF=\"", "\""},
        {"SRC=\"", "\""},
        {"HREF='", "'"},
        {"SRC='", "'"},
        {"SRC=", " "},
        {"background=\"", "\""},
        {"background='", "'"},
        {"option value=\"", "\"", 0},
        {"option value='", "'", 0},
        {"HREF=", ">"},
        {"SRC=", ">"},
        {"background=", ">"},
        {"HREF=", " "},
        {"SRC=", " "},
        {"background=", " "},
    };
    clear();
    for (const delimiters& row : rows)
        append(row);
}

void CDelimiters::rowTexts(CList<CString256>& out) const {
    for (const elem<delimiters>* row = first; row != nullptr; row = row->next) {
        CString256 text(row->data.opening);
        text += "\t";
        text += row->data.closing;
        out.append(text);
    }
}

void CDelimiters::operator>>(CText& t) const {
    CList<CString256> texts;
    rowTexts(texts);
    t.append_named_list(kListName, texts);
}

void CDelimiters::Print(CText& t) const {
    CList<CString256> texts;
    rowTexts(texts);
    t.pretty_append_named_list(kListName, texts);
}

void CDelimiters::operator<<(CText& t) {
    clear();
    CList<CString256> texts;
    t.extract_list("delimiterList ", kListEnd, texts);
    for (const elem<CString256>* item = texts.first; item != nullptr; item = item->next) {
        CString256 opening(item->data);
        const char* tab = std::strchr(item->data.c_str(), '\t');
        if (tab != nullptr)
            opening[static_cast<int>(tab - item->data.c_str())] = 0;
        append(delimiters(opening.c_str(), tab != nullptr ? tab + 1 : ""));
    }
}

int IsSuffixMapSuffix(CText& s) {
    s.to_lower();
    CString256 key(".");
    if (s.buffer() != nullptr)
        key += s.buffer();
    return gSuffixMap.lookup(key) != nullptr;
}

int IsSuffix(const CText& s) {
    return IsResourceSuffix(textOf(s));
}

void collect_all_urls(const CText& page, CList<CString256>& urls, HrefMap* mailtoNames) {
    HrefScanner(textOf(page)).collectSuffixed([&](std::string_view candidate) {
        const CString256 url(std::string(candidate).c_str());
        if (mailtoNames != nullptr && url.beginsWith("mailto:", 1)) {
            CText open(url.c_str());
            open += "\">";
            CText linkText;
            page.extract_between_patterns_nocase(open.buffer(), "</a>", linkText);
            const CString256 name(linkText.buffer());
            mailtoNames->insert(CString256(url.c_str() + 7), name);
        }
        if (!IsLocalOrMailto(candidate))
            urls.append(url);
    });
}

void classic_extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                           HrefMap& map) {
    const CURL base(pageURL.c_str());
    eachEnabledValue(page, [&](std::string_view value) {
        if (IsLocalOrMailto(value))
            return;
        const CString256 href(std::string(value).c_str());
        CString256 full;
        ResolveHref(base, scheme, href, full);
        setHref(map, href.c_str(), full.c_str());
    });
}

void extract_hrefs(const CString256& pageURL, ip_protocols scheme, const CText& page,
                   HrefMap& map) {
    HrefTable table(pageURL, scheme);
    table.collect(page);
    enterTable(table, map);
}

void extract_hrefs(const CText& page, const CString256& pageURL, HrefMap& map) {
    extract_hrefs(pageURL, ip_http, page, map);
}

void classic_extract_hrefs(const CText& page, const CString256& pageURL, HrefMap& map) {
    classic_extract_hrefs(pageURL, ip_http, page, map);
}

void classic_extract_hrefs(const CText& page, CList<CString256>& out) {
    eachEnabledValue(
        page, [&](std::string_view value) { out.append(CString256(std::string(value).c_str())); });
}
