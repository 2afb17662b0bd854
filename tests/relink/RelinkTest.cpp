#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <QFile>
#include <gtest/gtest.h>

#include <string>

namespace {

class Relink : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitializeSuffixMap(); }

    static std::string relinked(const char* base, const char* page) {
        CText text(page);
        relink(CString256(base), text);
        return text.buffer();
    }
};

TEST_F(Relink, ResolvesEveryKindOfReference) {
    struct Row {
        const char* name;
        const char* page;
        ip_protocols scheme;
        const char* href;
        const char* expected;
    };
    const char* abc = "http://h/a/b/index.html";
    const Row rows[] = {
        {"bare name", abc, ip_http, "pic.gif", "http://h/a/b/pic.gif"},
        {"dot slash", abc, ip_http, "./pic.gif", "http://h/a/b/pic.gif"},
        {"only one dot slash", abc, ip_http, "././pic.gif", "http://h/a/b/./pic.gif"},
        {"root", abc, ip_http, "/img/pic.gif", "http://h/img/pic.gif"},
        {"parent", abc, ip_http, "../pic.gif", "http://h/a/pic.gif"},
        {"above the root", abc, ip_http, "../../../pic.gif", "http://h/pic.gif"},
        {"counted anywhere", abc, ip_http, "../a/../b", "http://h/./b"},
        {"scheme relative", abc, ip_http, "//cdn/x.js", "http://cdn/x.js"},
        {"scheme relative https", "https://h/i.html", ip_https, "//cdn/x.js", "https://cdn/x.js"},
        {"absolute", abc, ip_http, "http://other/x.gif", "http://other/x.gif"},
        {"query", abc, ip_http, "?q=1", "http://h/a/b/?q=1"},
        {"script", abc, ip_http, "javascript:f()", "http://h/a/b/javascript:f()"},
        {"empty", abc, ip_http, "", "http://h/a/b/"},
        {"no directory", "http://h/index.html", ip_http, "pic.gif", "http://h/pic.gif"},
        {"no directory parent", "http://h/index.html", ip_http, "../pic.gif", "http://h/pic.gif"},
        {"no scheme separator", "index.html", ip_http, "pic.gif", "http:///pic.gif"},
        {"ftp", "ftp://f/pub/", ip_ftp, "x.tgz", "ftp://f/pub/x.tgz"},
        {"port kept", "http://h:81/d/", ip_http, "x", "http://h:81/d/x"},
        // No scheme text: "//cdn/x" stays without "://" and so counts as root-relative.
        {"unknown scheme value", abc, static_cast<ip_protocols>(9), "//cdn/x", "//h//cdn/x"},
    };
    for (const Row& row : rows) {
        CString256 out("stale");
        partial_href_to_full_url(CString256(row.page), row.scheme, CString256(row.href), out);
        EXPECT_STREQ(out.c_str(), row.expected) << row.name;
    }
    CString256 out;
    partial_href_to_full_url(CString256("https://h/a/"), CString256("//cdn/x.js"), out);
    EXPECT_STREQ(out.c_str(), "http://cdn/x.js");

    // Every part is a fixed string: a long result is cut at 255 bytes.
    const std::string longName(300, 'n');
    partial_href_to_full_url(CString256(abc), ip_http, CString256(longName.c_str()), out);
    EXPECT_EQ(out.length(), 255);

    EXPECT_TRUE(href_is_relative(CString256("a/b.html")));
    EXPECT_FALSE(href_is_relative(CString256("ftp://x/")));
}

TEST_F(Relink, ReplacesOnlyWholeDelimitedValues) {
    HrefMap map;
    map.insert(CString256("a.gif"), CString256("http://h/a.gif"));
    map.insert(CString256(""), CString256("http://h/"));
    CText page("'a.gif' \"A.GIF\" (a.gif) 'b/a.gif' src=a.gif \"a.gif' \"\"");
    ReplaceMappedURLs(page, map);
    EXPECT_STREQ(page.buffer(),
                 "'http://h/a.gif' \"http://h/a.gif\" (http://h/a.gif) 'b/a.gif' src=a.gif "
                 "\"a.gif' \"\"");

    // Keys differing in case: the first inserted rewrites both spellings.
    HrefMap cased;
    cased.insert(CString256("Pic.gif"), CString256("http://h/Pic.gif"));
    cased.insert(CString256("pic.gif"), CString256("http://h/pic.gif"));
    CText twice("'pic.gif' 'Pic.gif'");
    ReplaceMappedURLs(twice, cased);
    EXPECT_STREQ(twice.buffer(), "'http://h/Pic.gif' 'http://h/Pic.gif'");
}

TEST_F(Relink, RelinksPagesAsAMailReaderNeedsThem) {
    EXPECT_EQ(
        relinked("http://h/a/b/index.html",
                 "<img src='img/a.gif'><style>p{background:url(img/a.gif)}</style>"),
        "<img "
        "src='http://h/a/b/img/a.gif'><style>p{background:url(http://h/a/b/img/a.gif)}</style>");
    EXPECT_EQ(relinked("http://h/a/b/index.html", "<a HREF='#top'>t</a><a HREF='mailto:x'>m</a>"),
              "<a HREF='#top'>t</a><a HREF='mailto:x'>m</a>");
    // Unquoted values are mapped but left as they stand.
    EXPECT_EQ(relinked("http://h/d/", "<img src=pic.gif alt=x>"), "<img src=pic.gif alt=x>");
    EXPECT_EQ(relinked("https://h/", "<script src=\"//cdn/x.js\"></script>"),
              "<script src=\"https://cdn/x.js\"></script>");
    EXPECT_EQ(relinked("http://h/d/", ""), "");
    EXPECT_EQ(relinked("nowhere", "<img src=\"pic.gif\">"), "<img src=\"http:///pic.gif\">");

    CText none(static_cast<const char*>(nullptr));
    relink(CString256("http://h/"), none);
    EXPECT_EQ(none.buffer(), nullptr);
}

TEST_F(Relink, SamplePageMatchesItsExpectedFile) {
    QFile in(QStringLiteral(PELMO_TEST_DATA "/relink/page.html"));
    QFile expected(QStringLiteral(PELMO_TEST_DATA "/relink/page.relinked.html"));
    ASSERT_TRUE(in.open(QIODevice::ReadOnly));
    ASSERT_TRUE(expected.open(QIODevice::ReadOnly));
    const QByteArray source = in.readAll();
    CText page("");
    page.append(source.constData(), source.size());
    relink(CString256("http://www.example.org/news/2026/index.html"), page);
    EXPECT_EQ(std::string(page.buffer(), page.length()), expected.readAll().toStdString());
}

} // namespace
