#include "text/CText.h"
#include "TextRows.h"
#include "text/Containers.h"

#include <cerrno>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

const std::string x31999(31999, 'x'), x300(300, 'x'), x24(24, 'x');

/** The text after op; with out, also what op left in out (given as "stale") and its result. */
std::string run(const std::string& s, bool withOut, int (*op)(CText& t, CText& out)) {
    CText t = s == "none" ? CText(nullptr) : CText(s.c_str()), out("stale");
    const int result = op(t, out);
    EXPECT_TRUE(t.buffer() == nullptr || t.buffer()[t.length()] == '\0');
    return withOut ? bytes(t) + "|" + bytes(out) + "|" + n(result) : bytes(t);
}
#define EDIT(s, ...) run(s, false, [](CText& t, CText&) { return __VA_ARGS__, 0; })
#define GET(s, ...) run(s, true, [](CText& t, CText& o) { return int(__VA_ARGS__); })

/** A status, then what the text or the file holds after the call that gave it. */
std::string after(int status, const CText& t) {
    return n(status) + bytes(t);
}
std::string after(int status, const fs::path& file) {
    std::ifstream in(file, std::ios::binary);
    return n(status) + std::string(std::istreambuf_iterator<char>(in), {});
}

std::string listed(const char* s) {
    CText t(s);
    CList<CString256> list;
    list.append(CString256("kept"));
    t.extract_list("[", "]", list);
    std::string out = bytes(t) + ":";
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
        out += std::string(node->data.c_str()) + ";";
    return out;
}

TEST(CText, Storage) {
    const char range[] = "ab\0cd";
    CText copied("abcde", 4L), none(nullptr);
    copied.set_label(CString256("page"));
    const CText copy(copied), ofNone(none), ab("ab"), national("a{b}");
    expectRows({
        {"StrictlyAbove", n(CText((x31999 + "x").c_str()).capacity()), "64000"},
        {"BadBlock", n(CText("a", -4L).block()), "32000"},
        {"ResizeAddsBlocks", n(CText().resize_by(32000)), "96000"},
        {"CharFillsTheBlock", n((CText(x31999.c_str() + 1) += 'a').capacity()), "32000"},
        {"AppendKeepsOneMore", n(CText().append(x31999.data(), 31999).capacity()), "64000"},
        {"Copy", bytes(copy) + n(copy.capacity()) + n(copy.block()) + copy.label().c_str(),
         "abcde84page"},
        {"CopyOfNoBuffer", after(ofNone.capacity(), ofNone) + n(ofNone.block()), "032000"},
        {"LabelGoes", (copied = "x").label().c_str(), ""},
        {"RangeInclusive", bytes(CText(range + 1, range + 1)), "b"},
        {"NoBufferIgnored", EDIT("kept", t = CText(nullptr)), "kept"},
        {"NullIsEmpty", EDIT("none", t = static_cast<const char*>(nullptr)), ""},
        {"OwnTail", EDIT("abcdef", t = t.buffer() + 2), "cdef"},
        {"Latin1", EDIT("", t = QString("é"), t += QString("ü")), "\xe9\xfc"},
        {"NotLatin1", EDIT("kept", t = QString("€"), t = QString(), t += QString("€")), "kept"},
        {"BlockToNul", EDIT("", t = QByteArray("ab\0cd", 5)), "ab"},
        {"AppendNumbers", EDIT("", t += -7L, t += 42LL), "-742"},
        {"AffixWholeText", n(ab.endsWith_nocase("AB") + ab.beginsWith_case(ab)), "2"},
        {"AffixLonger", n(ab.endsWith_nocase("xab") + ab.beginsWith_nocase("abc")), "0"},
        {"UrlClasses", n(national.isURLEncoded()) + n(national.isSafeEncoded()), "10"},
        {"SpaceEncoded", n(CText("a b").isURLEncoded()), "0"},
        {"LowerInPlace", EDIT("A.Htm", t.to_lower()), "a.htm"},
    });
}

TEST(CText, ReportLines) {
    CList<CString256> list;
    CText t;
    t.pretty_append_named_list("Empty", list);
    list.append(CString256("a"));
    list.append(CString256("b"));
    t.pretty_append_named_value("Num", -5L);
    t.append_named_list("List", list);
    t.append_named_value("Id", CText("y"));
    EXPECT_EQ(bytes(t), "\t\tEmpty : \r\r\t\tNum : -5\r\rList a,b\xE2\x80\xA2\rId y\xE2\x80\xA2\r");
}

TEST(CText, Files) {
    std::string name = fs::temp_directory_path() / "ctext-XXXXXX";
    ASSERT_NE(mkdtemp(name.data()), nullptr);
    const fs::path dir = name, file = dir / "file", link = dir / "link", none = dir / "none";
    std::ofstream(file, std::ios::binary) << std::string("a\0b", 3);
    fs::create_hard_link(file, link);
    CText t("kept"), proc;
    expectRows({
        {"MissingKeeps", after(t << none.c_str(), t), n(ENOENT) + "kept"},
        {"NullPath", after(t << nullptr, t), n(EINVAL) + "kept"},
        {"NulsToSpaces", after(t << file.c_str(), t), "0a b"},
        {"Append", after(t.append_file(file), t), "0a ba b"},
        {"AppendMissing", after(t.append_file(none), t), n(ENOENT) + "a ba b"},
        {"SizedByFile", n(CText(file, 3L).capacity()), "6"},
        {"Unsized", after(proc.init_from_file("/proc/self/status"), proc).substr(0, 6), "0Name:"},
        {"MissingEmpties", after(t.init_from_file(none), t), n(ENOENT)},
        {"Directory", n(t.init_from_file(dir)), n(EISDIR)},
        {"Replaces", after(CText("new") >> file.c_str(), file), "0new"},
        {"LinkKept", after(0, link), "0a\0b"s},
        {"WriteFails", n(CText("x") >> (none / "x").c_str()), n(ENOENT)},
        {"OnlyExisting", after(CText("x").write_to_existing_file(none), none), "0"},
        {"Overwrites", after(CText("n").write_to_existing_file(link), link), "0n"},
    });
    fs::remove_all(dir);
}

TEST(CText, Patterns) {
    expectRows({
        {"ExtractOne", GET("abc", (t.extract_between(1, 1, o), 0)), "abc|b|0"},
        {"OwnSource", EDIT(("a" + x24).c_str(), t.replace_range(0, 0, t.buffer() + 1)), x24 + x24},
        {"NoClose", GET("f(x", t.extract_between_patterns("(", ")", o)), "f(x||0"},
        {"CaseSensitive", GET("<A>b</a>", t.extract_between_patterns("<a>", "</a>", o)),
         "<A>b</a>||0"},
        {"FromStart", GET("(a)(b)", t.extract_between_patterns(1, "(", ")", o)), "(a)(b)|b|1"},
        {"Nocase", GET("<A>b</a>", t.extract_between_patterns_nocase("<a>", "</A>", o)),
         "<A>b</a>|b|1"},
        {"CloseWithinOpen",
         GET("<a href>", t.extract_between_patterns_nocase_inclusive("<A", "a", o)),
         "<a href>|<a|1"},
        {"RemoveFirst", GET("(a)(b)", t.extract_and_remove_between_patterns(1, "(", ")", o)),
         "(b)|b|1"},
        {"NotInclusive",
         GET("[a][b]", t.extract_and_remove_between_patterns_nocase_not_inclusive(1, "[", "]", o)),
         "[][b]|b|1"},
        {"ExtractReplace",
         GET("(a)(b)", t.extract_and_replace_between_patterns(1, "(", ")", "Z", o)), "Z(b)|b|1"},
        {"RemoveInner", EDIT("a(bc)d(e)", t.remove_between_patterns("(", ")")), "a()d(e)"},
        {"RemoveAll",
         EDIT("a<!--1-->b<!--2-->c<!--3",
              t.remove_between_patterns_inclusive_all_nocase("<!--", "-->")),
         "abc<!--3"},
        {"RemoveAllAgain",
         EDIT("a<!<!---->--x-->b", t.remove_between_patterns_inclusive_all_nocase("<!--", "-->")),
         "ab"},
        {"ReplaceInnerSkips", EDIT("[]a]", t.replace_between_patterns_nocase("[", "]", "new")),
         "[new]"},
        {"ReplaceInnerOffset",
         EDIT("<!---->X-->", t.replace_between_patterns_nocase("<!--", "-->", "R")), "<!--R-->"},
        {"WithinOuter",
         EDIT("<H>x</H><h><!--a-->y</h><!--c-->",
              t.remove_between_patterns_inclusive_all_nocase_between("<!--", "-->", "<h>", "</h>")),
         "<H>y</h><!--c-->"},
        {"EmptyClose", GET("x()", t.extract_and_remove_between_patterns_nocase("(", "", o)),
         "x()||0"},
        {"NoBuffer", GET("none", t.extract_and_remove_between_patterns_nocase("(", ")", o)),
         "none||0"},
        {"List", listed("v[a,,b]w"), "vw:a;b;"},
        {"ListMissing", listed("v[a"), "v[a:kept;"},
        {"ListItemCut", listed(("[" + x300 + "]").c_str()), ":" + x300.substr(45) + ";"},
    });
}

// The fuzz target's model of CText, over its seed corpus: any difference aborts the test.
TEST(CText, FuzzCorpus) {
    int inputs = 0;
    for (const auto& entry : fs::directory_iterator(PELMO_TEST_DATA "/fuzz/CTextFuzz")) {
        std::ifstream in(entry.path(), std::ios::binary);
        const std::string data(std::istreambuf_iterator<char>(in), {});
        LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(data.data()), data.size());
        ++inputs;
    }
    EXPECT_GE(inputs, 10);
}

} // namespace
