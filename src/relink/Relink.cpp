#include "relink/Relink.h"

#include "relink/HrefTable.h"
#include "relink/MappedURLReplacer.h"

#include <cstring>
#include <string>

namespace {

void assignBytes(CText& page, const std::string& bytes) {
    page = "";
    page.append(bytes.data(), static_cast<long>(bytes.size()));
}

std::string_view textOf(const CText& page) {
    return std::string_view(page.buffer(), static_cast<size_t>(page.length()));
}

} // namespace

void partial_href_to_full_url(const CString256& pageURL, ip_protocols scheme,
                              const CString256& href, CString256& out) {
    ResolveHref(CURL(pageURL.c_str()), scheme, href, out);
}

void partial_href_to_full_url(const CString256& pageURL, const CString256& href, CString256& out) {
    partial_href_to_full_url(pageURL, ip_http, href, out);
}

bool href_is_relative(const CString256& s) {
    return std::strstr(s.c_str(), "://") == nullptr;
}

void ReplaceMappedURLs(CText& page, const HrefMap& map) {
    if (page.buffer() == nullptr)
        return;
    std::vector<MappedURLReplacer::Entry> entries;
    for (const elem<Link<CString256, CString256>*>* node = map.list.first; node != nullptr;
         node = node->next)
        entries.push_back({node->data->key.c_str(), node->data->value.c_str()});
    assignBytes(page, MappedURLReplacer(std::move(entries)).apply(textOf(page)));
}

void relink(const CString256& pageURL, CText& page) {
    if (page.buffer() == nullptr)
        return;
    const CURL base(pageURL.c_str());
    HrefTable table(pageURL, base.protocol);
    table.collect(page);
    assignBytes(page, MappedURLReplacer(table.entries()).apply(textOf(page)));
}
