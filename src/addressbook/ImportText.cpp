#include "addressbook/ImportText.h"

#include "addressbook/ImportError.h"
#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

#include <QStringDecoder>

std::optional<QString> ImportText::decode(const QByteArray& bytes, const QString& charset) {
    QStringDecoder decoder(charset.toLatin1().constData());
    if (!decoder.isValid())
        return std::nullopt;
    return QString(decoder.decode(bytes));
}

namespace {

bool startsWithUtf16Bom(const QByteArray& bytes) {
    return bytes.startsWith("\xFF\xFE") || bytes.startsWith("\xFE\xFF");
}

} // namespace

QString ImportText::decodeUnlabelled(const QByteArray& bytes) {
    // A byte order mark outranks any guess: Outlook's "Unicode" exports are UTF-16.
    if (bytes.startsWith("\xFF\xFE"))
        return decode(bytes.mid(2), QStringLiteral("UTF-16LE")).value_or(QString());
    if (bytes.startsWith("\xFE\xFF"))
        return decode(bytes.mid(2), QStringLiteral("UTF-16BE")).value_or(QString());
    const QByteArray body = withoutBom(bytes);
    const QString text = DecodeUtf8Strictly(body);
    if (!text.isNull())
        return text;
    return decode(body, QStringLiteral("windows-1252")).value_or(QString::fromLatin1(body));
}

QByteArray ImportText::asUtf8(const QByteArray& bytes) {
    return startsWithUtf16Bom(bytes) ? decodeUnlabelled(bytes).toUtf8() : withoutBom(bytes);
}

QByteArray ImportText::withoutBom(const QByteArray& bytes) {
    return bytes.startsWith("\xEF\xBB\xBF") ? bytes.mid(3) : bytes;
}

bool ImportText::isPlausibleAddress(const QString& address) {
    const qsizetype at = address.indexOf(QLatin1Char('@'));
    if (at <= 0 || at == address.size() - 1 || address.indexOf(QLatin1Char('@'), at + 1) >= 0)
        return false;
    for (const QChar c : address) {
        if (c.isSpace() || c.category() == QChar::Other_Control || c == QLatin1Char('<') ||
            c == QLatin1Char('>') || c == QLatin1Char(',') || c == QLatin1Char(';'))
            return false;
    }
    return true;
}

void ImportText::requireAddress(const QString& address, int line) {
    if (!isPlausibleAddress(address))
        throw ImportError(line, LocalizedString("\"%1\" is not an e-mail address").arg(address));
}

void ImportText::requireCleanName(const QString& name, int line) {
    for (const QChar c : name)
        if (c.category() == QChar::Other_Control)
            throw ImportError(line, LocalizedString("a name cannot hold a control character"));
}

void ImportText::splitFullName(const QString& fullName, QString& first, QString& last) {
    const QString name = fullName.simplified();
    first.clear();
    last.clear();
    if (name.isEmpty())
        return;
    const qsizetype space = name.lastIndexOf(QLatin1Char(' '));
    if (space < 0) {
        first = name;
        return;
    }
    first = name.left(space);
    last = name.mid(space + 1);
}
