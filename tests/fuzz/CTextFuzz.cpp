// Drives random CText operations on random text, a small alphabet with NUL so that patterns meet
// it, and after each step compares the text with a std::string model of the same edits (nullopt:
// the no-buffer state); it must also stay terminated within whole blocks of capacity. text_tests
// replays tests/data/fuzz/CTextFuzz through this entry point, so the model runs in `make test`.

#include "text/CText.h"

#include <algorithm>
#include <cctype>
#include <climits>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string>

namespace {

using Model = std::optional<std::string>;

void require(bool ok, const char* what) {
    if (!ok) {
        std::fprintf(stderr, "CTextFuzz: %s\n", what);
        std::abort();
    }
}

Model modelOf(const CText& t) {
    return t.buffer() == nullptr ? Model() : Model(std::string(t.buffer(), size_t(t.length())));
}

/** What a search or strlen sees of s. */
std::string cString(const std::string& s) {
    return s.substr(0, s.find('\0'));
}

long find(const std::string& s, long start, const std::string& p, bool nocase) {
    const auto equal = [=](unsigned char x, unsigned char y) {
        return nocase ? std::toupper(x) == std::toupper(y) : x == y;
    };
    start = std::clamp(start, 0L, long(s.size()));
    const std::string region = cString(s.substr(size_t(start)));
    for (size_t i = 0; i + p.size() <= region.size(); ++i) {
        if (std::equal(p.begin(), p.end(), region.begin() + long(i), equal))
            return p.empty() && nocase ? start - 1 : start + long(i);
    }
    return -1;
}

void remove(std::string& s, long from, long to) {
    from = std::max(from, 0L);
    to = std::min(to, long(s.size()) - 1);
    if (from <= to)
        s.erase(size_t(from), size_t(to - from + 1));
}

void insert(std::string& s, long at, const std::string& inserted) {
    s.insert(size_t(std::clamp(at, 0L, long(s.size()))), cString(inserted));
}

void replaceAll(std::string& s, const std::string& p, const std::string& by) {
    for (long at = find(s, 0, p, true); !p.empty() && at >= 0;
         at = find(s, at + long(by.size()), p, true))
        s.replace(size_t(at), p.size(), by);
}

struct Session {
    const uint8_t* next;
    size_t left;
    std::unique_ptr<CText> text;
    Model model;

    void check() const {
        const CText& t = *text;
        require(modelOf(t) == model, "the text differs from the model");
        require(t.buffer() == nullptr ? t.capacity() == 0
                                      : t.length() <= t.capacity() && !t.buffer()[t.length()] &&
                                            t.capacity() % t.block() == 0,
                "unterminated, or a capacity not of whole blocks");
    }

    void step() {
        if (model.value_or("").size() > 1024) // keeps the quadratic replace_pattern_all fast
            return start();
        const std::string s = piece(16), p = pattern(), q = pattern();
        const long i = position(), j = position(), own = std::clamp(position(), 0L, long(size()));
        const unsigned kind = byte();
        const bool flag = kind & 1;
        const char* const self = text->buffer() + own;
        std::string m = model.value_or(""), tail = m.substr(size_t(own));
        switch (kind / 2 % 11) {
        case 0: // without a buffer appends do nothing, but for a character, which is assigned
            *text += s.c_str(), m += cString(s);
            break;
        case 1:
            text->append(s.data(), long(s.size())), m += s;
            break;
        case 2:
            *text += s[0];
            model = model ? m + s[0] : cString(s.substr(0, 1));
            return;
        case 3: // prepending is inserting at 0
            flag ? void(*text -= s.c_str()) : text->insert_pattern(i, s.c_str());
            insert(m, flag ? 0 : i, s);
            break;
        case 4:
            text->remove_range(i, j), remove(m, i, j);
            break;
        case 5: // a null replacement changes nothing
            text->replace_range(i, j, flag ? nullptr : s.c_str());
            if (!flag)
                remove(m, i, j), insert(m, i, s);
            break;
        case 6: {
            const std::unique_ptr<CText> part = text->extract_between(i, j);
            const long first = std::max(i, 0L), last = std::min(j, long(m.size()) - 1);
            const Model want = i > j ? Model("")
                               : first > last
                                   ? Model()
                                   : cString(m.substr(size_t(first), size_t(last - first + 1)));
            require(model ? part && modelOf(*part) == want : !part, "extract_between");
            break;
        }
        case 7:
            require((flag ? text->find_pattern_nocase(i, p.c_str())
                          : text->find_pattern(i, p.c_str())) == (model ? find(m, i, p, flag) : -1),
                    "find_pattern");
            break;
        case 8:
            text->replace_pattern_all_nocase(p.c_str(), flag && model ? self : q.c_str());
            replaceAll(m, p, flag && model ? cString(tail) : q);
            break;
        case 9: // the text as the source of its own edit, across growth that frees its buffer
            if (model && flag)
                text->append(self, long(tail.size())), m += tail;
            else if (model)
                text->insert_pattern(i, self), insert(m, i, tail);
            break;
        default: // edits of unmodelled meaning, for the sanitizers: patterns or out are the text
            if (model)
                text->remove_between_patterns_inclusive_all_nocase(self,
                                                                   text->buffer() + number(0, own));
            text->extract_and_remove_between_patterns_nocase(p.c_str(), q.c_str(), *text);
            model = modelOf(*text);
            return;
        }
        if (model)
            model = m;
    }

    /** The next input byte; 0 once the input is used up. */
    unsigned byte() { return left > 0 ? (--left, *next++) : 0; }
    long number(long lo, long hi) {
        const unsigned long high = byte(), v = high << 8 | byte();
        return lo + long(v % static_cast<unsigned long>(hi - lo + 1));
    }
    size_t size() const { return model ? model->size() : 0; }
    /** A position within the text or around it, often one at an end or an extreme. */
    long position() {
        const unsigned kind = byte() % 10;
        return kind == 0   ? LONG_MIN
               : kind == 1 ? LONG_MAX
               : kind == 2 ? long(size())
                           : number(-4, long(size()) + 4);
    }
    std::string pattern() { return byte() % 8 == 0 ? "" : cString(piece(4)); }
    std::string piece(long maxLength) {
        static constexpr char alphabet[] = "aAbB<>!-[],x \0";
        std::string s(size_t(number(1, maxLength)), 'a');
        for (char& c : s)
            c = alphabet[byte() % (sizeof alphabet - 1)];
        return s;
    }

    void start() {
        const std::string s = piece(64);
        const long a = number(0, long(s.size())), b = number(0, long(s.size()));
        if (byte() % 3 == 0) { // a small block makes the text grow often
            text = std::make_unique<CText>(s.c_str(), number(-1, 64)), model = cString(s);
        } else { // a range, whose end may lie before its start: the no-buffer state
            text = std::make_unique<CText>(s.c_str() + a, s.c_str() + b);
            model = a > b ? Model() : cString(s.substr(size_t(a), size_t(b - a + 1)));
        }
    }
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    Session session{data, size, nullptr, Model()};
    session.start();
    session.check();
    for (int steps = 0; steps < 64 && session.left > 0; ++steps) {
        session.step();
        session.check();
    }
    return 0;
}
