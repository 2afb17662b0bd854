// The check before a group run reads a downloaded page for braces that look like tags: any
// page gives findings, each a word in braces, reported once, never one of the five tags.

#include "FuzzSupport.h"

#include "controller/PreflightCheck.h"

#include <QRegularExpression>
#include <QSet>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    PreflightCheck::Input input;
    input.subject = QStringLiteral("News");
    input.page = QString::fromUtf8(fuzz::bytesOf(data, size));
    QSet<QString> words;
    for (const PreflightCheck::Finding& finding : PreflightCheck::check(input)) {
        fuzz::require(finding.kind == PreflightCheck::Finding::Kind::UnknownTag, "only tags");
        const QString word = finding.text.section(QLatin1Char('"'), 1, 1);
        static const QRegularExpression braced(QStringLiteral("^\\{[A-Za-z][A-Za-z0-9_]*\\}$"));
        fuzz::require(braced.match(word).hasMatch(), "a word in braces");
        fuzz::require(word.compare(QLatin1String("{toName}"), Qt::CaseInsensitive) != 0 &&
                          word.compare(QLatin1String("{subject}"), Qt::CaseInsensitive) != 0,
                      "no real tag is reported");
        fuzz::require(!words.contains(word.toLower()), "each word once");
        words.insert(word.toLower());
    }
    return 0;
}
