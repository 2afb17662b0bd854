#include "text/CString256.h"
#include "text/Containers.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

std::string repeat(char c, int n) {
    return std::string(static_cast<size_t>(n), c);
}

TEST(CString256, AssignmentTruncatesAt255AndTreatsNullAsEmpty) {
    const std::string long300 = repeat('a', 299) + "Z";
    CString256 s(long300.c_str());
    EXPECT_EQ(s.length(), 255);
    EXPECT_EQ(std::string(s.c_str()), long300.substr(0, 255));

    s = static_cast<const char*>(nullptr);
    EXPECT_STREQ(s.c_str(), "");
    CString256 fromNull(static_cast<const char*>(nullptr));
    EXPECT_STREQ(fromNull.c_str(), "");

    CString256 copy(s = "copied");
    EXPECT_STREQ(copy.c_str(), "copied");

    // Assigning a string its own tail must not read what it has just overwritten.
    s = "abcdef";
    s = s.c_str() + 2;
    EXPECT_STREQ(s.c_str(), "cdef");
}

TEST(CString256, PascalStringsAndSizedBlocks) {
    const unsigned char pascal[] = {3, 'a', 'b', 'c', 'X'};
    EXPECT_STREQ(CString256(pascal).c_str(), "abc");
    CString256 s("x:");
    s += pascal;
    EXPECT_STREQ(s.c_str(), "x:abc");

    // A block keeps its NULs: the text reads up to the first, the terminator follows the copy.
    QByteArray block("ab\0cd", 5);
    s = block;
    EXPECT_STREQ(s.c_str(), "ab");
    EXPECT_EQ(s[3], 'c');
    EXPECT_EQ(s[5], '\0');

    s = QByteArray(400, 'q');
    EXPECT_EQ(s.length(), 255);
}

TEST(CString256, QStringConversionIsLatin1AndKeepsTheLimit) {
    CString256 s;
    s = QString::fromUtf8("caf\u00e9 \u20ac1");
    EXPECT_STREQ(s.c_str(), "caf\xe9 1"); // the euro sign has no Latin-1 byte
    EXPECT_EQ(s.MakeQString(), QString::fromUtf8("caf\u00e9 1"));
    s = QString(300, QLatin1Char('w'));
    EXPECT_EQ(s.length(), 255);
    s = "ab";
    s += QString::fromUtf8("\u00fc");
    EXPECT_STREQ(s.c_str(), "ab\xfc");
}

TEST(CString256, NumbersUseTheLowThirtyTwoBitsForUnsignedLongLong) {
    CString256 s;
    s = -42L;
    EXPECT_STREQ(s.c_str(), "-42");
    s = 0L;
    EXPECT_STREQ(s.c_str(), "0");
    s = 9223372036854775807L;
    EXPECT_STREQ(s.c_str(), "9223372036854775807");
    s = (1ULL << 32) + 1;
    EXPECT_STREQ(s.c_str(), "1");
    s = 2147483648ULL;
    EXPECT_STREQ(s.c_str(), "-2147483648");
    s = 4294967295ULL;
    EXPECT_STREQ(s.c_str(), "-1");
    s = "n=";
    s += 1234L;
    EXPECT_STREQ(s.c_str(), "n=1234");
}

TEST(CString256, StringAppendFillsTo255ButOneCharacterStopsAt254) {
    CString256 s(repeat('b', 254).c_str());
    s += "xyz";
    EXPECT_EQ(s.length(), 255);
    EXPECT_EQ(s[254], 'x');

    CString256 c254(repeat('c', 254).c_str());
    c254 += 'x';
    EXPECT_EQ(c254.length(), 254);
    EXPECT_EQ(c254[253], 'c');

    CString256 c253(repeat('c', 253).c_str());
    c253 += 'x';
    EXPECT_EQ(c253.length(), 254);
    EXPECT_EQ(c253[253], 'x');

    CString256 full(repeat('f', 255).c_str());
    full += 'x';
    full += "more";
    EXPECT_EQ(full.length(), 255);
    EXPECT_EQ(full[254], 'f');

    CString256 n("a");
    n += static_cast<const char*>(nullptr);
    n += CString256("b");
    n += n; // appending itself
    EXPECT_STREQ(n.c_str(), "abab");
}

TEST(CString256, IndexingCutsAndLowering) {
    CString256 s("Hello WORLD");
    s[5] = 0;
    EXPECT_STREQ(s.c_str(), "Hello");
    s = "MiXeD\xC9";
    s.to_lower();
    EXPECT_STREQ(s.c_str(), "mixed\xC9"); // bytes above 127 are left to the C locale: unchanged
}

TEST(CString256, PrintToBufferAndDescriptor) {
    char buffer[64] = "head:";
    CString256 s("line");
    EXPECT_EQ(s.print(buffer), 9);
    EXPECT_STREQ(buffer, "head:line\n");

    int fds[2];
    ASSERT_EQ(pipe(fds), 0);
    EXPECT_EQ(s.print(fds[1]), 0);
    char got[16] = {};
    EXPECT_EQ(read(fds[0], got, sizeof got), 5);
    EXPECT_STREQ(got, "line\n");
    close(fds[0]);
    close(fds[1]);
    EXPECT_EQ(s.print(fds[1]), -1); // closed descriptor
}

TEST(CString256, PrefixAndSuffixTests) {
    CString256 s("a.html");
    EXPECT_EQ(s.endsWith(".HTML", 1), 1);
    EXPECT_EQ(s.endsWith(".HTML", 0), 0);
    EXPECT_EQ(s.endsWith(".html", 0), 1);
    EXPECT_EQ(CString256("ml").endsWith(".html", 1), 0);
    EXPECT_EQ(s.endsWith("", 0), 1);
    EXPECT_EQ(s.beginsWith("", 1), 1);
    EXPECT_EQ(s.beginsWith("A.", 1), 1);
    EXPECT_EQ(s.beginsWith("A.", 0), 0);
    const CString256 prefix("a.h");
    EXPECT_EQ(s.beginsWith(&prefix, 0), 1);
    EXPECT_EQ(s.beginsWith_nocase(CString256("A.HT")), 1);
    EXPECT_EQ(s.endsWith_nocase(CString256("TML")), 1);
    EXPECT_EQ(s.endsWith_nocase("x.html"), 0);
    EXPECT_EQ(CString256("ab").beginsWith("abc", 0), 0);
}

TEST(CString256, CaseInsensitiveSearchAndCompare) {
    const char* hay = "Hello World";
    EXPECT_EQ(STRSTR(hay, "WORLD"), hay + 6);
    EXPECT_EQ(STRSTR(hay, "worlds"), nullptr);
    EXPECT_EQ(STRSTR(hay, "h"), hay);
    const char* abc = "abc";
    // An empty needle answers one byte before the haystack, by contract.
    EXPECT_EQ(STRSTR(abc, "") - abc, -1);
    EXPECT_EQ(STRSTR("", "a"), nullptr);

    EXPECT_EQ(STRNCMP("abc", "ABD", 2), 0);
    EXPECT_GT(STRNCMP("abc", "ABD", 3), 0); // raw 'c' - 'D', not folded 'C' - 'D'
    EXPECT_EQ(STRNCMP("abc", "ABD", 3), 'c' - 'D');
    EXPECT_EQ(STRNCMP("ab", "AB", 10), 0); // both end together before n
    EXPECT_LT(STRNCMP("ab", "abc", 3), 0);
    EXPECT_EQ(STRNCMP("x", "y", 0), 0);
}

TEST(CString256, ListHelpers) {
    CList<CString256> list;
    CString256 s("stale");
    s.flatten_list(',', list);
    EXPECT_STREQ(s.c_str(), "");

    for (const char* item : {"a", "b", "c"})
        list.append(CString256(item));
    s.flatten_list(',', list);
    EXPECT_STREQ(s.c_str(), "a,b,c");

    // A long list is cut at 255, or 254 where the cut falls on a separator.
    CList<CString256> longList;
    longList.append(CString256(repeat('x', 254).c_str()));
    longList.append(CString256("y"));
    s.flatten_list(';', longList);
    EXPECT_EQ(s.length(), 255);
    EXPECT_EQ(s[254], 'y');

    CString256 csv("a,,b,");
    csv.parse_into_list(",", list);
    ASSERT_EQ(list.count, 2);
    EXPECT_STREQ(list.first->data.c_str(), "a");
    EXPECT_STREQ(list.last->data.c_str(), "b");
    EXPECT_STREQ(csv.c_str(), "a,,b,"); // the text itself is untouched

    CString256(" / x;y ").parse_into_list(" /;", list);
    ASSERT_EQ(list.count, 2);
    EXPECT_STREQ(list.first->data.c_str(), "x");
}

TEST(CString256, ChangeSuffixAndFilter) {
    struct Row {
        const char* name;
        const char* before;
        const char* after;
    };
    for (const Row& row :
         {Row{"html", "index.html", "index.htm"}, Row{"none", "README", "README.htm"},
          Row{"several", "a.b.c", "a.b.htm"}, Row{"dot", ".", ".htm"}}) {
        CString256 s(row.before);
        s.change_suffix("htm");
        EXPECT_STREQ(s.c_str(), row.after) << row.name;
    }
    CString256 f("a b\tc\r\n-d\x01!");
    f.filter_to_alnum_or_punct();
    EXPECT_STREQ(f.c_str(), "abc-d!");
}

TEST(CString256, ScoredMatchers) {
    float score = -1;
    const CString256 abc("abc");
    abc.match_case_exact(CString256("abc"), &score);
    EXPECT_EQ(score, 1.0f);
    abc.match_case_exact(CString256("ABC"), &score);
    EXPECT_EQ(score, 0.0f);
    abc.match_nocase_exact(CString256("ABC"), &score);
    EXPECT_EQ(score, 1.0f);
    CString256().match_case_exact(CString256(), &score);
    EXPECT_EQ(score, 0.0f); // two empty texts do not match
    CString256().match_nocase_exact(CString256(), &score);
    EXPECT_EQ(score, 0.0f);

    abc.match_case_partial(CString256("bc"), &score);
    EXPECT_EQ(score, 1.0f);
    abc.match_case_partial(CString256("BC"), &score);
    EXPECT_EQ(score, 0.0f);
    abc.match_nocase_partial(CString256("BC"), &score);
    EXPECT_EQ(score, 1.0f);
    abc.match_case_partial(CString256(), &score);
    EXPECT_EQ(score, 0.0f);

    abc.match_case_approximate(CString256("abc"), &score);
    EXPECT_FLOAT_EQ(score, 1.0f);
    abc.match_case_approximate(CString256("xyz"), &score);
    EXPECT_FLOAT_EQ(score, 0.0f);
    CString256("abcd").match_case_approximate(CString256("ad"), &score);
    EXPECT_NEAR(score, 0.667f, 0.001f);
    CString256("abcd").match_case_approximate(CString256("AD"), &score);
    EXPECT_FLOAT_EQ(score, 0.0f); // no letter matches: 1 - (4 + 2) / 6
    CString256("abcd").match_nocase_approximate(CString256("AD"), &score);
    EXPECT_NEAR(score, 0.667f, 0.001f);
    // Characters are found in order only: 'da' finds 'd' then nothing after it.
    CString256("abcd").match_case_approximate(CString256("da"), &score);
    EXPECT_FLOAT_EQ(score, 1.0f - (3.0f + 1.0f) / 6.0f);
    CString256().match_case_approximate(CString256(), &score);
    EXPECT_TRUE(std::isnan(score));
}

TEST(CString256, WildcardPiecesMatchInOrderWithoutOverlap) {
    CList<CString256> pieces;
    float score = -1;
    const CString256 name("report-2024.final.PDF");
    name.match_wildcard_case(pieces, &score);
    EXPECT_EQ(score, 1.0f); // no pieces: everything matches

    pieces.append(CString256("report"));
    pieces.append(CString256(".pdf"));
    name.match_wildcard_case(pieces, &score);
    EXPECT_EQ(score, 0.0f);
    name.match_wildcard_nocase(pieces, &score);
    EXPECT_EQ(score, 1.0f);

    CList<CString256> reversed;
    reversed.append(CString256("final"));
    reversed.append(CString256("report"));
    name.match_wildcard_nocase(reversed, &score);
    EXPECT_EQ(score, 0.0f);

    CList<CString256> overlapping; // the second "aba" may not reuse the first one's last byte
    overlapping.append(CString256("aba"));
    overlapping.append(CString256("aba"));
    CString256("ababa").match_wildcard_case(overlapping, &score);
    EXPECT_EQ(score, 0.0f);
    CString256("abaaba").match_wildcard_case(overlapping, &score);
    EXPECT_EQ(score, 1.0f);
}

TEST(CString256, MatchDispatchesThroughTheAdapters) {
    CString256 subject("Index.HTML");
    float score = -1;
    char other[] = "index.html";
    subject.match(matcher_case_exact_256, other, &score);
    EXPECT_EQ(score, 0.0f);
    subject.match(matcher_nocase_exact_256, other, &score);
    EXPECT_EQ(score, 1.0f);
    char part[] = "HTML";
    subject.match(matcher_case_partial_256, part, &score);
    EXPECT_EQ(score, 1.0f);
    char lowerPart[] = "html";
    subject.match(matcher_case_partial_256, lowerPart, &score);
    EXPECT_EQ(score, 0.0f);
    subject.match(matcher_nocase_partial_256, lowerPart, &score);
    EXPECT_EQ(score, 1.0f);
    subject.match(matcher_case_approximate_256, other, &score);
    EXPECT_LT(score, 1.0f);
    subject.match(matcher_nocase_approximate_256, other, &score);
    EXPECT_FLOAT_EQ(score, 1.0f);

    CList<CString256> pieces;
    pieces.append(CString256("index"));
    subject.match(match_wildcard_case_256, &pieces, &score);
    EXPECT_EQ(score, 0.0f);
    subject.match(match_wildcard_nocase_256, &pieces, &score);
    EXPECT_EQ(score, 1.0f);
}

TEST(CString256, HeapObjectsComeFromBlocksOf256ThatAreReused) {
    using Pool = CPool<CString256>;
    // Use up whatever earlier tests left on the free list, so the next allocation opens a block.
    std::vector<CString256*> held;
    while (Pool::free_count() > 0)
        held.push_back(new CString256("held"));
    const size_t blocksBefore = Pool::blocks();

    auto* first = new CString256("first");
    EXPECT_EQ(Pool::blocks(), blocksBefore + 1);
    EXPECT_EQ(Pool::free_count(), 255u);
    auto* second = new CString256("second");
    // The block's last object is handed out right after its first one.
    EXPECT_EQ(reinterpret_cast<char*>(second) - reinterpret_cast<char*>(first),
              static_cast<std::ptrdiff_t>(255 * sizeof(CString256)));

    std::vector<CString256*> rest;
    for (int i = 0; i < 254; ++i)
        rest.push_back(new CString256("rest"));
    EXPECT_EQ(Pool::blocks(), blocksBefore + 1);
    EXPECT_EQ(Pool::free_count(), 0u);
    auto* opener = new CString256("257th");
    EXPECT_EQ(Pool::blocks(), blocksBefore + 2); // the 257th allocation opens a second block

    delete second;
    auto* again = new CString256("again");
    EXPECT_EQ(again, second); // a freed object is the next one handed out
    EXPECT_STREQ(again->c_str(), "again");

    delete again;
    delete opener;
    delete first;
    for (CString256* s : rest)
        delete s;
    for (CString256* s : held)
        delete s;
    EXPECT_EQ(Pool::blocks(), blocksBefore + 2); // nothing goes back to the system
}

} // namespace
