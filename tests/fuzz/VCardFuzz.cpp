// The vCard importer on arbitrary bytes.

#include "ImportFuzz.h"

#include "addressbook/VCardImporter.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::checkImport(&VCardImporter::parse, fuzz::bytesOf(data, size));
    return 0;
}
