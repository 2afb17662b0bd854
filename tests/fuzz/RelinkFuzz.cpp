// The production relinker against the plain algorithm on arbitrary bytes: the first line is the
// page's address, the rest the page. Any difference in the href map or the page aborts.

#include "ReferenceRelink.h"

#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>

namespace {

std::string dump(const HrefMap& map) {
    std::string out;
    for (auto* node = map.list.first; node != nullptr; node = node->next)
        out += std::string(node->data->key.c_str()) + '\n' + node->data->value.c_str() + '\n';
    return out;
}

CText textOf(std::string_view bytes) {
    CText t("");
    t.append(bytes.data(), static_cast<long>(bytes.size()));
    return t;
}

} // namespace

// The plain algorithm is quadratic, and chains of replacements can grow a page a
// thousandfold; small inputs keep every run fast while still mixing every kind of reference.
constexpr size_t kLargestInput = 512;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static const bool ready = (InitializeSuffixMap(), true);
    (void)ready;
    if (size > kLargestInput)
        return 0;
    const std::string_view input(reinterpret_cast<const char*>(data), size);
    const size_t newline = input.find('\n');
    const std::string base(input.substr(0, std::min<size_t>(newline, 255)));
    const std::string_view page =
        newline == std::string_view::npos ? std::string_view() : input.substr(newline + 1);
    const CString256 pageURL(base.c_str());
    const ip_protocols scheme = CURL(pageURL.c_str()).protocol;

    HrefMap fastMap, plainMap;
    extract_hrefs(pageURL, scheme, textOf(page), fastMap);
    reference::extract_hrefs(pageURL, scheme, textOf(page), plainMap);
    if (dump(fastMap) != dump(plainMap))
        std::abort();

    CText fast = textOf(page), plain = textOf(page);
    relink(pageURL, fast);
    reference::relink(pageURL, plain);
    if (std::string_view(fast.buffer(), fast.length()) !=
        std::string_view(plain.buffer(), plain.length()))
        std::abort();
    return 0;
}
