// The pattern operations of CText: range primitives, the between-patterns family, pattern
// replacement and list extraction. Every member of the family is one search (find_span) and
// at most one copy (extract) and one edit (edit_first), set by its case rule, where its close
// search starts, and which part of the match it copies or edits.

#include "text/CText.h"

#include "text/Containers.h"

#include <algorithm>
#include <cstring>
#include <new>

namespace {

bool isPattern(const char* p) {
    return p != nullptr && *p != 0;
}

long patternLength(const char* p) {
    return static_cast<long>(std::strlen(p));
}

} // namespace

// Range primitives

std::unique_ptr<CText> CText::extract_between(long from, long to) const {
    if (buffer_ == nullptr)
        return nullptr;
    if (from > to)
        return std::unique_ptr<CText>(new (std::nothrow) CText());
    std::unique_ptr<CText> piece(new (std::nothrow) CText(nullptr));
    from = std::max(from, 0L);
    to = std::min(to, static_cast<long>(length_) - 1);
    if (piece != nullptr && from <= to) {
        const char* begin = buffer_ + from;
        piece->assign_bytes(begin, static_cast<long>(strnlen(begin, to - from + 1)));
    }
    return piece;
}

void CText::extract_between(long from, long to, CText& out) const {
    if (const std::unique_ptr<CText> piece = extract_between(from, to))
        out = *piece;
}

void CText::remove_range(long from, long to) {
    if (buffer_ == nullptr || from > to)
        return;
    from = std::max(from, 0L);
    to = std::min(to, static_cast<long>(length_) - 1);
    if (from > to)
        return;
    std::memmove(buffer_ + from, buffer_ + to + 1, static_cast<size_t>(length_ - to));
    length_ -= static_cast<int32_t>(to - from + 1);
}

void CText::insert_pattern(long at, const char* s) {
    std::unique_ptr<char[]> copy;
    s = detach(s, copy);
    if (buffer_ == nullptr || !isPattern(s))
        return;
    const long n = patternLength(s);
    at = clamp(at);
    if (!make_room(n))
        return;
    std::memmove(buffer_ + at + n, buffer_ + at, static_cast<size_t>(length_ - at + 1));
    std::memcpy(buffer_ + at, s, static_cast<size_t>(n));
    length_ += static_cast<int32_t>(n);
}

void CText::replace_range(long from, long to, const char* s) {
    std::unique_ptr<char[]> copy;
    s = detach(s, copy);
    if (buffer_ == nullptr || s == nullptr)
        return;
    remove_range(from, to);
    insert_pattern(from, s);
}

// The between-patterns family

bool CText::find_span(long start, const char* open, const char* close, Match match, CloseFrom from,
                      Span& span) const {
    if (!isPattern(open) || !isPattern(close))
        return false;
    const long at = find(start, open, match);
    if (at < 0)
        return false;
    const long openLength = patternLength(open);
    const long inner = at + openLength;
    long closeSearch = inner;
    if (from == CloseFrom::open_start)
        closeSearch = at;
    else if (from == CloseFrom::open_length_past_open_end)
        closeSearch = inner + openLength;
    const long closeAt = find(closeSearch, close, match);
    if (closeAt < 0)
        return false;
    span = Span{at, inner, closeAt, closeAt + patternLength(close)};
    return true;
}

int CText::extract(long start, const char* open, const char* close, Match match, CloseFrom from,
                   Part part, CText& out) const {
    out = "";
    Span span{};
    if (!find_span(start, open, close, match, from, span))
        return 0;
    const std::unique_ptr<CText> piece = part == Part::inner
                                             ? extract_between(span.inner, span.close - 1)
                                             : extract_between(span.open, span.end - 1);
    if (piece == nullptr)
        return 0;
    out = *piece;
    return 1;
}

bool CText::edit_first(const char* open, const char* close, Match match, CloseFrom from, Part part,
                       const char* s) {
    Span span{};
    if (!find_span(0, open, close, match, from, span))
        return false;
    const long first = part == Part::inner ? span.inner : span.open;
    const long last = (part == Part::inner ? span.close : span.end) - 1;
    if (s != nullptr)
        replace_range(first, last, s);
    else
        remove_range(first, last);
    return true;
}

int CText::extract_and_edit(long start, const char* open, const char* close, Match match,
                            Part edited, const char* s, CText& out) {
    const int found = extract(start, open, close, match, CloseFrom::open_end, Part::inner, out);
    if (found != 0)
        edit_first(open, close, match, CloseFrom::open_end, edited, s);
    return found;
}

int CText::extract_between_patterns(long start, const char* open, const char* close,
                                    CText& out) const {
    return extract(start, open, close, Match::exact, CloseFrom::open_end, Part::inner, out);
}

int CText::extract_between_patterns(const char* open, const char* close, CText& out) const {
    return extract_between_patterns(0L, open, close, out);
}

int CText::extract_between_patterns_nocase(long start, const char* open, const char* close,
                                           CText& out) const {
    return extract(start, open, close, Match::nocase, CloseFrom::open_end, Part::inner, out);
}

int CText::extract_between_patterns_nocase(const char* open, const char* close, CText& out) const {
    return extract_between_patterns_nocase(0L, open, close, out);
}

int CText::extract_between_patterns_nocase_inclusive(long start, const char* open,
                                                     const char* close, CText& out) const {
    return extract(start, open, close, Match::nocase, CloseFrom::open_start, Part::whole, out);
}

int CText::extract_between_patterns_nocase_inclusive(const char* open, const char* close,
                                                     CText& out) const {
    return extract_between_patterns_nocase_inclusive(0L, open, close, out);
}

int CText::extract_and_remove_between_patterns(long start, const char* open, const char* close,
                                               CText& out) {
    return extract_and_edit(start, open, close, Match::exact, Part::whole, nullptr, out);
}

int CText::extract_and_remove_between_patterns(const char* open, const char* close, CText& out) {
    return extract_and_remove_between_patterns(0L, open, close, out);
}

int CText::extract_and_remove_between_patterns_nocase(long start, const char* open,
                                                      const char* close, CText& out) {
    return extract_and_edit(start, open, close, Match::nocase, Part::whole, nullptr, out);
}

int CText::extract_and_remove_between_patterns_nocase(const char* open, const char* close,
                                                      CText& out) {
    return extract_and_remove_between_patterns_nocase(0L, open, close, out);
}

int CText::extract_and_remove_between_patterns_nocase(const char* open, const char* close,
                                                      CString256& out) {
    CText inner(nullptr);
    const int found = extract_and_remove_between_patterns_nocase(open, close, inner);
    out = inner.buffer_;
    return found;
}

int CText::extract_and_remove_between_patterns_nocase_not_inclusive(long start, const char* open,
                                                                    const char* close, CText& out) {
    return extract_and_edit(start, open, close, Match::nocase, Part::inner, nullptr, out);
}

int CText::extract_and_remove_between_patterns_nocase_not_inclusive(const char* open,
                                                                    const char* close, CText& out) {
    return extract_and_remove_between_patterns_nocase_not_inclusive(0L, open, close, out);
}

int CText::extract_and_replace_between_patterns(long start, const char* open, const char* close,
                                                const char* s, CText& out) {
    return extract_and_edit(start, open, close, Match::exact, Part::whole, s, out);
}

int CText::extract_and_replace_between_patterns(const char* open, const char* close, const char* s,
                                                CText& out) {
    return extract_and_replace_between_patterns(0L, open, close, s, out);
}

void CText::remove_between_patterns(const char* open, const char* close) {
    edit_first(open, close, Match::exact, CloseFrom::open_end, Part::inner, nullptr);
}

void CText::remove_between_patterns_no_case(const char* open, const char* close) {
    edit_first(open, close, Match::nocase, CloseFrom::open_end, Part::inner, nullptr);
}

void CText::remove_between_patterns_inclusive(const char* open, const char* close) {
    edit_first(open, close, Match::exact, CloseFrom::open_end, Part::whole, nullptr);
}

void CText::remove_between_patterns_inclusive_nocase(const char* open, const char* close) {
    edit_first(open, close, Match::nocase, CloseFrom::open_end, Part::whole, nullptr);
}

void CText::remove_between_patterns_inclusive_all_nocase(const char* open, const char* close) {
    // Each pass removes at least the two patterns, so the loop ends; the patterns are read again
    // after every edit, hence copied when they lie within this text.
    std::unique_ptr<char[]> openCopy, closeCopy;
    open = detach(open, openCopy);
    close = detach(close, closeCopy);
    while (edit_first(open, close, Match::nocase, CloseFrom::open_end, Part::whole, nullptr)) {
    }
}

void CText::replace_between_patterns_inclusive(const char* open, const char* close, const char* s) {
    edit_first(open, close, Match::exact, CloseFrom::open_end, Part::whole, s);
}

void CText::replace_between_patterns_inclusive_nocase(const char* open, const char* close,
                                                      const char* s) {
    edit_first(open, close, Match::nocase, CloseFrom::open_end, Part::whole, s);
}

void CText::replace_between_patterns_nocase(const char* open, const char* close, const char* s) {
    edit_first(open, close, Match::nocase, CloseFrom::open_length_past_open_end, Part::inner, s);
}

void CText::remove_between_patterns_inclusive_all_nocase_between(const char* open,
                                                                 const char* close,
                                                                 const char* outerOpen,
                                                                 const char* outerClose) {
    CText content(nullptr);
    if (extract_between_patterns(outerOpen, outerClose, content) == 0 || content.buffer_ == nullptr)
        return;
    content.remove_between_patterns_inclusive_all_nocase(open, close);
    replace_between_patterns_nocase(outerOpen, outerClose, content.buffer_);
}

// Pattern replacement

void CText::replace_found(long start, const char* p, long n, const char* s) {
    if (buffer_ == nullptr || s == nullptr || !isPattern(p) || n < 1)
        return;
    const long at = find(start, p, Match::nocase);
    if (at >= 0)
        replace_range(at, at + n - 1, s);
}

void CText::replace_pattern_nocase(long start, const char* p, const char* s) {
    replace_found(start, p, p != nullptr ? patternLength(p) : 0, s);
}

void CText::replace_pattern_nocase(const char* p, const char* s) {
    replace_pattern_nocase(0L, p, s);
}

void CText::replace_pattern_nocase(long start, const CText& p, const CText& s) {
    if (p.buffer_ != nullptr && s.buffer_ != nullptr)
        replace_found(start, p.buffer_, p.length_, s.buffer_);
}

void CText::replace_pattern_nocase(const CText& p, const CText& s) {
    replace_pattern_nocase(0L, p, s);
}

void CText::replace_pattern_all_nocase(const char* p, const char* s) {
    std::unique_ptr<char[]> patternCopy, replacementCopy;
    p = detach(p, patternCopy);
    s = detach(s, replacementCopy);
    if (buffer_ == nullptr || s == nullptr || !isPattern(p))
        return;
    // Resuming after the inserted replacement keeps a replacement that contains p from being
    // replaced again, and so ends the loop.
    const long step = patternLength(s);
    for (long at = find(0, p, Match::nocase); at >= 0; at = find(at + step, p, Match::nocase))
        replace_pattern_nocase(at, p, s);
}

// List extraction

void CText::extract_list(const char* open, const char* close, CList<CString256>& list) {
    CText items(nullptr);
    if (extract_and_remove_between_patterns(open, close, items) == 0 || items.buffer_ == nullptr)
        return;
    list.clear();
    char* state = nullptr;
    for (char* item = strtok_r(items.buffer_, ",", &state); item != nullptr;
         item = strtok_r(nullptr, ",", &state))
        list.append(CString256(item));
}
