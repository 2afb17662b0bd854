#include "PageGenerator.h"
#include "ReferenceRelink.h"

#include "relink/FoldTable.h"
#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <QFile>
#include <QStandardPaths>
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

namespace {

using Fields = std::vector<std::string>;
using reference::lines;
using reference::outcome;

const auto s = [](const std::string& text) { return CString256(text.c_str()); };
const auto n = [](long number) { return std::to_string(number); };
const auto fourCC = [](uint32_t c) { return c ? std::string(reinterpret_cast<char*>(&c), 4) : ""; };

std::string fileText(const std::string& name) {
    std::ifstream in(PELMO_TEST_DATA "/relink/" + name, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
}

// Checks every row of the table file tests/data/relink/<name>.txt: a name, then `inputs` fields
// (all but the last when there are fewer), then what run must make of them. Fields are split on
// " | "; "-" is an empty one, \n \r \0 \\ stand for their bytes, "@file" for that file's text.
template <class Run>
void checkTable(const std::string& name, size_t inputs, Run run) {
    EnsureSuffixMap();
    const std::string table = fileText(name + ".txt");
    ASSERT_NE(table, "") << name;
    std::istringstream in(table);
    for (std::string line; std::getline(in, line);) {
        if (line.empty() || line[0] == '#')
            continue;
        for (size_t at = 0; (at = line.find('\\', at)) != std::string::npos; ++at)
            line.replace(at, 2, 1,
                         std::string("\n\r\0\\", 4).at(std::string("nr0\\").find(line[at + 1])));
        Fields row;
        for (size_t from = 0, bar = 0; bar != std::string::npos; from = bar + 3)
            row.push_back(line.substr(from, (bar = line.find(" | ", from)) - from));
        for (std::string& field : row)
            field = field == "-" ? "" : field.starts_with('@') ? fileText(field.substr(1)) : field;
        const auto first = row.begin() + 1, expected = first + std::min(inputs, row.size() - 2);
        EXPECT_EQ(run(Fields(first, expected)), Fields(expected, row.end())) << row[0];
    }
}

// The fields of a copy of a CURL made from another URL, then assigned the URL ("init") or made to
// parse it ("parse"): parse sets only what it finds, and never the url.
TEST(RelinkTable, CURL) {
    checkTable("curl", 2, [](const Fields& in) {
        CURL u("ftp://stale/p/q.gif?s$t");
        in[0] == "init" ? void(u = in[1].c_str()) : u.parse(in[1].c_str());
        const CURL c(u);
        return lines(c.pathList,
                     {n(c.protocol), fourCC(c.fileType), c.url.c_str(), c.host.c_str(),
                      c.path.c_str(), c.filename.c_str(), c.suffix.c_str(), c.fileAndArgs.c_str(),
                      c.searchArgs.c_str(), c.pathArgs.c_str(), c.anchor.c_str()});
    });
}

TEST(RelinkTable, Suffixes) {
    checkTable("suffix", 1, [](const Fields& in) {
        CText text(in[0].c_str());
        const int known = IsSuffixMapSuffix(text);
        const auto* entry = gSuffixMap.lookup(s("." + in[0]));
        return Fields{n(IsSuffix(CText(in[0].c_str()))), n(known), text.buffer(),
                      entry != nullptr ? entry->value.MIMEType : "absent"};
    });
}

// Relinked (the same by the plain algorithm), with what the scans find and the mailto: names.
TEST(RelinkTable, Pages) {
    checkTable("pages", 2, [](const Fields& in) {
        const Fields fast = outcome(s(in[0]), in[1], false);
        CList<CString256> words;
        HrefMap names;
        collect_all_urls(reference::textOf(in[1]), words, &names);
        return fast == outcome(s(in[0]), in[1], true) ? lines(names, fast)
                                                      : Fields{"the plain algorithm differs"};
    });
}

TEST(RelinkTable, Replace) {
    checkTable("replace", SIZE_MAX, [](const Fields& in) {
        HrefMap map;
        for (size_t i = 1; i + 1 < in.size(); i += 2)
            map.insert(s(in[i]), s(in[i + 1]));
        CText page = reference::textOf(in[0]);
        ReplaceMappedURLs(page, map);
        return Fields{reference::bytesOf(page)};
    });
}

TEST(Relink, DelimiterRowsWrittenAndReadBack) {
    CDelimiters rows;
    CText text("before "), report;
    rows >> text;
    rows.Print(report);
    rows << text; // the rows read replace the table's and leave the text
    rows >> text;
    EXPECT_EQ(text.buffer() + std::string(report.buffer()), fileText("delimiters.expected"));
    int enabled = 0; // the flag is not written: rows read back are all enabled
    for (const elem<delimiters>* row = rows.first; row != nullptr; row = row->next)
        enabled += row->data.enabled;
    EXPECT_EQ(enabled, 15);
}

// Same scans, maps and pages as the plain algorithm, and every page has something to rewrite.
TEST(Relink, GeneratedPagesAsByThePlainAlgorithm) {
    EnsureSuffixMap();
    const char* const bases[] = {"http://h/a/b/index.html", "https://www.example.org/",
                                 "ftp://f/pub/dir/",        "index.html",
                                 "http://h/IMG/",           "https://h:8080/x/"};
    for (unsigned seed = 1; seed <= 60; ++seed) {
        const std::string page = PageGenerator(seed).page(seed % 10 == 0 ? 60000 : 8000, 100);
        const Fields fast = outcome(CString256(bases[seed % 6]), page, false);
        ASSERT_EQ(fast, outcome(CString256(bases[seed % 6]), page, true)) << "seed " << seed;
        EXPECT_NE(fast[0], page) << "seed " << seed;
    }
}

// The map is built from the MIME database once and read from the user's cache after: both
// give the same entries in the same order, and a cache of another database is not used.
TEST(Relink, SuffixMapFromTheCacheIsTheMapBuilt) {
    const auto snapshot = [] {
        std::vector<std::string> rows;
        for (const elem<Link<CString256, ICMapEntry>*>* row = gSuffixMap.list.first; row;
             row = row->next)
            rows.push_back(std::string(row->data->key.c_str()) + " " + row->data->value.MIMEType +
                           " " + std::to_string(row->data->value.fileType));
        return rows;
    };
    QFile cache(QStandardPaths::writableLocation(QStandardPaths::GenericCacheLocation) +
                "/pelmo/suffix-map");
    cache.remove();
    gSuffixMap.clear();
    InitializeSuffixMap();
    const std::vector<std::string> built = snapshot();
    ASSERT_TRUE(cache.exists());
    ASSERT_GT(built.size(), 500u);
    gSuffixMap.clear();
    InitializeSuffixMap();
    EXPECT_EQ(snapshot(), built);

    ASSERT_TRUE(cache.open(QIODevice::WriteOnly));
    cache.write("pelmo suffix map 1\n/elsewhere/mime 1\n\n.zzz\tapplication/x-made-up\n");
    cache.close();
    gSuffixMap.clear();
    InitializeSuffixMap();
    EXPECT_EQ(snapshot(), built);
}

} // namespace

// The case-folding search looks ahead with memchr a window at a time for each case of the first
// byte: a match just past a window's end, at the text's last position, or behind many false
// starts of the other case must be found where a byte-by-byte search finds it.
TEST(Relink, FoldedSearchFindsWhatAByteByByteSearchFinds) {
    const FoldTable fold;
    const auto plain = [&](std::string_view text, std::string_view pattern, size_t from) {
        for (size_t i = from; i + pattern.size() <= text.size(); ++i)
            if (fold.equal(text.substr(i, pattern.size()), pattern))
                return i;
        return std::string_view::npos;
    };
    const struct {
        const char* name;
        std::string text;
        std::string pattern;
    } rows[] = {
        {"rare capital beyond several windows", std::string(900, 'x') + "HrEf=\"", "href=\""},
        {"at a window's end", std::string(255, 'x') + "href=" + std::string(300, 'x'), "HREF="},
        {"at the last position", std::string(600, 'h') + "HREF", "href"},
        {"false starts of both cases", std::string(400, 'h') + std::string(3, 'H') + "hreF",
         "HREF"},
        {"first byte not a letter", std::string(700, '=') + "=\"x", "=\""},
        {"pattern longer than the text", "hr", "href"},
    };
    for (const auto& row : rows) {
        for (size_t from = 0; from <= row.text.size(); ++from)
            EXPECT_EQ(fold.find(row.text, row.pattern, from), plain(row.text, row.pattern, from))
                << row.name << " from " << from;
    }
}
