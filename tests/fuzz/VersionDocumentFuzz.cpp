// Any bytes may come back as the version document: reading them never crashes, and the number
// of a document that reads comes back the same from a plain XML document that holds it.

#include "FuzzSupport.h"

#include "update/VersionDocument.h"

#include <QString>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::optional<PublishedVersion> version = ReadVersionDocument(fuzz::bytesOf(data, size));
    if (!version)
        return 0;
    const QString xml =
        QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-8\"?><plist version=\"1.0\"><dict>"
                       "<key>Pelmo</key><dict><key>CurrentVersion</key><integer>%1</integer>"
                       "<key>CurrentVersionString</key><string>v</string></dict></dict></plist>")
            .arg(version->number);
    const std::optional<PublishedVersion> again = ReadVersionDocument(xml.toUtf8());
    fuzz::require(again.has_value(), "a document read once does not read again");
    fuzz::require(again->number == version->number, "the version number changes on reading");
    return 0;
}
