#include "text/CString256.h"

#include "text/Containers.h"
#include "util/TextUtilities.h"

#include <cctype>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <cwctype>
#include <unistd.h>

static_assert(std::is_standard_layout_v<CString256>,
              "CString256's address must be its text: the match adapters read it as a C string");

namespace {

// Digits of a number appended or assigned: 31 at most, more than any 64-bit value needs.
constexpr short kNumberDigits = 32;

int pascalToC(const unsigned char* pascal, char* out) {
    const int n = pascal[0];
    std::memcpy(out, pascal + 1, n);
    out[n] = 0;
    return n;
}

unsigned char foldUpper(char c) {
    return static_cast<unsigned char>(std::toupper(static_cast<unsigned char>(c)));
}

char foldLower(char c) {
    return static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
}

void lowerCopy(const char* s, char* out) {
    while ((*out++ = foldLower(*s++)) != 0) {
    }
}

} // namespace

CString256::CString256(const CString256& other) : CPooled<CString256>() {
    assign(other.text, max_length);
}

CString256::CString256(const char* s) {
    assign(s, max_length);
}

CString256::CString256(const unsigned char* pascal) {
    *this = pascal;
}

void CString256::assign(const char* s, int n) {
    // memmove: s may be this string's own tail.
    const size_t count = s == nullptr ? 0 : strnlen(s, n);
    std::memmove(text, s == nullptr ? text : s, count);
    text[count] = 0;
}

CString256& CString256::operator=(const CString256& other) {
    assign(other.text, max_length);
    return *this;
}

CString256& CString256::operator=(const char* s) {
    assign(s, max_length);
    return *this;
}

CString256& CString256::operator=(const unsigned char* pascal) {
    text[0] = 0;
    if (pascal != nullptr)
        pascalToC(pascal, text);
    return *this;
}

CString256& CString256::operator=(const QString& s) {
    int n = 0;
    for (QChar ch : s) {
        if (n == max_length)
            break;
        if (ch.unicode() <= 0xff)
            text[n++] = static_cast<char>(ch.unicode());
    }
    text[n] = 0;
    return *this;
}

CString256& CString256::operator=(const QByteArray& block) {
    const qsizetype n = std::min<qsizetype>(block.size(), max_length);
    std::memmove(text, block.constData(), n);
    text[n] = 0;
    return *this;
}

CString256& CString256::operator=(long value) {
    itoa(text, kNumberDigits, value);
    return *this;
}

CString256& CString256::operator=(unsigned long long value) {
    return *this = static_cast<long>(static_cast<int32_t>(static_cast<uint32_t>(value)));
}

CString256& CString256::operator+=(const char* s) {
    if (s == nullptr)
        return *this;
    const int current = length();
    const size_t count = strnlen(s, max_length - current);
    std::memmove(text + current, s, count); // s may lie within this string
    text[current + count] = 0;
    return *this;
}

CString256& CString256::operator+=(const CString256& s) {
    return *this += s.text;
}

CString256& CString256::operator+=(const unsigned char* pascal) {
    if (pascal == nullptr)
        return *this;
    char temporary[max_length + 1];
    pascalToC(pascal, temporary);
    return *this += temporary;
}

CString256& CString256::operator+=(char c) {
    const int current = length();
    if (max_length - current >= 2) {
        text[current] = c;
        text[current + 1] = 0;
    }
    return *this;
}

CString256& CString256::operator+=(long value) {
    char digits[kNumberDigits + 1];
    itoa(digits, kNumberDigits, value);
    return *this += digits;
}

CString256& CString256::operator+=(const QString& s) {
    CString256 converted;
    converted = s;
    return *this += converted.text;
}

int CString256::length() const {
    return static_cast<int>(std::strlen(text));
}

void CString256::to_lower() {
    for (char* p = text; *p != 0; ++p)
        *p = foldLower(*p);
}

QString CString256::MakeQString() const {
    return QString::fromLatin1(text);
}

int CString256::print(char* buffer) const {
    std::strcat(buffer, text);
    const int before = static_cast<int>(std::strlen(buffer));
    buffer[before] = '\n';
    buffer[before + 1] = 0;
    return before;
}

int CString256::print(int fd) const {
    char line[max_length + 2];
    const int n = length();
    std::memcpy(line, text, n);
    line[n] = '\n';
    return ::write(fd, line, n + 1) == n + 1 ? 0 : -1;
}

int CString256::beginsWith(const CString256* prefix, unsigned char nocase) const {
    return beginsWith(prefix->text, nocase);
}

int CString256::beginsWith(const char* prefix, unsigned char nocase) const {
    const size_t n = std::strlen(prefix);
    if (nocase != 0)
        return STRNCMP(text, prefix, static_cast<int>(n)) == 0;
    return std::strncmp(text, prefix, n) == 0;
}

int CString256::endsWith(const CString256* suffix, unsigned char nocase) const {
    return endsWith(suffix->text, nocase);
}

int CString256::endsWith(const char* suffix, unsigned char nocase) const {
    const size_t n = std::strlen(suffix);
    const size_t own = std::strlen(text);
    if (own < n)
        return 0;
    const char* tail = text + own - n;
    if (nocase != 0)
        return STRNCMP(tail, suffix, static_cast<int>(n)) == 0;
    return std::strncmp(tail, suffix, n) == 0;
}

void CString256::flatten_list(char separator, const CList<CString256>& list) {
    text[0] = 0;
    int index = 0;
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next) {
        *this += node->data.text;
        if (++index < list.count)
            *this += separator;
    }
}

void CString256::parse_into_list(const char* delimiters, CList<CString256>& list) const {
    char temporary[max_length + 1];
    std::strcpy(temporary, text);
    list.clear();
    char* state = nullptr;
    for (char* token = strtok_r(temporary, delimiters, &state); token != nullptr;
         token = strtok_r(nullptr, delimiters, &state))
        list.append(CString256(token));
}

void CString256::change_suffix(const char* suffix) {
    if (char* dot = std::strrchr(text, '.'))
        *dot = 0;
    *this += ".";
    *this += suffix;
}

void CString256::filter_to_alnum_or_punct() {
    char* out = text;
    for (const char* p = text; *p != 0; ++p) {
        const auto c = static_cast<unsigned char>(*p);
        const bool keep =
            c < 128 ? (std::isalnum(c) || std::ispunct(c)) : (std::iswalnum(c) || std::iswpunct(c));
        if (keep)
            *out++ = *p;
    }
    *out = 0;
}

void CString256::match_case_exact(const CString256& other, float* score) const {
    *score = (text[0] != 0 && std::strcmp(text, other.text) == 0) ? 1.0f : 0.0f;
}

void CString256::match_nocase_exact(const CString256& other, float* score) const {
    char a[max_length + 1], b[max_length + 1];
    lowerCopy(text, a);
    lowerCopy(other.text, b);
    *score = (a[0] != 0 && std::strcmp(a, b) == 0) ? 1.0f : 0.0f;
}

void CString256::match_case_partial(const CString256& other, float* score) const {
    *score = (other.text[0] != 0 && std::strstr(text, other.text) != nullptr) ? 1.0f : 0.0f;
}

void CString256::match_nocase_partial(const CString256& other, float* score) const {
    char a[max_length + 1], b[max_length + 1];
    lowerCopy(text, a);
    lowerCopy(other.text, b);
    *score = (b[0] != 0 && std::strstr(a, b) != nullptr) ? 1.0f : 0.0f;
}

void CString256::approximate(const CString256& other, bool nocase, float* score) const {
    char t[max_length + 1], p[max_length + 1];
    if (nocase) {
        lowerCopy(text, t);
        lowerCopy(other.text, p);
    } else {
        std::strcpy(t, text);
        std::strcpy(p, other.text);
    }
    const char* cursor = t;
    int matched = 0;
    for (const char* c = p; *c != 0 && *cursor != 0; ++c) {
        if (const char* found = std::strchr(cursor, *c)) {
            cursor = found + 1;
            ++matched;
        }
    }
    const auto pl = static_cast<float>(std::strlen(p));
    const auto tl = static_cast<float>(std::strlen(t));
    const auto m = static_cast<float>(matched);
    *score = 1.0f - (std::fabs(tl - m) + std::fabs(pl - m)) / (pl + tl);
}

void CString256::match_case_approximate(const CString256& other, float* score) const {
    approximate(other, false, score);
}

void CString256::match_nocase_approximate(const CString256& other, float* score) const {
    approximate(other, true, score);
}

namespace {

using Finder = const char* (*)(const char*, const char*);

void matchWildcard(const char* text, const CList<CString256>& pieces, Finder find, float* score) {
    const char* from = text;
    for (const elem<CString256>* node = pieces.first; node != nullptr; node = node->next) {
        const char* found = find(from, node->data.c_str());
        if (found == nullptr) {
            *score = 0.0f;
            return;
        }
        from = found + node->data.length();
    }
    *score = 1.0f;
}

const char* findCase(const char* haystack, const char* needle) {
    return std::strstr(haystack, needle);
}
const char* findNocase(const char* haystack, const char* needle) {
    return STRSTR(haystack, needle);
}

} // namespace

void CString256::match_wildcard_case(const CList<CString256>& pieces, float* score) const {
    matchWildcard(text, pieces, findCase, score);
}

void CString256::match_wildcard_nocase(const CList<CString256>& pieces, float* score) const {
    matchWildcard(text, pieces, findNocase, score);
}

void CString256::match(void (*matcher)(void*, void*, float*), void* data, float* score) {
    matcher(this, data, score);
}

char* STRSTR(const char* haystack, const char* needle) {
    if (*needle == 0) {
        // Deliberately one byte before the haystack (position -1 for callers that subtract).
        return reinterpret_cast<char*>(reinterpret_cast<uintptr_t>(haystack) - 1);
    }
    for (const char* start = haystack; *start != 0; ++start) {
        const char* h = start;
        const char* n = needle;
        while (*n != 0 && foldUpper(*h) == foldUpper(*n)) {
            ++h;
            ++n;
        }
        if (*n == 0)
            return const_cast<char*>(start);
    }
    return nullptr;
}

int STRNCMP(const char* a, const char* b, int n) {
    for (int i = 0; i < n; ++i) {
        const auto ra = static_cast<unsigned char>(a[i]);
        const auto rb = static_cast<unsigned char>(b[i]);
        if (foldUpper(a[i]) != foldUpper(b[i]))
            return ra - rb;
        if (ra == 0)
            return 0;
    }
    return 0;
}

namespace {

template <void (CString256::*Method)(const CString256&, float*) const>
void adapt(void* subject, void* other, float* score) {
    const CString256 temporary(static_cast<const char*>(other));
    (static_cast<CString256*>(subject)->*Method)(temporary, score);
}

template <void (CString256::*Method)(const CList<CString256>&, float*) const>
void adaptWildcard(void* subject, void* pieces, float* score) {
    const CString256 temporary(static_cast<const char*>(subject));
    (temporary.*Method)(*static_cast<const CList<CString256>*>(pieces), score);
}

} // namespace

void match_wildcard_case_256(void* subject, void* pieces, float* score) {
    adaptWildcard<&CString256::match_wildcard_case>(subject, pieces, score);
}
void match_wildcard_nocase_256(void* subject, void* pieces, float* score) {
    adaptWildcard<&CString256::match_wildcard_nocase>(subject, pieces, score);
}
void matcher_case_exact_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_case_exact>(subject, other, score);
}
void matcher_nocase_exact_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_nocase_exact>(subject, other, score);
}
void matcher_case_partial_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_case_partial>(subject, other, score);
}
void matcher_nocase_partial_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_nocase_partial>(subject, other, score);
}
void matcher_case_approximate_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_case_approximate>(subject, other, score);
}
void matcher_nocase_approximate_256(void* subject, void* other, float* score) {
    adapt<&CString256::match_nocase_approximate>(subject, other, score);
}
