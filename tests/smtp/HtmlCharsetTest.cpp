#include "smtp/HtmlCharset.h"

#include <QTextDocument>
#include <gtest/gtest.h>

namespace {

TEST(HtmlCharset, IndexTable) {
    EXPECT_EQ(HtmlCharset::forIndex(0).name(), QStringLiteral("utf-8"));
    EXPECT_EQ(HtmlCharset::forIndex(1).name(), QStringLiteral("us-ascii"));
    EXPECT_EQ(HtmlCharset::forIndex(2).name(), QStringLiteral("iso-8859-1"));
    EXPECT_EQ(HtmlCharset::forIndex(3).name(), QStringLiteral("Shift_JIS"));
    EXPECT_EQ(HtmlCharset::forIndex(4).name(), QStringLiteral("utf-8"));
}

TEST(HtmlCharset, EscapesCharactersOutsideTheSet) {
    const QString text = QString::fromUtf8("a é ¥ 日 😀");
    EXPECT_EQ(HtmlCharset::forIndex(0).escapeUnencodable(text), text);
    EXPECT_EQ(HtmlCharset::forIndex(1).escapeUnencodable(text),
              QStringLiteral("a &#233; &#165; &#26085; &#128512;"));
    EXPECT_EQ(HtmlCharset::forIndex(2).escapeUnencodable(text),
              QString::fromUtf8("a é ¥ &#26085; &#128512;"));
    // Shift_JIS has no é; the yen sign would come back as a backslash, so it is escaped.
    EXPECT_EQ(HtmlCharset::forIndex(3).escapeUnencodable(text),
              QString::fromUtf8("a &#233; &#165; 日 &#128512;"));
}

TEST(HtmlCharset, ReplacesCharactersOutsideTheSetByQuestionMarks) {
    const QString text = QString::fromUtf8("a é ¥ 日 😀");
    EXPECT_EQ(HtmlCharset::forIndex(0).replaceUnencodable(text), text);
    EXPECT_EQ(HtmlCharset::forIndex(1).replaceUnencodable(text), QStringLiteral("a ? ? ? ?"));
    EXPECT_EQ(HtmlCharset::forIndex(2).replaceUnencodable(text), QString::fromUtf8("a é ¥ ? ?"));
    // One "?" per character, a surrogate pair included.
    EXPECT_EQ(HtmlCharset::forIndex(3).replaceUnencodable(text), QString::fromUtf8("a ? ? 日 ?"));
}

TEST(HtmlCharset, ExportedBytesAreInTheSet) {
    QTextDocument document;
    document.setPlainText(QString::fromUtf8("Café"));
    const QByteArray latin1 = HtmlCharset::forIndex(2).exportDocument(document);
    EXPECT_TRUE(latin1.contains("Caf\xe9"));
    EXPECT_TRUE(latin1.contains("<meta charset=\"iso-8859-1\" />"));
    const QByteArray utf8 = HtmlCharset::forIndex(0).exportDocument(document);
    EXPECT_TRUE(utf8.contains("Caf\xc3\xa9"));
    const QByteArray ascii = HtmlCharset::forIndex(1).exportDocument(document);
    EXPECT_TRUE(ascii.contains("Caf&#233;"));
}

} // namespace
