#include "smtp/HtmlCharset.h"

#include <algorithm>

#include <QRegularExpression>
#include <QStringDecoder>
#include <QStringEncoder>
#include <QTextDocument>

HtmlCharset HtmlCharset::forIndex(int index) {
    // The IANA names, which is what browsers and mail readers look for in HTML.
    switch (index) {
    case 1:
        return HtmlCharset(QStringLiteral("us-ascii"));
    case 2:
        return HtmlCharset(QStringLiteral("iso-8859-1"));
    case 3:
        return HtmlCharset(QStringLiteral("Shift_JIS"));
    default:
        return HtmlCharset(QStringLiteral("utf-8"));
    }
}

QByteArray HtmlCharset::exportDocument(const QTextDocument& document) const {
    QString html = document.toHtml();
    if (html.isEmpty())
        return {};
    static const QRegularExpression declared(QStringLiteral("<meta charset=\"[^\"]*\" */?>"));
    const QString meta = QStringLiteral("<meta charset=\"%1\" />").arg(charsetName);
    if (html.contains(declared))
        html.replace(declared, meta);
    else
        html.replace(QStringLiteral("<head>"), QStringLiteral("<head>") + meta);
    return encode(escapeUnencodable(html));
}

QString HtmlCharset::escapeUnencodable(const QString& text) const {
    return substituteUnencodable(text, [](char32_t codePoint) {
        return QStringLiteral("&#%1;").arg(static_cast<uint>(codePoint));
    });
}

QString HtmlCharset::replaceUnencodable(const QString& text) const {
    return substituteUnencodable(text, [](char32_t) { return QStringLiteral("?"); });
}

QString HtmlCharset::substituteUnencodable(const QString& text, Substitute substitute) const {
    // Every copy of every message passes through here: most texts fit their set whole.
    if (holdsAll(text))
        return text;
    QString result;
    result.reserve(text.size());
    for (qsizetype i = 0; i < text.size();) {
        const bool pair =
            text.at(i).isHighSurrogate() && i + 1 < text.size() && text.at(i + 1).isLowSurrogate();
        const qsizetype width = pair ? 2 : 1;
        const char32_t codePoint =
            pair ? QChar::surrogateToUcs4(text.at(i), text.at(i + 1)) : text.at(i).unicode();
        if (canHold(codePoint))
            result += QStringView(text).mid(i, width);
        else
            result += substitute(codePoint);
        i += width;
    }
    return result;
}

bool HtmlCharset::holdsAll(const QString& text) const {
    if (charsetName == QLatin1String("utf-8"))
        return true;
    const char16_t limit = charsetName == QLatin1String("iso-8859-1") ? 0x100 : 0x80;
    if (std::all_of(text.cbegin(), text.cend(), [limit](QChar c) { return c.unicode() < limit; }))
        return true;
    if (charsetName == QLatin1String("us-ascii") || charsetName == QLatin1String("iso-8859-1"))
        return false;
    QStringEncoder encoder(charsetName.toLatin1().constData());
    const QByteArray bytes = encoder.encode(text);
    return !encoder.hasError() && decode(bytes) == text;
}

QByteArray HtmlCharset::encode(const QString& text) const {
    QStringEncoder encoder(charsetName.toLatin1().constData());
    return encoder.encode(text);
}

QString HtmlCharset::decode(const QByteArray& bytes) const {
    QStringDecoder decoder(charsetName.toLatin1().constData());
    return decoder.decode(bytes);
}

bool HtmlCharset::canHold(char32_t codePoint) const {
    if (codePoint < 0x80 || charsetName == QLatin1String("utf-8"))
        return true;
    if (charsetName == QLatin1String("us-ascii"))
        return false;
    if (charsetName == QLatin1String("iso-8859-1"))
        return codePoint < 0x100;
    // Shift_JIS: a character it holds survives the way there and back; this also refuses
    // the characters a converter maps to a look-alike (the yen sign to the backslash byte).
    const QString character = QString::fromUcs4(&codePoint, 1);
    QStringEncoder encoder(charsetName.toLatin1().constData());
    const QByteArray bytes = encoder.encode(character);
    return !encoder.hasError() && decode(bytes) == character;
}
