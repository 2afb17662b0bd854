// The CSV importer on arbitrary bytes.

#include "ImportFuzz.h"

#include "addressbook/CsvImporter.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::checkImport(&CsvImporter::parse, fuzz::bytesOf(data, size));
    return 0;
}
