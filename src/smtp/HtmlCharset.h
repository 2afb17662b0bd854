#pragma once

#include <QByteArray>
#include <QString>

class QTextDocument;

/**
 * One of the character sets of the character-set setting, and the message body's
 * HTML in it: the HTML declares the set in its meta element, and every character the set
 * cannot hold is written as a numeric character reference ("&#8364;"), so that the bytes
 * encode the text without loss.
 */
class HtmlCharset {
public:
    /** 0 UTF-8, 1 US-ASCII, 2 ISO-8859-1, 3 Shift_JIS; any other index UTF-8. */
    static HtmlCharset forIndex(int index);

    /** The name the HTML declares: "utf-8", "us-ascii", "iso-8859-1" or "Shift_JIS". */
    const QString& name() const { return charsetName; }
    /** The document as HTML in this set; empty when the export fails. */
    QByteArray exportDocument(const QTextDocument& document) const;
    /** text with what this set cannot hold replaced by numeric character references. */
    QString escapeUnencodable(const QString& text) const;
    /** text with what this set cannot hold replaced by "?": for text that is not HTML. */
    QString replaceUnencodable(const QString& text) const;
    /** text in this set; characters it cannot hold are lost, escape them first. */
    QByteArray encode(const QString& text) const;
    QString decode(const QByteArray& bytes) const;

private:
    using Substitute = QString (*)(char32_t codePoint);

    explicit HtmlCharset(QString name) : charsetName(std::move(name)) {}
    bool canHold(char32_t codePoint) const;
    /** Whether the set holds every character of text, answered without a pass per character. */
    bool holdsAll(const QString& text) const;
    QString substituteUnencodable(const QString& text, Substitute substitute) const;

    QString charsetName;
};
