#include "util/TextUtilities.h"

#include "text/CString256.h"

#include <QDateTime>
#include <QStringList>
#include <QTimeZone>
#include <gtest/gtest.h>

#include <climits>
#include <memory>
#include <string>

namespace {

std::string bounded(short max, long value) {
    char out[64];
    std::memset(out, 'Z', sizeof out);
    itoa(out, max, value);
    return out;
}

TEST(TextUtilities, ReverseInPlace) {
    char odd[] = "abc";
    reverse(odd);
    EXPECT_STREQ(odd, "cba");
    char even[] = "abcd";
    reverse(even);
    EXPECT_STREQ(even, "dcba");
    char empty[] = "";
    reverse(empty);
    EXPECT_STREQ(empty, "");
    reverse(nullptr);
}

TEST(TextUtilities, BoundedItoaKeepsTheLeastSignificantDigits) {
    struct Row {
        const char* name;
        short max;
        long value;
        const char* expected;
    };
    const Row rows[] = {
        {"whole", 32, 123456789, "123456789"},
        {"negative", 32, -12, "-12"},
        {"zero", 2, 0, "0"},
        {"cut", 3, 12345, "45"},
        {"cut negative", 3, -12345, "-45"},
        {"max one positive", 1, 7, ""},
        {"max one negative", 1, -7, "-"},
        {"max zero", 0, 5, ""},
        {"max negative", -4, -5, "-"},
        {"long max", 32, LONG_MAX, "9223372036854775807"},
        {"long min", 32, LONG_MIN, "-9223372036854775808"},
    };
    for (const Row& row : rows)
        EXPECT_EQ(bounded(row.max, row.value), row.expected) << row.name;
}

TEST(TextUtilities, AllocatingItoa) {
    std::unique_ptr<char[]> a(itoa(0UL));
    EXPECT_STREQ(a.get(), "0");
    std::unique_ptr<char[]> b(itoa(ULONG_MAX));
    EXPECT_STREQ(b.get(), "18446744073709551615");
    std::unique_ptr<char[]> c(itoa(-905L));
    EXPECT_STREQ(c.get(), "-905");
    std::unique_ptr<char[]> d(itoa(static_cast<short>(-32768)));
    EXPECT_STREQ(d.get(), "-32768");
    std::unique_ptr<char[]> e(itoa(LONG_MIN));
    EXPECT_STREQ(e.get(), "-9223372036854775808");
}

TEST(TextUtilities, CharacterClassesPartitionTheBytes) {
    // Every byte belongs to at most one class, and the classes have exactly their sizes.
    bool (*const classes[])(unsigned char) = {isHiAlpha, isLoAlpha,  isDig,         isSafe,
                                              isExtra,   isReserved, isPunctuation, isNational};
    const int sizes[] = {26, 26, 10, 5, 6, 7, 5, 9};
    int counted[8] = {};
    int needing = 0;
    for (int b = 0; b < 256; ++b) {
        int memberships = 0;
        for (int k = 0; k < 8; ++k) {
            if (classes[k](static_cast<unsigned char>(b))) {
                ++memberships;
                ++counted[k];
            }
        }
        EXPECT_LE(memberships, 1) << b;
        EXPECT_EQ(NeedsURLEncoding(static_cast<unsigned char>(b)), memberships == 0) << b;
        needing += memberships == 0;
    }
    for (int k = 0; k < 8; ++k)
        EXPECT_EQ(counted[k], sizes[k]) << k;
    EXPECT_EQ(needing, 256 - 94); // space, 32 controls, DEL and the 128 high bytes
    EXPECT_TRUE(isHiorLoAlpha('q'));
    EXPECT_TRUE(isHiorLoAlpha('Q'));
    EXPECT_FALSE(isHiorLoAlpha('@'));
    EXPECT_FALSE(isHiorLoAlpha('['));
    EXPECT_FALSE(isLoAlpha(static_cast<unsigned char>('a' + 128)));
}

TEST(TextUtilities, UrlEscapes) {
    EXPECT_TRUE(NeedsURLEncoding(' '));
    EXPECT_FALSE(NeedsURLEncoding('~'));
    EXPECT_FALSE(NeedsURLEncoding('%'));
    EXPECT_TRUE(NeedsURLEncoding(0x7f));

    char out[4];
    URLencode(out, ' ');
    EXPECT_STREQ(out, "%20");
    URLencode(out, 10);
    EXPECT_STREQ(out, "%0a");
    URLencode(out, 233);
    EXPECT_STREQ(out, "%e9");
    URLencode(out, 0);
    EXPECT_STREQ(out, "%00");
    URLencode(out, '/');
    EXPECT_STREQ(out, "/");

    URLSafeEncode(out, '/');
    EXPECT_STREQ(out, "%2f");
    URLSafeEncode(out, '&');
    EXPECT_STREQ(out, "&");
    URLSafeEncode(out, '~');
    EXPECT_STREQ(out, "%7e");
    URLSafeEncode(out, '+');
    EXPECT_STREQ(out, "+");
    URLSafeEncode(out, 'Z');
    EXPECT_STREQ(out, "Z");
    URLSafeEncode(out, '=');
    EXPECT_STREQ(out, "%3d");
}

TEST(TextUtilities, ElapsedTimeMessageAppendsWithATrailingSpace) {
    struct Row {
        const char* name;
        uint32_t seconds;
        const char* expected;
    };
    const Row rows[] = {
        {"two hours", 7200, "took 2 hrs "},
        {"a minute", 60, "took 1 min "},
        {"one of each", 3661, "took 1 hr 1 min 1 sec "},
        {"plural secs", 59, "took 59 secs "},
        {"zero replaces", 0, "0 secs"},
        {"mixed", 2 * 3600 + 5, "took 2 hrs 5 secs "},
        {"largest", UINT32_MAX, "took 1193046 hrs 28 mins 15 secs "},
    };
    for (const Row& row : rows) {
        CString256 text("took ");
        ElapsedTimeMessage(row.seconds, text);
        EXPECT_STREQ(text.c_str(), row.expected) << row.name;
    }
}

TEST(TextUtilities, MoveArrayItem) {
    const QStringList start = {"a", "b", "c", "d"};
    QStringList list = start;
    EXPECT_EQ(MoveArrayItem(list, 0, 2), 0);
    EXPECT_EQ(list, (QStringList{"b", "c", "a", "d"}));
    list = start;
    MoveArrayItem(list, 3, 0);
    EXPECT_EQ(list, (QStringList{"d", "a", "b", "c"}));
    for (auto [from, to] : {std::pair{1, 1}, {-1, 2}, {0, 4}, {4, 0}, {2, -1}}) {
        list = start;
        EXPECT_EQ(MoveArrayItem(list, from, to), 0);
        EXPECT_EQ(list, start) << from << "->" << to;
    }
    QList<int> numbers = {1, 2, 3};
    MoveArrayItem(numbers, 2, 1);
    EXPECT_EQ(numbers, (QList<int>{1, 3, 2}));
}

TEST(TextUtilities, MimeTypeForPathAsksTheMimeDatabaseByExtension) {
    struct Row {
        const char* name;
        const char* path;
        const char* expected; // null: no type
    };
    const Row rows[] = {
        {"pdf", "/home/ada/Documents/report.pdf", "application/pdf"},
        {"upper-case extension", "/tmp/PHOTO.JPG", "image/jpeg"},
        {"relative path", "notes.txt", "text/plain"},
        {"double extension", "/tmp/backup.tar.gz", "application/x-compressed-tar"},
        {"no extension, though the database knows the name", "/src/Makefile", nullptr},
        {"dot only in a folder name", "/tmp/v1.2/README", nullptr},
        {"hidden file", "/home/ada/.profile", nullptr},
        {"trailing dot", "/tmp/report.", nullptr},
        {"unknown extension", "/tmp/data.zzqx", nullptr},
        {"folder path", "/tmp/folder.d/", nullptr},
        {"empty", "", nullptr},
    };
    for (const Row& row : rows) {
        const QString type = MimeTypeForPath(QString::fromUtf8(row.path));
        if (row.expected == nullptr) {
            EXPECT_TRUE(type.isNull()) << row.name << ": " << type.toStdString();
        } else {
            EXPECT_EQ(type.toStdString(), row.expected) << row.name;
        }
    }
}

} // namespace

TEST(DateDescription, DateTimeAndNumericOffset) {
    const QDate day(2024, 5, 1);
    const QTime time(14, 3, 22);
    EXPECT_EQ(DateDescription(QDateTime(day, time, QTimeZone(7200))),
              QStringLiteral("2024-05-01 14:03:22 +0200"));
    EXPECT_EQ(DateDescription(QDateTime(day, time, QTimeZone(-19800))),
              QStringLiteral("2024-05-01 14:03:22 -0530"));
    EXPECT_EQ(DateDescription(QDateTime(day, time, QTimeZone::utc())),
              QStringLiteral("2024-05-01 14:03:22 +0000"));
}
