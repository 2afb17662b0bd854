#include "text/CText.h"
#include "text/Containers.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <climits>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

// An int is neither a character nor a number to CText: it must not quietly pick one.
template <class T>
concept AppendsInt = requires(T& t) {
    t += 5;
};
template <class T>
concept AssignsInt = requires(T& t) {
    t = 5;
};
static_assert(!AppendsInt<CText> && !AssignsInt<CText>);
static_assert(requires(CText & t) {
    t += 5L;
    t += 5LL;
    t += 'c';
    t.append_named_value("n", 3);
    t.insert_pattern(0, "x");
    t.remove_range(0, 0);
});
// A string is text, never a file name; and no C string turns into a CText unasked.
static_assert(!std::is_constructible_v<CText, std::string>);
static_assert(!std::is_convertible_v<const char*, CText>);

std::string bytes(const CText& t) {
    return t.buffer() == nullptr ? "<no buffer>" : std::string(t.buffer(), t.length());
}

void expectSound(const CText& t) {
    if (t.buffer() == nullptr) {
        EXPECT_EQ(t.length(), 0);
        EXPECT_EQ(t.capacity(), 0);
        return;
    }
    EXPECT_LE(t.length(), t.capacity());
    EXPECT_EQ(t.buffer()[t.length()], '\0');
}

CText noBuffer() {
    return CText(static_cast<const char*>(nullptr));
}

TEST(CText, CapacityIsTheSmallestMultipleOfTheBlockAboveTheLength) {
    CText empty;
    EXPECT_EQ(bytes(empty), "");
    EXPECT_EQ(empty.capacity(), 32000);
    EXPECT_EQ(empty.block(), 32000);
    EXPECT_EQ(CText(std::string(31999, 'a').c_str()).capacity(), 32000);
    EXPECT_EQ(CText(std::string(32000, 'a').c_str()).capacity(), 64000);
    const CText small(std::string(10, 'x').c_str(), 10L);
    EXPECT_EQ(small.capacity(), 20);
    EXPECT_EQ(small.block(), 10);
    EXPECT_EQ(CText("abc", -4L).block(), 32000);
}

TEST(CText, NoBufferIsADistinctStateThatAppendsIgnore) {
    CText t = noBuffer();
    EXPECT_EQ(t.buffer(), nullptr);
    t += "x";
    t += CText("y");
    t.append("z", 1);
    t -= "w";
    t.append_named_value("n", 1);
    EXPECT_EQ(t.buffer(), nullptr);
    EXPECT_EQ(t.resize_by(10), 0);
    EXPECT_EQ(t.find_pattern(""), -1);
    EXPECT_EQ(t.beginsWith_nocase(""), 0);
    t += 'x'; // the one append that revives it
    EXPECT_EQ(bytes(t), "x");
    expectSound(t);

    t = "kept";
    t = noBuffer(); // ignored, not a clear
    EXPECT_EQ(bytes(t), "kept");
    CText none = noBuffer();
    none = t;
    EXPECT_EQ(none.buffer(), nullptr);
    none = static_cast<const char*>(nullptr);
    EXPECT_EQ(bytes(none), "");
    none.init_from_chars(nullptr);
    EXPECT_EQ(none.buffer(), nullptr);
}

TEST(CText, RangeConstructorIsInclusiveAndStopsAtANul) {
    const char s[] = "ab\0cd";
    EXPECT_EQ(bytes(CText(s + 1, s + 1)), "b");
    EXPECT_EQ(bytes(CText(s, s + 4)), "ab");
    EXPECT_EQ(CText(s + 2, s + 1).buffer(), nullptr);
}

TEST(CText, CopiesCarryLabelCapacityAndBlock) {
    CText t(std::string(40, 'q').c_str(), 16L);
    t.set_label(CString256("page"));
    const CText copy(t);
    EXPECT_EQ(bytes(copy), bytes(t));
    EXPECT_EQ(copy.capacity(), 48);
    EXPECT_EQ(copy.block(), 16);
    EXPECT_STREQ(copy.label().c_str(), "page");
    t = "other"; // a text assigned from chars loses its label
    EXPECT_STREQ(t.label().c_str(), "");

    const CText none = noBuffer();
    CText ofNothing(none);
    EXPECT_EQ(bytes(ofNothing), "");
    EXPECT_EQ(ofNothing.capacity(), 0);
    ofNothing += "grows";
    EXPECT_EQ(bytes(ofNothing), "grows");
    expectSound(ofNothing);
}

TEST(CText, AssignsCharactersNumbersAndItsOwnTail) {
    CText t;
    t = 'x';
    EXPECT_EQ(bytes(t), "x");
    t = '\0';
    EXPECT_EQ(bytes(t), "");
    EXPECT_EQ(bytes(CText(-12L)), "-12");
    EXPECT_EQ(bytes(CText(LLONG_MIN)), "-9223372036854775808");
    t = 0L;
    EXPECT_EQ(bytes(t), "0");
    t = "abcdef";
    t = t.buffer() + 2;
    EXPECT_EQ(bytes(t), "cdef");
    const CText& same = t;
    t = same;
    EXPECT_EQ(bytes(t), "cdef");
}

TEST(CText, QStringsConvertThroughLatin1OrNotAtAll) {
    CText t("before");
    t = QString::fromUtf8("caf\u00e9");
    EXPECT_EQ(bytes(t), "caf\xe9");
    t = QString::fromUtf8("\u20ac5");
    EXPECT_EQ(bytes(t), "caf\xe9");
    t = QString();
    EXPECT_EQ(bytes(t), "caf\xe9");
    t += QString::fromUtf8("\u00fc");
    t += QString::fromUtf8("\u20ac");
    EXPECT_EQ(bytes(t), "caf\xe9\xfc");
    t = QByteArray("ab\0cd", 5);
    EXPECT_EQ(bytes(t), "ab");
}

TEST(CText, ResizeAddsWholeBlocks) {
    CText t("keep");
    EXPECT_EQ(t.resize_by(0), 64000);
    EXPECT_EQ(t.resize_by(32000), 128000);
    EXPECT_EQ(t.resize_by(-70000), 160000);
    EXPECT_EQ(bytes(t), "keep");
}

TEST(CText, EachAppendKindGrowsByItsOwnRule) {
    CText t;
    t += 'a';
    EXPECT_EQ(t.length(), 1);
    EXPECT_EQ(t.capacity(), 32000);
    t.append(std::string(32000, 'b').data(), 32000);
    EXPECT_EQ(t.capacity(), 64000);
    EXPECT_EQ(t.length(), 32001);

    // 31999 bytes fit a fresh text through operator+=, but append() keeps one byte more free.
    const std::string fill(31999, 'c');
    CText byOperator;
    byOperator += fill.c_str();
    EXPECT_EQ(byOperator.capacity(), 32000);
    CText byAppend;
    byAppend.append(fill.data(), 31999);
    EXPECT_EQ(byAppend.capacity(), 64000);

    CText chars(std::string(31998, 'd').c_str());
    chars += 'e';
    EXPECT_EQ(chars.capacity(), 32000);
    chars += 'f';
    EXPECT_EQ(chars.capacity(), 64000);
    EXPECT_EQ(bytes(chars), std::string(31998, 'd') + "ef");
}

TEST(CText, AppendsKeepNulsNumbersAndItsOwnBytes) {
    CText t;
    t.append("a\0b", 3);
    EXPECT_EQ(bytes(t), std::string("a\0b", 3));
    t += 42L;
    t += -7LL;
    t += CString256("!");
    EXPECT_EQ(bytes(t), std::string("a\0b42-7!", 8));

    CText twice(std::string(20000, 'x').c_str());
    twice += twice; // the source is freed by the growth
    EXPECT_EQ(bytes(twice), std::string(40000, 'x'));
    twice.append(twice.buffer(), 30000);
    EXPECT_EQ(twice.length(), 70000);
    expectSound(twice);
}

TEST(CText, PrependMovesTheTextRight) {
    CText t("cd");
    t -= "ab";
    EXPECT_EQ(bytes(t), "abcd");
    t -= t.buffer() + 2;
    EXPECT_EQ(bytes(t), "cdabcd");
    CText full(std::string(31999, 'z').c_str());
    full -= "ab";
    EXPECT_EQ(full.capacity(), 64000);
    EXPECT_EQ(bytes(full), "ab" + std::string(31999, 'z'));
}

TEST(CText, ReportLines) {
    CList<CString256> list;
    CText t;
    t.pretty_append_named_list("Empty", list);
    list.append(CString256("a\tb"));
    list.append(CString256("c"));
    t.pretty_append_named_value("Name", CText("v"));
    t.pretty_append_named_value("Id", CString256("x"));
    t.pretty_append_named_value("Num", -5L);
    t.pretty_append_named_list("List", list);
    EXPECT_EQ(bytes(t), "\t\tEmpty : \r\r\t\tName : v\r\r\t\tId : x\r\r\t\tNum : -5\r\r"
                        "\t\tList : a\tb,c\r\r");
    t = "";
    t.append_named_value("Count", 3);
    t.append_named_value("Text", CText("w"));
    t.append_named_value("Id", CString256("y"));
    t.append_named_list("delimiterList", list);
    EXPECT_EQ(bytes(t), "Count 3\xE2\x80\xA2\rText w\xE2\x80\xA2\rId y\xE2\x80\xA2\r"
                        "delimiterList a\tb,c\xE2\x80\xA2\r");
}

TEST(CText, InPlaceEdits) {
    CText t;
    t.append("A\0b\0", 4);
    t.replace_nil_chars_by_space();
    EXPECT_EQ(bytes(t), "A b ");
    t.to_lower();
    t.reverse();
    EXPECT_EQ(bytes(t), " b a");
    t.reverse_text();
    EXPECT_EQ(bytes(t), "a b ");

    char s[] = "abcdef";
    CText::reverse(s, 3);
    EXPECT_STREQ(s, "cbadef");
    CText::reverse(nullptr, 3);

    char out[40];
    CText::itoa(out, 31, -12L);
    EXPECT_STREQ(out, "-12");
    CText::itoa(out, 31, 0LL);
    EXPECT_STREQ(out, "0");
    CText::itoa(out, 3, 12345L); // two digits, the least significant
    EXPECT_STREQ(out, "45");
}

TEST(CText, FindPatternClampsItsStartAndTreatsEmptyPatternsByCase) {
    const CText t("a body, A BODY");
    EXPECT_EQ(t.find_pattern(0, ""), 0);
    EXPECT_EQ(t.find_pattern_nocase(0, ""), -1);
    EXPECT_EQ(t.find_pattern_nocase(3, ""), 2);
    EXPECT_EQ(t.find_pattern_nocase("BODY"), 2);
    EXPECT_EQ(t.find_pattern_nocase(3, "BODY"), 10);
    EXPECT_EQ(t.find_pattern("BODY"), 10);
    EXPECT_EQ(t.find_pattern(-50, "a"), 0);
    EXPECT_EQ(t.find_pattern(500, "Y"), -1);
    EXPECT_EQ(t.find_pattern(500, ""), 14);
    EXPECT_EQ(t.find_pattern(nullptr), -1);
    EXPECT_EQ(CText::STRSTR("Hello World", "WORLD"), STRSTR("Hello World", "WORLD"));
    EXPECT_GT(CText::STRNCMP("abc", "ABD", 3), 0);

    CText withNul;
    withNul.append("x\0y", 3);
    EXPECT_EQ(withNul.find_pattern("y"), -1); // searches read a C string
}

TEST(CText, PrefixAndSuffixTests) {
    const CText t("x.htm");
    EXPECT_EQ(t.endsWith_nocase(".HTM"), 1);
    EXPECT_EQ(t.endsWith_nocase(CText(".HTM")), 1);
    EXPECT_EQ(t.endsWith_case(CText(".HTM")), 0);
    EXPECT_EQ(t.endsWith_case(CText(".htm")), 1);
    EXPECT_EQ(t.beginsWith_case(CText("x.htm!")), 0);
    EXPECT_EQ(t.beginsWith_case(CText("x.")), 1);
    EXPECT_EQ(t.beginsWith_nocase("X.H"), 1);
    EXPECT_EQ(t.beginsWith_nocase(""), 1);
    EXPECT_EQ(t.endsWith_nocase("long.htm"), 0);
    EXPECT_EQ(t.beginsWith_case(noBuffer()), 0);
}

TEST(CText, UrlCharacterClasses) {
    EXPECT_EQ(CText("http://h.org/a?b=c&d=%20").isURLEncoded(), 1);
    EXPECT_EQ(CText("http://h.org/a?b=c&d=%20").isSafeEncoded(), 1);
    EXPECT_EQ(CText("a{b}").isURLEncoded(), 1); // national characters need no escape
    EXPECT_EQ(CText("a{b}").isSafeEncoded(), 0);
    EXPECT_EQ(CText("a b").isURLEncoded(), 0);
    EXPECT_EQ(CText("caf\xe9").isSafeEncoded(), 0);
    EXPECT_EQ(CText("").isURLEncoded(), 1);
}

class CTextFile : public ::testing::Test {
protected:
    void SetUp() override {
        std::string pattern = fs::temp_directory_path() / "ctext-XXXXXX";
        ASSERT_NE(mkdtemp(pattern.data()), nullptr);
        dir = pattern;
    }
    void TearDown() override { fs::remove_all(dir); }

    fs::path write(const char* name, const std::string& content) {
        std::ofstream(dir / name, std::ios::binary) << content;
        return dir / name;
    }
    static std::string read(const fs::path& file) {
        std::ifstream in(file, std::ios::binary);
        return {std::istreambuf_iterator<char>(in), {}};
    }

    fs::path dir;
};

TEST_F(CTextFile, ReadingTurnsNulsIntoSpacesAndSizesByTheCapacityRule) {
    CText t;
    EXPECT_EQ(t.init_from_file(write("nul", std::string("a\0b", 3))), 0);
    EXPECT_EQ(bytes(t), "a b");
    EXPECT_EQ(t.capacity(), 32000);
    EXPECT_EQ(t.init_from_file(write("big", std::string(32000, 'k'))), 0);
    EXPECT_EQ(t.length(), 32000);
    EXPECT_EQ(t.capacity(), 64000);

    const CText small(dir / "nul", 2L);
    EXPECT_EQ(small.capacity(), 4);
    EXPECT_EQ(bytes(small), "a b");
    CText proc; // reports a size of 0, yet has content
    EXPECT_EQ(proc.init_from_file("/proc/self/status"), 0);
    EXPECT_NE(bytes(proc).find("Name:"), std::string::npos);
}

TEST_F(CTextFile, MissingFilesEmptyTheTextOrLeaveIt) {
    CText t("kept");
    EXPECT_EQ(t << (dir / "none").c_str(), ENOENT);
    EXPECT_EQ(bytes(t), "kept");
    EXPECT_EQ(t << nullptr, EINVAL);
    EXPECT_EQ(t.init_from_file(dir / "none"), ENOENT);
    EXPECT_EQ(bytes(t), "");
    EXPECT_EQ(t.init_from_file(dir), EISDIR);
    EXPECT_EQ(bytes(t), "");

    EXPECT_EQ(t << write("x", "content").c_str(), 0);
    EXPECT_EQ(bytes(t), "content");
    EXPECT_EQ(t.append_file(dir / "x"), 0);
    EXPECT_EQ(t.append_file(dir / "none"), ENOENT);
    EXPECT_EQ(bytes(t), "contentcontent");
}

TEST_F(CTextFile, WritingByPathReplacesTheFileAndLeavesHardLinksAlone) {
    const fs::path target = write("target", "old content");
    fs::create_hard_link(target, dir / "link");
    EXPECT_EQ(CText("new") >> target.c_str(), 0);
    EXPECT_EQ(read(target), "new");
    EXPECT_EQ(read(dir / "link"), "old content");
    EXPECT_EQ(CText("x") >> (dir / "no/such/dir").c_str(), ENOENT);
    CText binary;
    binary.append("1\0002", 3);
    EXPECT_EQ(binary >> target.c_str(), 0);
    EXPECT_EQ(read(target), std::string("1\0002", 3));
}

TEST_F(CTextFile, WritingToAnExistingFileOnly) {
    EXPECT_EQ(CText("x").write_to_existing_file(dir / "absent"), 0);
    EXPECT_FALSE(fs::exists(dir / "absent"));
    const fs::path file = write("present", "a much longer old content");
    EXPECT_EQ(CText("short").write_to_existing_file(file), 0);
    EXPECT_EQ(read(file), "short");
    EXPECT_EQ(CText("x").write_to_existing_file(dir), EISDIR);
}

} // namespace
