#include "PageGenerator.h"
#include "ReferenceRelink.h"

#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <gtest/gtest.h>

#include <string>

namespace {

// The production path against the plain algorithm on generated pages: same maps, same pages.

CText textOf(const std::string& s) {
    CText t("");
    t.append(s.data(), static_cast<long>(s.size()));
    return t;
}

std::string dump(const HrefMap& map) {
    std::string out;
    for (auto* node = map.list.first; node != nullptr; node = node->next)
        out += std::string(node->data->key.c_str()) + " -> " + node->data->value.c_str() + "\n";
    return out;
}

std::string dump(const CList<CString256>& list) {
    std::string out;
    for (auto* node = list.first; node != nullptr; node = node->next)
        out += std::string(node->data.c_str()) + "\n";
    return out;
}

class RelinkDifferential : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitializeSuffixMap(); }
};

TEST_F(RelinkDifferential, ScansAgreeWithThePlainAlgorithm) {
    for (unsigned seed = 1; seed <= 40; ++seed) {
        const CText page = textOf(PageGenerator(seed).page(6000, 120));
        CList<CString256> fast, plain;
        collect_all_urls(page, fast, nullptr);
        reference::collect_all_urls(page, plain);
        ASSERT_EQ(dump(fast), dump(plain)) << "seed " << seed;

        const CString256 base(seed % 2 ? "http://h/a/b/index.html" : "https://h:8080/x/");
        HrefMap fastMap, plainMap;
        extract_hrefs(base, CURL(base.c_str()).protocol, page, fastMap);
        reference::extract_hrefs(base, CURL(base.c_str()).protocol, page, plainMap);
        ASSERT_EQ(dump(fastMap), dump(plainMap)) << "seed " << seed;
    }
}

TEST_F(RelinkDifferential, RelinkedPagesAreByteIdentical) {
    const char* bases[] = {"http://h/a/b/index.html", "https://www.example.org/",
                           "ftp://f/pub/dir/", "index.html", "http://h/IMG/"};
    int rewritten = 0;
    for (unsigned seed = 1; seed <= 60; ++seed) {
        const std::string source = PageGenerator(seed).page(seed % 10 == 0 ? 60000 : 8000, 100);
        const CString256 base(bases[seed % 5]);
        CText fast = textOf(source), plain = textOf(source);
        relink(base, fast);
        reference::relink(base, plain);
        ASSERT_EQ(std::string(fast.buffer(), fast.length()),
                  std::string(plain.buffer(), plain.length()))
            << "seed " << seed << " base " << base.c_str();
        rewritten += std::string(fast.buffer()) != source;
    }
    EXPECT_EQ(rewritten, 60); // every generated page has references to rewrite
}

TEST_F(RelinkDifferential, HandMadeInteractionsAgree) {
    // Cases where one replacement feeds or hides another: case-only duplicates, a value equal to
    // a later key, keys that prefix longer ones, delimiters inside keys, text after a NUL.
    const std::string pages[] = {
        "'Pic.gif' 'pic.gif' \"PIC.GIF\" (pic.GIF)",
        "<a href='a.gif'>'http://h/d/a.gif' 'HTTP://H/D/A.GIF'</a>",
        "'a.gif' 'a.gif.bak' \"a.gif\"x\" (a.gif)(a.gif))",
        "<a href=\"javascript:window.open('w.html')\">'w.html'</a> (w.html) 'javascript:void(0)'",
        "\"x.gif\"x.gif\"x.gif\" 'y.gif'y.gif'",
        "<img src=a.gif><p>x 'a.gif><p>x' src=\"a b.gif\" 'a b.gif'",
        std::string("'z.gif' \0 'z.gif'", 17),
        "(((q.gif))) ''r.gif'' \"\"",
    };
    for (const std::string& source : pages) {
        const CString256 base("http://h/d/index.html");
        CText fast = textOf(source), plain = textOf(source);
        relink(base, fast);
        reference::relink(base, plain);
        EXPECT_EQ(std::string(fast.buffer(), fast.length()),
                  std::string(plain.buffer(), plain.length()))
            << source;
    }
}

} // namespace
