#include "relink/CURL.h"
#include "relink/SuffixMap.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

std::vector<std::string> segments(const CList<CString256>& list) {
    std::vector<std::string> out;
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
        out.emplace_back(node->data.c_str());
    return out;
}

struct ParseRow {
    const char* name;
    const char* input;
    ip_protocols protocol;
    const char* url;
    const char* host;
    const char* path;
    std::vector<std::string> pathList;
    const char* filename;
    const char* suffix;
    const char* fileAndArgs;
    const char* searchArgs;
    const char* pathArgs;
};

TEST(CURL, ParsesEveryPartByItsCuttingRules) {
    // clang-format off
    const ParseRow rows[] = {
        // name, input, protocol, url, host, path, pathList, filename, suffix, fileAndArgs, searchArgs, pathArgs
        {"full page", "http://h/a/b/page.html?x=1#top", ip_http, "http://h/a/b/page.html?x=1", "h", "a/b", {"a", "b"}, "page.html", ".html", "page.html?x=1", "x=1", ""},
        {"path args before search", "http://h/a/b;c$p?q", ip_http, "http://h/a/b;c$p?q", "h", "a", {"a"}, "b;c", "", "b;c$p?q", "q", "p"},
        {"search before path args", "http://h/d/f.cgi?b$c", ip_http, "http://h/d/f.cgi?b$c", "h", "d", {"d"}, "f.cgi", ".cgi", "f.cgi?b$c", "b", "c"},
        {"https scheme", "https://h/x", ip_https, "https://h/x", "h", "", {}, "x", "", "x", "", ""},
        {"scheme is case-sensitive", "HTTPS://h/x", ip_http, "HTTPS://h/x", "h", "", {}, "x", "", "x", "", ""},
        {"ftp", "ftp://files.example/pub/a.tar.gz", ip_ftp, "ftp://files.example/pub/a.tar.gz", "files.example", "pub", {"pub"}, "a.tar.gz", ".gz", "a.tar.gz", "", ""},
        {"mailto", "mailto:a@b", ip_http, "mailto:a@b", "", "", {}, "", "", "", "", ""},
        {"directory only", "http://h/a/", ip_http, "http://h/a/", "h", "a", {"a"}, "", "", "", "", ""},
        {"root", "http://h/", ip_http, "http://h/", "h", "", {}, "", "", "", "", ""},
        {"bare host", "http://host", ip_http, "http://host", "host", "", {}, "", "", "", "", ""},
        {"double slash after host", "http://h//x", ip_http, "http://h//x", "h", "", {}, "x", "", "x", "", ""},
        {"port and user kept", "http://u@h:8080/d/i.htm", ip_http, "http://u@h:8080/d/i.htm", "u@h:8080", "d", {"d"}, "i.htm", ".htm", "i.htm", "", ""},
        {"empty segments dropped", "http://h/a//b/c", ip_http, "http://h/a//b/c", "h", "a//b", {"a", "b"}, "c", "", "c", "", ""},
        {"no scheme", "dir/file.txt", ip_http, "dir/file.txt", "", "", {}, "file.txt", ".txt", "file.txt", "", ""},
        {"slash in query", "http://h/a?x=/b", ip_http, "http://h/a?x=/b", "h", "", {}, "a", "", "a?x=/b", "x=/b", ""},
    };
    // clang-format on
    for (const ParseRow& row : rows) {
        const CURL u(row.input);
        EXPECT_EQ(u.protocol, row.protocol) << row.name;
        EXPECT_STREQ(u.url.c_str(), row.url) << row.name;
        EXPECT_STREQ(u.host.c_str(), row.host) << row.name;
        EXPECT_STREQ(u.path.c_str(), row.path) << row.name;
        EXPECT_EQ(segments(u.pathList), row.pathList) << row.name;
        EXPECT_STREQ(u.filename.c_str(), row.filename) << row.name;
        EXPECT_STREQ(u.suffix.c_str(), row.suffix) << row.name;
        EXPECT_STREQ(u.fileAndArgs.c_str(), row.fileAndArgs) << row.name;
        EXPECT_STREQ(u.searchArgs.c_str(), row.searchArgs) << row.name;
        EXPECT_STREQ(u.pathArgs.c_str(), row.pathArgs) << row.name;
        EXPECT_STREQ(u.anchor.c_str(), "") << row.name; // init drops the anchor first
    }
}

TEST(CURL, ExtractorsLeaveOutputsAloneWithoutTheirDelimiter) {
    CString256 out("kept");
    EXPECT_EQ(CURL::extract_pathArgs("http://h/a", out), 0);
    EXPECT_EQ(CURL::extract_searchArgs("http://h/a", out), 0);
    CURL::extract_anchor("http://h/a", out);
    CURL::extract_path("http://h/a", out);
    EXPECT_STREQ(out.c_str(), "kept");
    CURL::extract_host("no-scheme/a", out); // no "://": the host is emptied
    EXPECT_STREQ(out.c_str(), "");

    // The anchor extractor cuts at "$" and "?" wherever they stand.
    CURL::extract_anchor("p#a?b", out);
    EXPECT_STREQ(out.c_str(), "a");
    EXPECT_EQ(CURL::extract_pathArgs("a$b?c#d", out), 1);
    EXPECT_STREQ(out.c_str(), "b");

    CString256 f("f"), x("x"), fa("fa");
    CURL::extract_filename("http://host", f, x, fa);
    EXPECT_STREQ(f.c_str(), "f");
    EXPECT_STREQ(fa.c_str(), "fa");
    CURL::extract_filename("/README", f, x, fa); // a leading slash is a file name's slash
    EXPECT_STREQ(f.c_str(), "README");
    EXPECT_STREQ(x.c_str(), "x"); // no dot: the suffix is left as it was

    CList<CString256> list;
    list.append(CString256("pre"));
    CURL::parse_path(CString256("a/b"), list);
    EXPECT_EQ(segments(list), (std::vector<std::string>{"pre", "a", "b"}));
}

TEST(CURL, CopiesAndReassignmentReplaceEveryField) {
    CURL a("http://h/a/b/c.gif");
    CURL b(a);
    a = "https://other/x/y.png";
    EXPECT_STREQ(b.host.c_str(), "h");
    EXPECT_EQ(segments(b.pathList), (std::vector<std::string>{"a", "b"}));
    EXPECT_EQ(a.protocol, ip_https);
    EXPECT_EQ(segments(a.pathList), (std::vector<std::string>{"x"}));
    b = a;
    EXPECT_STREQ(b.filename.c_str(), "y.png");
    a = "";
    EXPECT_STREQ(a.url.c_str(),
                 ""); // an empty URL parses nothing, fields come from the fresh object
    EXPECT_EQ(a.pathList.count, 0);
    const CURL empty("");
    EXPECT_EQ(empty.protocol, ip_http);
    EXPECT_EQ(empty.fileType, 0u);
}

TEST(SuffixMap, FilledFromTheMimeDatabaseAndProbedCaseSensitively) {
    InitializeSuffixMap();
    const Link<CString256, ICMapEntry>* html = gSuffixMap.lookup(CString256(".html"));
    ASSERT_NE(html, nullptr);
    EXPECT_STREQ(html->value.MIMEType, "text/html");
    uint32_t expected = 0;
    StrToFourCharCode("HTML", expected);
    EXPECT_EQ(html->value.fileType, expected);
    EXPECT_EQ(html->value.fileCreator, 0u);
    const Link<CString256, ICMapEntry>* gif = gSuffixMap.lookup(CString256(".gif"));
    ASSERT_NE(gif, nullptr);
    StrToFourCharCode("GIF ", expected);
    EXPECT_EQ(gif->value.fileType, expected); // blank-padded

    const int count = gSuffixMap.count;
    EXPECT_GT(count, 100);
    InitializeSuffixMap(); // a second fill keeps every key once
    EXPECT_EQ(gSuffixMap.count, count);

    EXPECT_EQ(CURL("http://h/p.gif").fileType, gif->value.fileType);
    EXPECT_EQ(CURL("http://h/p.unknownsuffix").fileType, 0u);

    // A key stored only in upper case is found by the URL's suffix as written, not by a lower-cased
    // probe.
    ICMapEntry upper{};
    StrToFourCharCode("JPGX", upper.fileType);
    gSuffixMap.insert(CString256(".JPGX"), upper);
    EXPECT_EQ(CURL("http://h/a.JPGX").fileType, upper.fileType);
    EXPECT_EQ(CURL("http://h/a.jpgx").fileType, 0u);
}

TEST(SuffixMap, FourCharCodesAreByteCopies) {
    uint32_t code = 0;
    StrToFourCharCode("abcdef", code);
    EXPECT_EQ(std::memcmp(&code, "abcd", 4), 0);
    const uint32_t signature = GetOurSignature();
    EXPECT_EQ(std::memcmp(&signature, "Pelm", 4), 0);
}

} // namespace
