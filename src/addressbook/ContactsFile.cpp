#include "addressbook/ContactsFile.h"

#include "addressbook/CsvImporter.h"
#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "addressbook/VCardImporter.h"
#include "util/LocalizedStrings.h"

#include <QFile>

ParsedContacts ContactsFile::read(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        throw ImportError(0,
                          LocalizedString("the file cannot be read: %1").arg(file.errorString()));
    const QByteArray data = file.readAll();
    if (file.error() != QFileDevice::NoError)
        throw ImportError(0,
                          LocalizedString("the file cannot be read: %1").arg(file.errorString()));
    return isVCard(path, data) ? VCardImporter::parse(data) : CsvImporter::parse(data);
}

bool ContactsFile::isVCard(const QString& path, const QByteArray& data) {
    const QString lower = path.toLower();
    if (lower.endsWith(QLatin1String(".vcf")) || lower.endsWith(QLatin1String(".vcard")))
        return true;
    return ImportText::asUtf8(data).trimmed().left(11).toUpper() == "BEGIN:VCARD";
}
