// The production relinker against the plain algorithm on arbitrary bytes, the first line being
// the page's address: any difference in the scans, the href map or the page aborts.

#include "ReferenceRelink.h"

#include "relink/SuffixMap.h"

#include <cstdlib>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    EnsureSuffixMap();
    const std::string_view input(reinterpret_cast<const char*>(data), size);
    const size_t newline = std::min(input.find('\n'), size);
    const CString256 url(std::string(input.substr(0, newline)).c_str());
    const std::string_view page = input.substr(std::min(newline + 1, size));
    // The plain algorithm is quadratic, and chains of replacements can grow a page a
    // thousandfold: small inputs keep every run fast while still mixing every kind of reference.
    if (size <= 512 && reference::outcome(url, page, false) != reference::outcome(url, page, true))
        std::abort();
    return 0;
}
