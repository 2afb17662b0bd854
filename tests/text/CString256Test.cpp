#include "text/CString256.h"
#include "TextRows.h"
#include "text/Containers.h"

namespace {

using S = CString256;
const std::string a255(255, 'a'), c254(254, 'c');

std::string edited(const std::string& s, void (*edit)(S&)) {
    S t(s.c_str());
    edit(t);
    return t.c_str();
}
#define EDIT(text, ...) edited(text, [](S& s) { __VA_ARGS__; })

/** The text split at delimiters, joined again with ";". */
std::string relisted(const char* s, const char* delimiters) {
    CList<S> list;
    S(s).parse_into_list(delimiters, list);
    S joined("stale");
    joined.flatten_list(';', list);
    return joined.c_str();
}

/** A score, in thousandths, of a matcher called through its adapter as match() calls it. */
std::string scored(void (*adapter)(void*, void*, float*), const char* subject, const void* other) {
    float score = -1;
    S(subject).match(adapter, const_cast<void*>(other), &score);
    return n(long(score * 1000));
}

std::string wildcard(void (*adapter)(void*, void*, float*),
                     std::initializer_list<const char*> pieces) {
    CList<S> list;
    for (const char* piece : pieces)
        list.append(S(piece));
    return scored(adapter, "abab.PDF", &list);
}

TEST(CString256, Edits) {
    expectRows({
        {"CutAt255", S((a255 + "b").c_str()).c_str(), a255},
        {"NullIsEmpty", S(static_cast<const char*>(nullptr)).c_str(), ""},
        {"OwnTail", EDIT("abcdef", s = s.c_str() + 2), "cdef"},
        {"QStringLatin1", EDIT("", s = QString::fromUtf8("é €1")), "\xe9 1"},
        {"QStringCutAt255", EDIT("", s = QString(300, u'a')), a255},
        {"Low32BitsSigned", EDIT("", s = 2147483648ULL), "-2147483648"},
        {"StringFillsTo255", EDIT(c254, s += "xyz"), c254 + "x"},
        {"CharUpTo254", EDIT(c254.substr(1), s += 'x'), c254.substr(1) + "x"},
        {"NoCharAt254", EDIT(c254, s += 'x'), c254},
        {"Suffix", EDIT("a.b.html", s.change_suffix("htm")), "a.b.htm"},
        {"NoSuffix", EDIT("README", s.change_suffix("htm")), "README.htm"},
        {"Filter", EDIT("a b\tc\n-\x01!", s.filter_to_alnum_or_punct()), "abc-!"},
        {"ListDropsEmpty", relisted("a,,b,", ","), "a;b"},
    });
}

TEST(CString256, Queries) {
    const S html("a.html");
    expectRows({
        {"EndsNocase", n(html.endsWith(".HTML", 1)), "1"},
        {"SuffixLonger", n(S("ml").endsWith(".html", 1)), "0"},
        {"BeginsNocase", n(html.beginsWith_nocase("A.H")), "1"},
        {"StrncmpRawDifference", n(STRNCMP("abc", "ABD", 3)), "31"},
        {"StrncmpShorter", n(STRNCMP("ab", "abc", 3)), "-99"},
        {"ExactNocase", scored(matcher_nocase_exact_256, "abc", "ABC"), "1000"},
        {"ExactEmpty", scored(matcher_nocase_exact_256, "", ""), "0"},
        {"PartialNocase", scored(matcher_nocase_partial_256, "abc", "BC"), "1000"},
        {"PartialEmpty", scored(matcher_nocase_partial_256, "abc", ""), "0"},
        {"Approximate", scored(matcher_case_approximate_256, "abcd", "ad"), "666"},
        {"ApproximateNocase", scored(matcher_nocase_approximate_256, "abcd", "AD"), "666"},
        {"ApproximateInOrder", scored(matcher_case_approximate_256, "abcd", "da"), "333"},
        {"WildcardCase", wildcard(match_wildcard_case_256, {"ab", ".pdf"}), "0"},
        {"WildcardNocase", wildcard(match_wildcard_nocase_256, {"ab", ".pdf"}), "1000"},
        {"WildcardNoOverlap", wildcard(match_wildcard_case_256, {"aba", "ab."}), "0"},
    });
}

} // namespace
