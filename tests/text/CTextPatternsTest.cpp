#include "text/CText.h"
#include "text/Containers.h"

#include <gtest/gtest.h>

#include <functional>
#include <ostream>
#include <string>
#include <vector>

namespace {

constexpr int kNoResult = -99;
constexpr const char* kNoBuffer = nullptr;

std::string bytes(const CText& t) {
    return t.buffer() == nullptr ? "<no buffer>" : std::string(t.buffer(), t.length());
}

CText noBuffer() {
    return CText(static_cast<const char*>(nullptr));
}

CText textOf(const char* s) {
    return s == kNoBuffer ? noBuffer() : CText(s);
}

std::vector<std::string> items(const CList<CString256>& list) {
    std::vector<std::string> out;
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
        out.emplace_back(node->data.c_str());
    return out;
}

// One operation on a text: what the text, the out parameter (which starts as "stale") and the
// result are afterwards. Operations without a result answer kNoResult.
struct Row {
    const char* name;
    const char* text;
    std::function<int(CText& t, CText& out)> op;
    const char* wantText;
    const char* wantOut = "stale";
    int wantResult = kNoResult;
};

void PrintTo(const Row& row, std::ostream* os) {
    *os << row.name;
}

#define EDIT(statement)                                                                            \
    [](CText& t, [[maybe_unused]] CText& out) {                                                    \
        statement;                                                                                 \
        return kNoResult;                                                                          \
    }
#define RESULT(expression) [](CText& t, CText& out) { return expression; }

const Row kRows[] = {
    // Range primitives: positions outside the text are clamped into it.
    {"RemoveRangeClampsTheEnd", "abcdef", EDIT(t.remove_range(2, 100)), "ab"},
    {"RemoveRangeInvertedChangesNothing", "abcdef", EDIT(t.remove_range(3, 2)), "abcdef"},
    {"RemoveRangeClampsTheStart", "abcdef", EDIT(t.remove_range(-5, 1)), "cdef"},
    {"RemoveRangeWellBeyondTheEnd", "abcdef", EDIT(t.remove_range(10, 20)), "abcdef"},
    {"RemoveRangeBeforeTheStart", "abcdef", EDIT(t.remove_range(-3, -1)), "abcdef"},
    {"InsertAtTheStart", "yz", EDIT(t.insert_pattern(0, "x")), "xyz"},
    {"InsertBeyondTheEndAppends", "yz", EDIT(t.insert_pattern(99, "x")), "yzx"},
    {"InsertBeforeTheStartPrepends", "yz", EDIT(t.insert_pattern(-4, "x")), "xyz"},
    {"InsertEmptyOrNull", "yz", EDIT(t.insert_pattern(1, ""); t.insert_pattern(1, nullptr)), "yz"},
    {"ReplaceRange", "abcd", EDIT(t.replace_range(1, 2, "XY")), "aXYd"},
    {"ReplaceInvertedRangeOnlyInserts", "abcd", EDIT(t.replace_range(1, 0, "X")), "aXbcd"},
    {"ReplaceRangeByNull", "abcd", EDIT(t.replace_range(1, 2, nullptr)), "abcd"},
    {"ExtractBetweenClampsTheStart", "abcdef", EDIT(t.extract_between(-3, 1, out)), "abcdef", "ab"},
    {"ExtractBetweenClampsTheEnd", "abcdef", EDIT(t.extract_between(4, 99, out)), "abcdef", "ef"},
    {"ExtractBetweenInverted", "abcdef", EDIT(t.extract_between(3, 2, out)), "abcdef", ""},
    {"ExtractBetweenBeyondTheEnd", "abcdef", EDIT(t.extract_between(10, 12, out)), "abcdef"},

    // Extraction; out is emptied whatever happens.
    {"ExtractInner", "f(x)y", RESULT(t.extract_between_patterns(0, "(", ")", out)), "f(x)y", "x",
     1},
    {"ExtractEmptyInner", "f()", RESULT(t.extract_between_patterns("(", ")", out)), "f()", "", 1},
    {"ExtractWithoutClose", "f(x", RESULT(t.extract_between_patterns("(", ")", out)), "f(x", "", 0},
    {"ExtractIsCaseSensitive", "<A>b</a>", RESULT(t.extract_between_patterns("<a>", "</a>", out)),
     "<A>b</a>", "", 0},
    {"ExtractFromStart", "(a)(b)", RESULT(t.extract_between_patterns(1, "(", ")", out)), "(a)(b)",
     "b", 1},
    {"ExtractFromBeyondTheEnd", "(a)", RESULT(t.extract_between_patterns(99, "(", ")", out)), "(a)",
     "", 0},
    {"ExtractNocase", "<A>b</a>", RESULT(t.extract_between_patterns_nocase("<a>", "</A>", out)),
     "<A>b</a>", "b", 1},
    {"InclusiveCloseMayOverlapOpen", "<a href>",
     RESULT(t.extract_between_patterns_nocase_inclusive("<A", "a", out)), "<a href>", "<a", 1},
    {"InclusiveKeepsBothPatterns", "x<B>y</b>z",
     RESULT(t.extract_between_patterns_nocase_inclusive(0, "<b>", "</B>", out)), "x<B>y</b>z",
     "<B>y</b>", 1},
    {"InclusiveWithoutClose", "x<b>y",
     RESULT(t.extract_between_patterns_nocase_inclusive("<b>", "</b>", out)), "x<b>y", "", 0},

    // Extraction with an edit: the edit acts on the first match from the text's start.
    {"ExtractAndRemove", "x(c)y", RESULT(t.extract_and_remove_between_patterns("(", ")", out)),
     "xy", "c", 1},
    {"ExtractAndRemoveWithoutClose", "x(c",
     RESULT(t.extract_and_remove_between_patterns("(", ")", out)), "x(c", "", 0},
    {"ExtractAndRemoveSecondSearchFromTheStart", "(a)(b)",
     RESULT(t.extract_and_remove_between_patterns(1, "(", ")", out)), "(b)", "b", 1},
    {"ExtractAndRemoveNocaseComment", "x<!-- c -->y",
     RESULT(t.extract_and_remove_between_patterns_nocase(0, "<!--", "-->", out)), "xy", " c ", 1},
    {"ExtractAndRemoveNocaseSecondSearchFromTheStart", "[a][B]",
     RESULT(t.extract_and_remove_between_patterns_nocase(3, "[", "]", out)), "[B]", "B", 1},
    {"NotInclusiveKeepsThePatterns", "x[c]y",
     RESULT(t.extract_and_remove_between_patterns_nocase_not_inclusive("[", "]", out)), "x[]y", "c",
     1},
    {"NotInclusiveEmptiesTheFirstMatch", "[a][b]",
     RESULT(t.extract_and_remove_between_patterns_nocase_not_inclusive(1, "[", "]", out)), "[][b]",
     "b", 1},
    {"ExtractAndReplace", "x(c)y",
     RESULT(t.extract_and_replace_between_patterns("(", ")", "Z", out)), "xZy", "c", 1},
    {"ExtractAndReplaceByNullRemoves", "x(c)y",
     RESULT(t.extract_and_replace_between_patterns("(", ")", nullptr, out)), "xy", "c", 1},
    {"ExtractAndReplaceFirstSpanFromTheStart", "(a)(b)",
     RESULT(t.extract_and_replace_between_patterns(1, "(", ")", "Z", out)), "Z(b)", "b", 1},
    {"ExtractAndReplaceIsCaseSensitive", "(A)",
     RESULT(t.extract_and_replace_between_patterns("(a", ")", "Z", out)), "(A)", "", 0},

    // Removal and replacement between patterns.
    {"RemoveBetween", "a(bc)d(e)", EDIT(t.remove_between_patterns("(", ")")), "a()d(e)"},
    {"RemoveBetweenIsCaseSensitive", "<B>x</B>", EDIT(t.remove_between_patterns("<b>", "</B>")),
     "<B>x</B>"},
    {"RemoveBetweenNoCase", "<B>x</b>", EDIT(t.remove_between_patterns_no_case("<b>", "</B>")),
     "<B></b>"},
    {"RemoveInclusive", "a(bc)d(e)", EDIT(t.remove_between_patterns_inclusive("(", ")")), "ad(e)"},
    {"RemoveInclusiveNocase", "a<B>x</b>c",
     EDIT(t.remove_between_patterns_inclusive_nocase("<b>", "</B>")), "ac"},
    {"RemoveAllComments", "a<!--1-->b<!--2-->c",
     EDIT(t.remove_between_patterns_inclusive_all_nocase("<!--", "-->")), "abc"},
    {"RemoveAllStopsAtAnUnclosedOne", "a<!--1-->b<!--2c",
     EDIT(t.remove_between_patterns_inclusive_all_nocase("<!--", "-->")), "ab<!--2c"},
    {"RemoveAllSearchesAgainFromTheStart", "a<!<!---->--x-->b",
     EDIT(t.remove_between_patterns_inclusive_all_nocase("<!--", "-->")), "ab"},
    {"ReplaceInclusive", "a(b)c", EDIT(t.replace_between_patterns_inclusive("(", ")", "XY")),
     "aXYc"},
    {"ReplaceInclusiveByNullRemoves", "a(b)c",
     EDIT(t.replace_between_patterns_inclusive("(", ")", nullptr)), "ac"},
    {"ReplaceInclusiveIsCaseSensitive", "<b>x</b>",
     EDIT(t.replace_between_patterns_inclusive("<B>", "</b>", "N")), "<b>x</b>"},
    {"ReplaceInclusiveNocase", "a<B>x</b>c",
     EDIT(t.replace_between_patterns_inclusive_nocase("<b>", "</B>", "N")), "aNc"},
    {"ReplaceBetweenSkipsACloseRightAfterOpen", "[]a]",
     EDIT(t.replace_between_patterns_nocase("[", "]", "new")), "[new]"},
    {"ReplaceBetweenWithOnlyASkippedClose", "x[]",
     EDIT(t.replace_between_patterns_nocase("[", "]", "new")), "x[]"},
    {"ReplaceBetweenOffsetIsTheOpenLength", "<!---->X-->",
     EDIT(t.replace_between_patterns_nocase("<!--", "-->", "R")), "<!--R-->"},
    {"ReplaceBetweenIgnoresCase", "<B>old</b>",
     EDIT(t.replace_between_patterns_nocase("<b>", "</B>", "new")), "<B>new</b>"},
    {"RemoveAllWithinOuterPatterns", "<head><!--a-->t<!--b--></head><!--c-->",
     EDIT(t.remove_between_patterns_inclusive_all_nocase_between("<!--", "-->", "<head>",
                                                                 "</head>")),
     "<head>t</head><!--c-->"},
    {"RemoveAllWithinMissingOuterPatterns", "<!--a-->",
     EDIT(t.remove_between_patterns_inclusive_all_nocase_between("<!--", "-->", "<head>",
                                                                 "</head>")),
     "<!--a-->"},
    // The content is found case-sensitively but put back case-insensitively, with the offset.
    {"RemoveAllWithinPutsBackWithTheNocaseOffsetSearch", "<HEAD>x</HEAD><head><!--a-->y</head>",
     EDIT(t.remove_between_patterns_inclusive_all_nocase_between("<!--", "-->", "<head>",
                                                                 "</head>")),
     "<HEAD>y</head>"},

    // Pattern replacement.
    {"ReplacePattern", "a Body b", EDIT(t.replace_pattern_nocase("BODY", "x")), "a x b"},
    {"ReplacePatternFromStart", "ab ab", EDIT(t.replace_pattern_nocase(1, "AB", "X")), "ab X"},
    {"ReplaceAbsentPattern", "abc", EDIT(t.replace_pattern_nocase("zz", "X")), "abc"},
    {"ReplaceEmptyPattern", "abc", EDIT(t.replace_pattern_nocase("", "X")), "abc"},
    {"ReplacePatternByNull", "abc", EDIT(t.replace_pattern_nocase("b", nullptr)), "abc"},
    {"ReplaceTextPattern", "abc", EDIT(t.replace_pattern_nocase(CText("B"), CText("xy"))), "axyc"},
    {"ReplaceTextPatternOverItsLength", "abcd",
     EDIT(CText p; p.append("b\0z", 3); t.replace_pattern_nocase(0, p, CText("X"))), "aX"},
    {"ReplaceTextPatternWithoutBuffer", "abc",
     EDIT(t.replace_pattern_nocase(noBuffer(), CText("X"))), "abc"},
    {"ReplaceAll", "HREF Href", EDIT(t.replace_pattern_all_nocase("HREF", "href")), "href href"},
    {"ReplaceAllNeverRescansItsReplacement", "aa", EDIT(t.replace_pattern_all_nocase("a", "aa")),
     "aaaa"},
    {"ReplaceAllLeftToRightWithoutOverlap", "aaa", EDIT(t.replace_pattern_all_nocase("aa", "b")),
     "ba"},
    {"ReplaceAllByEmpty", "xaxA", EDIT(t.replace_pattern_all_nocase("a", "")), "xx"},
    {"ReplaceAllReplacementHoldsThePattern", "ab", EDIT(t.replace_pattern_all_nocase("A", "aA")),
     "aAb"},
    {"ReplaceAllEmptyPattern", "abc", EDIT(t.replace_pattern_all_nocase("", "x")), "abc"},

    // Empty or null patterns are absent.
    {"EmptyOpen", "x()", RESULT(t.extract_between_patterns("", ")", out)), "x()", "", 0},
    {"EmptyClose", "x()", RESULT(t.extract_and_remove_between_patterns_nocase("(", "", out)), "x()",
     "", 0},
    {"EmptyRemoveAll", "ab", EDIT(t.remove_between_patterns_inclusive_all_nocase("", "")), "ab"},
    {"NullOpen", "ab", EDIT(t.replace_between_patterns_nocase(nullptr, "b", "x")), "ab"},

    // A text with no buffer stays so.
    {"NoBufferExtract", kNoBuffer, RESULT(t.extract_between_patterns("(", ")", out)), kNoBuffer, "",
     0},
    {"NoBufferExtractAndRemove", kNoBuffer,
     RESULT(t.extract_and_remove_between_patterns_nocase("(", ")", out)), kNoBuffer, "", 0},
    {"NoBufferRemoveAll", kNoBuffer, EDIT(t.remove_between_patterns_inclusive_all_nocase("(", ")")),
     kNoBuffer},
    {"NoBufferRangeEdits", kNoBuffer,
     EDIT(t.remove_range(0, 5); t.insert_pattern(0, "x"); t.replace_range(0, 1, "y")), kNoBuffer},
    {"NoBufferExtractBetween", kNoBuffer, EDIT(t.extract_between(0, 1, out)), kNoBuffer},
};

class CTextPatterns : public ::testing::TestWithParam<Row> {};

TEST_P(CTextPatterns, Row) {
    const Row& row = GetParam();
    CText t = textOf(row.text);
    CText out("stale");
    EXPECT_EQ(row.op(t, out), row.wantResult);
    EXPECT_EQ(bytes(t), bytes(textOf(row.wantText)));
    EXPECT_EQ(bytes(out), row.wantOut);
    if (t.buffer() != nullptr) {
        EXPECT_LE(t.length(), t.capacity());
        EXPECT_EQ(t.buffer()[t.length()], '\0');
    }
}

INSTANTIATE_TEST_SUITE_P(Table, CTextPatterns, ::testing::ValuesIn(kRows),
                         [](const auto& row) { return std::string(row.param.name); });

TEST(CTextPatternsApi, ExtractBetweenReturnsATextTheCallerOwns) {
    const CText t("abcdef");
    EXPECT_EQ(bytes(*t.extract_between(1, 3)), "bcd");
    EXPECT_EQ(bytes(*t.extract_between(3, 2)), "");
    EXPECT_EQ(t.extract_between(10, 12)->buffer(), nullptr);
    EXPECT_EQ(noBuffer().extract_between(0, 1), nullptr);
    CText none = noBuffer();
    t.extract_between(0, 1, none);
    EXPECT_EQ(none.buffer(), nullptr);
}

TEST(CTextPatternsApi, PointerFormsAndGrowth) {
    CText t("abcdef");
    t.remove_range(t.buffer() + 1, t.buffer() + 2);
    t.insert_pattern(t.buffer() + 1, "XY");
    EXPECT_EQ(bytes(t), "aXYdef");

    CText full(std::string(31999, 'z').c_str());
    full.insert_pattern(5, "ab");
    EXPECT_EQ(full.capacity(), 64000);
    EXPECT_EQ(bytes(full), std::string(5, 'z') + "ab" + std::string(31994, 'z'));
}

TEST(CTextPatternsApi, ReplacementsMayComeFromTheTextItself) {
    CText t("abcd");
    t.replace_range(0, 0, t.buffer() + 2); // "cd", read before the removal moves it
    EXPECT_EQ(bytes(t), "cdbcd");
    CText full(std::string(31999, 'q').c_str());
    full.insert_pattern(0, full.buffer()); // the growth frees the source
    EXPECT_EQ(bytes(full), std::string(63998, 'q'));
    CText loop("xa");
    loop.replace_pattern_all_nocase("x", loop.buffer());
    EXPECT_EQ(bytes(loop), "xaa");
}

TEST(CTextPatternsApi, ReplaceAllGrowsByWholeBlocks) {
    CText t(std::string(3000, 'a').c_str(), 1000L);
    t.replace_pattern_all_nocase("A", "bb");
    EXPECT_EQ(bytes(t), std::string(6000, 'b'));
    EXPECT_EQ(t.capacity() % 1000, 0);
    EXPECT_GT(t.capacity(), t.length());
}

TEST(CTextPatternsApi, ExtractList) {
    CList<CString256> list;
    CText t("v[a,,b]w");
    t.extract_list("[", "]", list);
    EXPECT_EQ(bytes(t), "vw");
    EXPECT_EQ(items(list), (std::vector<std::string>{"a", "b"}));

    t.extract_list("[", "]", list); // not found: the list stays
    EXPECT_EQ(items(list), (std::vector<std::string>{"a", "b"}));
    t = ("[ a , b ," + std::string(300, 'L') + "]").c_str();
    t.extract_list("[", "]", list);
    ASSERT_EQ(list.count, 3);
    EXPECT_EQ(items(list)[0], " a ");
    EXPECT_EQ(items(list)[1], " b ");
    EXPECT_EQ(items(list)[2], std::string(255, 'L'));
    t = "x[]";
    t.extract_list("[", "]", list);
    EXPECT_EQ(list.count, 0);
}

TEST(CTextPatternsApi, ExtractIntoAFixedStringCutsAt255) {
    CText t(("a{" + std::string(300, 'z') + "}b").c_str());
    CString256 out("stale");
    EXPECT_EQ(t.extract_and_remove_between_patterns_nocase("{", "}", out), 1);
    EXPECT_EQ(out.length(), 255);
    EXPECT_EQ(bytes(t), "ab");
    EXPECT_EQ(t.extract_and_remove_between_patterns_nocase("{", "}", out), 0);
    EXPECT_STREQ(out.c_str(), "");
}

} // namespace
