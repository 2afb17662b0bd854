#include "util/LocalizedStrings.h"

#include <QCoreApplication>
#include <QTranslator>
#include <gtest/gtest.h>

namespace {

// A translator that knows one key and counts how often it is asked.
class CountingTranslator : public QTranslator {
public:
    int asked = 0;

    QString translate(const char* context, const char* source, const char*, int) const override {
        if (QLatin1String(context) != QLatin1String("LocalizedStrings"))
            return {};
        ++const_cast<CountingTranslator*>(this)->asked;
        if (QString::fromUtf8(source) == QStringLiteral("Sending message"))
            return QStringLiteral("Envoi du message");
        return {};
    }
    bool isEmpty() const override { return false; }
};

TEST(LocalizedStrings, TranslatesOnceAndFallsBackToTheKey) {
    CountingTranslator translator;
    QCoreApplication::installTranslator(&translator);

    EXPECT_EQ(LocalizedString("Sending message"), QStringLiteral("Envoi du message"));
    const int afterFirst = translator.asked;
    EXPECT_GE(afterFirst, 1);
    EXPECT_EQ(LocalizedString(QStringLiteral("Sending message")),
              QStringLiteral("Envoi du message"));
    EXPECT_EQ(LocalizedStringNS("Sending message"), QStringLiteral("Envoi du message"));
    EXPECT_EQ(translator.asked, afterFirst); // served from the cache

    // A key the table lacks is its own text, UTF-8 included, and is cached too.
    EXPECT_EQ(LocalizedString("Caf\xc3\xa9 %@ not found"),
              QString::fromUtf8("Caf\u00e9 %@ not found"));
    const int afterMiss = translator.asked;
    EXPECT_EQ(LocalizedString("Caf\xc3\xa9 %@ not found"),
              QString::fromUtf8("Caf\u00e9 %@ not found"));
    EXPECT_EQ(translator.asked, afterMiss);

    QCoreApplication::removeTranslator(&translator);
    // Translations already made stay for the life of the process.
    EXPECT_EQ(LocalizedString("Sending message"), QStringLiteral("Envoi du message"));
}

} // namespace
