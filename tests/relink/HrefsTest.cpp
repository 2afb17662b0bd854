#include "relink/Hrefs.h"
#include "relink/SuffixMap.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using Pairs = std::vector<std::pair<std::string, std::string>>;

Pairs pairsOf(const HrefMap& map) {
    Pairs out;
    for (auto* node = map.list.first; node != nullptr; node = node->next)
        out.emplace_back(node->data->key.c_str(), node->data->value.c_str());
    return out;
}

std::vector<std::string> textsOf(const CList<CString256>& list) {
    std::vector<std::string> out;
    for (auto* node = list.first; node != nullptr; node = node->next)
        out.emplace_back(node->data.c_str());
    return out;
}

class Hrefs : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitializeSuffixMap(); }
};

TEST_F(Hrefs, TheFifteenRowsInOrderWithOptionValuesDisabled) {
    const CDelimiters rows;
    ASSERT_EQ(rows.count, 15);
    std::vector<std::string> texts;
    for (auto* row = rows.first; row != nullptr; row = row->next)
        texts.push_back(std::string(row->data.opening.c_str()) + "|" + row->data.closing.c_str() +
                        "|" + std::to_string(row->data.enabled));
    const std::vector<std::string> expected = {
        "HREF=\"|\"|1",       "SRC=\"|\"|1",        "HREF='|'|1",       "SRC='|'|1",
        "SRC=| |1",           "background=\"|\"|1", "background='|'|1", "option value=\"|\"|0",
        "option value='|'|0", "HREF=|>|1",          "SRC=|>|1",         "background=|>|1",
        "HREF=| |1",          "SRC=| |1",           "background=| |1"};
    EXPECT_EQ(texts, expected);
}

TEST_F(Hrefs, SerialisedRowsReadBackEnabled) {
    const CDelimiters rows;
    CText t("before ");
    rows >> t;
    const std::string text(t.buffer());
    EXPECT_EQ(text.rfind("before delimiterList HREF=\"\t\",SRC=\"\t\",", 0), 0u);
    EXPECT_EQ(text.substr(text.size() - 4), "\xE2\x80\xA2\r");

    CDelimiters read;
    read << t;
    ASSERT_EQ(read.count, 15);
    int enabled = 0;
    auto* a = rows.first;
    for (auto* b = read.first; b != nullptr; b = b->next, a = a->next) {
        EXPECT_STREQ(a->data.opening.c_str(), b->data.opening.c_str());
        EXPECT_STREQ(a->data.closing.c_str(), b->data.closing.c_str());
        enabled += b->data.enabled;
    }
    EXPECT_EQ(enabled, 15); // the flag is not written, so rows read back are all enabled
    EXPECT_STREQ(t.buffer(), "before "); // the list is taken out of the text

    CText report;
    rows.Print(report);
    EXPECT_EQ(std::string(report.buffer()).rfind("\t\tdelimiterList : HREF=\"\t\",", 0), 0u);
}

TEST_F(Hrefs, SuffixRule) {
    struct Row {
        const char* name;
        const char* suffix;
        int expected;
    };
    const Row rows[] = {
        {"empty", "", 1},
        {"known", "html", 1},
        {"known upper", "HTML", 1},
        {"short lettered", "x2y", 1},
        {"first char unexamined", "!ab", 1},
        {"digits only", "7351", 0},
        {"one char", "q", 0},
        {"too long unknown", "abcdef", 0},
        {"bad char", "a-b", 0},
        {"known digit start", "7z", 1},
        {"unknown digit start", "9q", 1},
        {"two digits", "99", 0},
    };
    for (const Row& row : rows)
        EXPECT_EQ(IsSuffix(CText(row.suffix)), row.expected) << row.name;

    CText probe("GIF");
    EXPECT_EQ(IsSuffixMapSuffix(probe), 1);
    EXPECT_STREQ(probe.buffer(), "gif"); // lower-cased in place
    CText unknown("qqqq");
    EXPECT_EQ(IsSuffixMapSuffix(unknown), 0);
}

TEST_F(Hrefs, SuffixScanCandidates) {
    struct Row {
        const char* name;
        const char* page;
        std::vector<std::string> expected;
    };
    const Row rows[] = {
        {"quoted", "<a href='Page.HTML'>", {"Page.HTML"}},
        {"anchor and mailto left out", "<a href='#top.html'><a href=\"mailto:x@y.com\">", {}},
        {"blank is no terminator", "<p>see this.gif now</p>", {}},
        {"tilde fails", "<a href=\"~me/a.html\">", {}},
        {"unterminated end dropped", "x src=a.gif", {}},
        {"second character dot dropped", "a.gif'", {}},
        {"first character never taken", "ab.gif'", {"b.gif"}},
        {"one dot of many passes", "'www.site.com/a.html'", {"www.site.com/a.html"}},
        {"each dot examined",
         "'x.tar.gz'",
         {"x.tar.gz", "x.tar.gz"}}, // ".tar.gz" and "gz" both pass
        {"long suffix unknown", "'a.longsuffix'", {}},
        {"parenthesised", "url(img/x.png)", {"img/x.png"}},
        {"duplicates kept", "'a.gif' 'a.gif'", {"a.gif", "a.gif"}},
        {"option values found", "<option value='a.html'>", {"a.html"}},
    };
    for (const Row& row : rows) {
        CList<CString256> urls;
        collect_all_urls(CText(row.page), urls, nullptr);
        EXPECT_EQ(textsOf(urls), row.expected) << row.name;
    }
}

TEST_F(Hrefs, SuffixScanMailtoNames) {
    HrefMap names;
    CList<CString256> urls;
    collect_all_urls(CText("<a href=\"mailto:ann@host.org\">Ann B.</A> 'x.gif'"), urls, &names);
    EXPECT_EQ(pairsOf(names), (Pairs{{"ann@host.org", "Ann B."}}));
    EXPECT_EQ(textsOf(urls), (std::vector<std::string>{"x.gif"}));
}

TEST_F(Hrefs, DelimiterScanRules) {
    struct Row {
        const char* name;
        const char* page;
        std::vector<std::string> raw;
    };
    const Row rows[] = {
        {"quoted before bare", "<a HREF=\"a b.html\">", {"a b.html"}},
        {"src to blank", "<img src=pic.gif alt=x>", {"pic.gif"}},
        {"src runs past >", "<img src=pic.gif><p>Hi there", {"pic.gif><p>Hi"}},
        {"href to >", "<a href=x.html>y</a>", {"x.html"}},
        {"option value not scanned", "<option value='a.html'>", {}},
        {"empty value", "<a href=\"\">", {""}},
        {"background", "<td BACKGROUND='bg.png'>", {"bg.png"}},
        {"unclosed", "<a href=\"open", {}},
        {"anchors kept raw", "<a href='#x'><a href='mailto:y'>", {"#x", "mailto:y"}},
    };
    for (const Row& row : rows) {
        CList<CString256> raw;
        classic_extract_hrefs(CText(row.page), raw);
        EXPECT_EQ(textsOf(raw), row.raw) << row.name;
    }
}

TEST_F(Hrefs, BothScansMergeInOrder) {
    const CString256 base("http://h/a/b/index.html");
    HrefMap map;
    extract_hrefs(
        base, ip_http,
        CText("<a href='Page.HTML'><img src=pic.gif alt=x><a href='#top'><a href='mailto:x'>"
              "<a href=\"~u/p\"><a href=\"\">"),
        map);
    // The suffix scan finds only Page.HTML ("gif alt=x" is no suffix); the delimiter scan adds
    // the rest in row order: HREF="..." values first, SRC= up to a blank later.
    EXPECT_EQ(pairsOf(map), (Pairs{{"Page.HTML", "http://h/a/b/Page.HTML"},
                                   {"~u/p", "http://h/a/b/~u/p"},
                                   {"", "http://h/a/b/"},
                                   {"pic.gif", "http://h/a/b/pic.gif"}}));

    HrefMap https;
    extract_hrefs(CText("<script src=\"//cdn/x.js\">"), CString256("https://h/i.html"), https);
    EXPECT_EQ(pairsOf(https),
              (Pairs{{"//cdn/x.js", "http://cdn/x.js"}})); // this form always uses http:
}

} // namespace
