// Drives random sequences of CText operations on random text. After every step the text must be
// sound (terminated, within its capacity, a consistent no-buffer state); operations whose
// meaning is plain byte editing are also compared with a std::string model. Everything else
// runs for its memory safety under AddressSanitizer and UndefinedBehaviorSanitizer, with a few
// properties of its results checked.

#include "text/CText.h"
#include "text/Containers.h"

#include <QString>
#include <fuzzer/FuzzedDataProvider.h>

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

// Texts stay small enough for quadratic operations (replace_pattern_all_nocase) to run fast.
constexpr size_t kMaxText = 1024;
constexpr int kMaxSteps = 64;

// The expected text: nullopt for the no-buffer state.
using Model = std::optional<std::string>;

[[noreturn]] void fail(const char* what) {
    std::fprintf(stderr, "CTextFuzz: %s\n", what);
    std::abort();
}

void require(bool ok, const char* what) {
    if (!ok)
        fail(what);
}

std::string bytesOf(const CText& t) {
    return std::string(t.buffer(), static_cast<size_t>(t.length()));
}

void requireSound(const CText& t) {
    if (t.buffer() == nullptr) {
        require(t.length() == 0 && t.capacity() == 0, "no-buffer state with a length or capacity");
        return;
    }
    require(t.length() >= 0 && t.length() <= t.capacity(), "length beyond capacity");
    require(t.buffer()[t.length()] == '\0', "text not terminated");
    require(t.block() >= 1 && t.capacity() % t.block() == 0, "capacity not whole blocks");
}

Model modelOf(const CText& t) {
    return t.buffer() == nullptr ? Model() : Model(bytesOf(t));
}

/** The C string at the start of s: what a search or a strlen sees. */
std::string cString(const std::string& s) {
    return s.substr(0, s.find('\0'));
}

long clampTo(long position, size_t size) {
    return std::clamp(position, 0L, static_cast<long>(size));
}

bool sameBytes(const std::string& a, const std::string& b, bool nocase) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), [nocase](char x, char y) {
        const auto ux = static_cast<unsigned char>(x), uy = static_cast<unsigned char>(y);
        return nocase ? std::toupper(ux) == std::toupper(uy) : ux == uy;
    });
}

/** find_pattern / find_pattern_nocase over the C string that starts at the clamped start. */
long modelFind(const std::string& text, long start, const std::string& p, bool nocase) {
    start = clampTo(start, text.size());
    if (p.empty())
        return nocase ? start - 1 : start;
    const std::string region = cString(text.substr(static_cast<size_t>(start)));
    for (size_t i = 0; i + p.size() <= region.size(); ++i) {
        if (sameBytes(region.substr(i, p.size()), p, nocase))
            return start + static_cast<long>(i);
    }
    return -1;
}

void modelRemove(std::string& s, long from, long to) {
    if (from > to)
        return;
    from = std::max(from, 0L);
    to = std::min(to, static_cast<long>(s.size()) - 1);
    if (from <= to)
        s.erase(static_cast<size_t>(from), static_cast<size_t>(to - from + 1));
}

void modelInsert(std::string& s, long at, const std::string& inserted) {
    s.insert(static_cast<size_t>(clampTo(at, s.size())), inserted);
}

void modelReplaceAll(std::string& s, const std::string& p, const std::string& by) {
    for (long at = modelFind(s, 0, p, true); at >= 0;
         at = modelFind(s, at + static_cast<long>(by.size()), p, true)) {
        modelRemove(s, at, at + static_cast<long>(p.size()) - 1);
        modelInsert(s, at, by);
    }
}

class Session {
public:
    explicit Session(FuzzedDataProvider& input) : in(input) { start(); }

    void step() {
        switch (in.ConsumeIntegralInRange(0, 25)) {
        case 0:
            appendString();
            break;
        case 1:
            appendBytes();
            break;
        case 2:
            appendChar();
            break;
        case 3:
            prepend();
            break;
        case 4:
            insert();
            break;
        case 5:
            removeRange();
            break;
        case 6:
            replaceRange();
            break;
        case 7:
            extractBetween();
            break;
        case 8:
            findPattern();
            break;
        case 9:
            replaceAll();
            break;
        case 10:
            affixes();
            break;
        case 11:
            assign();
            break;
        case 12:
            copyAndAssign();
            break;
        case 13:
            resize();
            break;
        case 14:
            inPlace();
            break;
        case 15:
            appendOwnBytes();
            break;
        case 16:
            insertOwnString();
            break;
        case 17:
            replaceAllByOwnString();
            break;
        case 18:
            betweenPatterns();
            break;
        case 19:
            editBetweenPatterns();
            break;
        case 20:
            replacePattern();
            break;
        case 21:
            extractList();
            break;
        case 22:
            patternsFromTheText();
            break;
        case 23:
            reportLine();
            break;
        case 24:
            outIsTheTextItself();
            break;
        default:
            start();
            break;
        }
        requireSound(*text);
        requireSound(out);
        require(model.has_value() == (text->buffer() != nullptr), "no-buffer state differs");
        if (model)
            require(bytesOf(*text) == *model, "text differs from the model");
    }

private:
    // Random inputs. Bytes are drawn from a small alphabet so that patterns meet the text.

    std::string piece(size_t maxLength) {
        static constexpr char alphabet[] = {'a', 'A', 'b', 'B', '<', '>', '!',
                                            '-', '[', ']', ',', ' ', 'x', '\0'};
        std::string s(in.ConsumeIntegralInRange<size_t>(0, maxLength), 'a');
        for (char& c : s)
            c = alphabet[in.ConsumeIntegralInRange<size_t>(0, sizeof alphabet - 1)];
        return s;
    }
    std::string pattern() { return cString(piece(4)); }
    long position() {
        switch (in.ConsumeIntegralInRange(0, 9)) {
        case 0:
            return LONG_MIN;
        case 1:
            return LONG_MAX;
        default:
            return in.ConsumeIntegralInRange<long>(-4, static_cast<long>(size()) + 4);
        }
    }
    size_t size() const { return model ? model->size() : 0; }
    bool full() const { return size() > kMaxText; }
    /** A position of a byte of the text, or its end; 0 without text. */
    long inside() { return in.ConsumeIntegralInRange<long>(0, static_cast<long>(size())); }

    void resync() { model = modelOf(*text); }

    void start() {
        const std::string s = piece(64);
        switch (in.ConsumeIntegralInRange(0, 5)) {
        case 0:
            text = std::make_unique<CText>();
            break;
        case 1:
            text = std::make_unique<CText>(s.c_str());
            break;
        case 2:
            text = std::make_unique<CText>(s.c_str(), in.ConsumeIntegralInRange<long>(-2, 64));
            break;
        case 3: {
            const long first = in.ConsumeIntegralInRange<long>(0, static_cast<long>(s.size()));
            const long last = in.ConsumeIntegralInRange<long>(0, static_cast<long>(s.size()));
            const char* base = s.c_str();
            text = std::make_unique<CText>(base + first, base + last);
            break;
        }
        case 4:
            text = std::make_unique<CText>(in.ConsumeIntegral<long>());
            break;
        default:
            text = std::make_unique<CText>(static_cast<const char*>(nullptr));
            break;
        }
        resync();
    }

    // Operations compared with the model.

    void appendString() {
        if (full())
            return;
        const std::string s = piece(32);
        *text += s.c_str();
        if (model)
            *model += cString(s);
    }
    void appendBytes() {
        if (full())
            return;
        const std::string s = piece(32);
        text->append(s.data(), static_cast<long>(s.size()));
        if (model)
            *model += s;
    }
    void appendChar() {
        const char c = piece(1).append(1, 'c')[0];
        *text += c;
        if (!model)
            model = cString(std::string(1, c));
        else
            model->push_back(c);
    }
    void prepend() {
        if (full())
            return;
        const std::string s = piece(16);
        *text -= s.c_str();
        if (model)
            modelInsert(*model, 0, cString(s));
    }
    void insert() {
        if (full())
            return;
        const long at = position();
        const std::string s = piece(16);
        text->insert_pattern(at, s.c_str());
        if (model)
            modelInsert(*model, at, cString(s));
    }
    void removeRange() {
        const long from = position(), to = position();
        if (in.ConsumeBool() && text->buffer() != nullptr) {
            const long first = inside(), last = inside();
            text->remove_range(text->buffer() + first, text->buffer() + last);
            if (model)
                modelRemove(*model, first, last);
            return;
        }
        text->remove_range(from, to);
        if (model)
            modelRemove(*model, from, to);
    }
    void replaceRange() {
        const long from = position(), to = position();
        const std::string s = piece(16);
        const bool null = in.ConsumeBool();
        text->replace_range(from, to, null ? nullptr : s.c_str());
        if (model && !null) {
            modelRemove(*model, from, to);
            modelInsert(*model, from, cString(s));
        }
    }
    void extractBetween() {
        const long from = position(), to = position();
        const std::unique_ptr<CText> part = text->extract_between(from, to);
        require((part == nullptr) == !model, "extract_between answers null only without buffer");
        if (part == nullptr)
            return;
        requireSound(*part);
        const long first = std::max(from, 0L);
        const long last = std::min(to, static_cast<long>(model->size()) - 1);
        if (from > to)
            require(part->buffer() != nullptr && part->length() == 0, "inverted range not empty");
        else if (first > last)
            require(part->buffer() == nullptr, "range beyond the end has a buffer");
        else
            require(bytesOf(*part) == cString(model->substr(static_cast<size_t>(first),
                                                            static_cast<size_t>(last - first + 1))),
                    "extract_between differs from the model");
    }
    void findPattern() {
        const long start = position();
        const std::string p = pattern();
        const bool nocase = in.ConsumeBool();
        const long found = nocase ? text->find_pattern_nocase(start, p.c_str())
                                  : text->find_pattern(start, p.c_str());
        require(found == (model ? modelFind(*model, start, p, nocase) : -1),
                "find_pattern differs from the model");
    }
    void replaceAll() {
        if (full())
            return;
        const std::string p = pattern(), by = cString(piece(8));
        text->replace_pattern_all_nocase(p.c_str(), by.c_str());
        if (model && !p.empty())
            modelReplaceAll(*model, p, by);
    }
    void affixes() {
        const std::string p = pattern();
        const bool fits = model && p.size() <= model->size();
        const bool begins = fits && sameBytes(model->substr(0, p.size()), p, true);
        const bool ends = fits && sameBytes(model->substr(model->size() - p.size()), p, true);
        require(text->beginsWith_nocase(p.c_str()) == begins, "beginsWith_nocase differs");
        require(text->endsWith_nocase(p.c_str()) == ends, "endsWith_nocase differs");
        const CText other(p.c_str());
        require(text->beginsWith_case(other) ==
                    (fits && sameBytes(model->substr(0, p.size()), p, false)),
                "beginsWith_case differs");
    }
    void assign() {
        const std::string s = piece(32);
        switch (in.ConsumeIntegralInRange(0, 5)) {
        case 0:
            *text = s.c_str();
            break;
        case 1:
            *text = s.empty() ? '\0' : s[0];
            break;
        case 2:
            *text = in.ConsumeIntegral<long>();
            break;
        case 3:
            *text = QString::fromUtf8(s.data(), static_cast<qsizetype>(s.size()));
            break;
        case 4:
            *text = QByteArray(s.data(), static_cast<qsizetype>(s.size()));
            break;
        default:
            text->init_from_chars(nullptr);
            break;
        }
        resync(); // every form but the QString one is plain; see the unit tests for those
    }
    void copyAndAssign() {
        const CText copy(*text);
        requireSound(copy);
        if (text->buffer() != nullptr)
            require(bytesOf(copy) == bytesOf(*text) && copy.capacity() == text->capacity() &&
                        copy.block() == text->block(),
                    "copy differs");
        CText target(piece(8).c_str());
        const std::string before = bytesOf(target);
        target = copy;
        require(bytesOf(target) == (copy.buffer() != nullptr ? bytesOf(copy) : before),
                "text assignment differs");
        if (in.ConsumeBool() && !full()) {
            *text += copy;
            if (model && copy.buffer() != nullptr)
                *model += bytesOf(copy);
        }
    }
    void resize() {
        if (text->capacity() > (1 << 20))
            return;
        const int32_t before = text->capacity();
        const long grown = text->resize_by(in.ConsumeIntegralInRange<long>(-100, 100000));
        require(grown == 0 ? !model : grown > before, "resize_by did not grow");
    }
    void inPlace() {
        switch (in.ConsumeIntegralInRange(0, 2)) {
        case 0:
            text->replace_nil_chars_by_space();
            if (model)
                std::replace(model->begin(), model->end(), '\0', ' ');
            break;
        case 1:
            text->to_lower();
            if (model)
                for (char& c : *model)
                    c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
            break;
        default:
            text->reverse();
            if (model)
                std::reverse(model->begin(), model->end());
            break;
        }
    }

    // The text as the source of its own edit.

    void appendOwnBytes() {
        if (!model || full())
            return;
        const long from = inside();
        const long n = in.ConsumeIntegralInRange<long>(0, static_cast<long>(size()) - from);
        if (in.ConsumeBool()) {
            text->append(text->buffer() + from, n);
            *model += model->substr(static_cast<size_t>(from), static_cast<size_t>(n));
        } else {
            *text += *text;
            *model += *model;
        }
    }
    void insertOwnString() {
        if (!model || full())
            return;
        const long from = inside(), at = position();
        const std::string s = cString(model->substr(static_cast<size_t>(from)));
        if (in.ConsumeBool()) {
            text->insert_pattern(at, text->buffer() + from);
            modelInsert(*model, at, s);
        } else {
            *text -= text->buffer() + from;
            modelInsert(*model, 0, s);
        }
    }
    void replaceAllByOwnString() {
        if (!model || full())
            return;
        const std::string p = pattern();
        const long from = std::max(0L, static_cast<long>(size()) - 8);
        const std::string by = cString(model->substr(static_cast<size_t>(from)));
        text->replace_pattern_all_nocase(p.c_str(), text->buffer() + from);
        if (!p.empty())
            modelReplaceAll(*model, p, by);
    }

    // Operations checked by their properties.

    void betweenPatterns() {
        const long start = position();
        const std::string open = pattern(), close = pattern();
        const std::string before = model.value_or("");
        int found = 0;
        switch (in.ConsumeIntegralInRange(0, 2)) {
        case 0:
            found = text->extract_between_patterns(start, open.c_str(), close.c_str(), out);
            break;
        case 1:
            found = text->extract_between_patterns_nocase(start, open.c_str(), close.c_str(), out);
            break;
        default:
            found = text->extract_between_patterns_nocase_inclusive(start, open.c_str(),
                                                                    close.c_str(), out);
            break;
        }
        require(modelOf(*text) == model, "an extraction changed the text");
        require(found == 0 ? bytesOf(out).empty() : before.find(bytesOf(out)) != std::string::npos,
                "extracted bytes are not the text's");
    }
    void editBetweenPatterns() {
        // From start 0 the span edited is the one extracted, so the length change is known.
        const long start = in.ConsumeBool() ? 0 : position();
        const std::string open = pattern(), close = pattern(), by = cString(piece(8));
        const long before = text->length();
        const long patterns = static_cast<long>(open.size() + close.size());
        long removed = 0;
        int found = 0;
        switch (in.ConsumeIntegralInRange(0, 3)) {
        case 0:
            found =
                text->extract_and_remove_between_patterns(start, open.c_str(), close.c_str(), out);
            removed = patterns + out.length();
            break;
        case 1:
            found = text->extract_and_remove_between_patterns_nocase(start, open.c_str(),
                                                                     close.c_str(), out);
            removed = patterns + out.length();
            break;
        case 2:
            found = text->extract_and_remove_between_patterns_nocase_not_inclusive(
                start, open.c_str(), close.c_str(), out);
            removed = out.length();
            break;
        default:
            found = text->extract_and_replace_between_patterns(start, open.c_str(), close.c_str(),
                                                               by.c_str(), out);
            removed = patterns + out.length() - static_cast<long>(by.size());
            break;
        }
        if (found == 0)
            require(modelOf(*text) == model && out.length() == 0, "a miss changed something");
        else if (start == 0)
            require(text->length() == before - removed, "the edit does not match the extraction");
        resync();
    }
    void replacePattern() {
        const long start = position();
        const std::string p = pattern(), by = cString(piece(8));
        const int operation = in.ConsumeIntegralInRange(0, 8);
        switch (operation) {
        case 0:
            text->replace_pattern_nocase(start, p.c_str(), by.c_str());
            break;
        case 1:
            text->replace_pattern_nocase(start, CText(p.c_str()), CText(by.c_str()));
            break;
        case 2:
            text->remove_between_patterns(p.c_str(), by.c_str());
            break;
        case 3:
            text->remove_between_patterns_no_case(p.c_str(), by.c_str());
            break;
        case 4:
            text->remove_between_patterns_inclusive_nocase(p.c_str(), by.c_str());
            break;
        case 5:
            text->remove_between_patterns_inclusive_all_nocase(p.c_str(), by.c_str());
            break;
        case 6:
            text->replace_between_patterns_inclusive_nocase(p.c_str(), by.c_str(), "r");
            break;
        case 7:
            text->replace_between_patterns_nocase(p.c_str(), by.c_str(), "r");
            break;
        default:
            text->remove_between_patterns_inclusive_all_nocase_between(p.c_str(), by.c_str(), "[",
                                                                       "]");
            break;
        }
        // The last form puts its content back by a different search, which may change the
        // text whatever the inner patterns are.
        if (model && p.empty() && operation != 8)
            require(bytesOf(*text) == *model, "an empty pattern changed the text");
        resync();
    }
    void extractList() {
        CList<CString256> list;
        list.append(CString256("kept"));
        const std::string open = pattern(), close = pattern();
        text->extract_list(open.c_str(), close.c_str(), list);
        for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
            require(node->data.length() > 0, "extract_list kept an empty item");
        resync();
    }
    void patternsFromTheText() {
        if (!model)
            return;
        const char* open = text->buffer() + inside();
        const char* close = text->buffer() + inside();
        text->remove_between_patterns_inclusive_all_nocase(open, close);
        resync();
    }
    void reportLine() {
        if (full())
            return;
        CList<CString256> list;
        list.append(CString256(pattern().c_str()));
        text->append_named_value("n", in.ConsumeIntegral<long>());
        text->pretty_append_named_list(pattern().c_str(), list);
        resync();
    }
    void outIsTheTextItself() {
        const std::string open = pattern(), close = pattern();
        text->extract_and_remove_between_patterns_nocase(open.c_str(), close.c_str(), *text);
        text->extract_between(position(), position(), *text);
        resync();
    }

    FuzzedDataProvider& in;
    std::unique_ptr<CText> text;
    CText out;
    Model model;
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    FuzzedDataProvider input(data, size);
    Session session(input);
    for (int steps = 0; steps < kMaxSteps && input.remaining_bytes() > 0; ++steps)
        session.step();
    return 0;
}
