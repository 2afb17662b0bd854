#include "update/VersionDocument.h"

#include <plist/plist.h>

#include <cstdint>
#include <cstdlib>
#include <limits>
#include <memory>

namespace {

struct PlistFree {
    void operator()(plist_t node) const { plist_free(node); }
};

} // namespace

std::optional<PublishedVersion> ReadVersionDocument(const QByteArray& bytes) {
    // libplist takes a 32-bit length; no version document comes near it.
    if (bytes.isEmpty() || bytes.size() > std::numeric_limits<int32_t>::max())
        return std::nullopt;
    plist_t parsed = nullptr;
    plist_from_memory(bytes.constData(), static_cast<uint32_t>(bytes.size()), &parsed);
    const std::unique_ptr<void, PlistFree> root(parsed);
    if (!root || plist_get_node_type(root.get()) != PLIST_DICT)
        return std::nullopt;
    const plist_t pelmo = plist_dict_get_item(root.get(), "Pelmo");
    if (!pelmo || plist_get_node_type(pelmo) != PLIST_DICT)
        return std::nullopt;
    const plist_t number = plist_dict_get_item(pelmo, "CurrentVersion");
    const plist_t string = plist_dict_get_item(pelmo, "CurrentVersionString");
    // libplist keeps every integer, negative ones too, as a 64-bit PLIST_UINT.
    if (!number || plist_get_node_type(number) != PLIST_UINT || !string ||
        plist_get_node_type(string) != PLIST_STRING)
        return std::nullopt;
    uint64_t value = 0;
    plist_get_uint_val(number, &value);
    char* text = nullptr;
    plist_get_string_val(string, &text);
    PublishedVersion version;
    // As a 32-bit signed number, the way the version has always been compared.
    version.number = static_cast<int32_t>(value);
    version.string = QString::fromUtf8(text);
    std::free(text);
    return version;
}
