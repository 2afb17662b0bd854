#pragma once

#include "text/CString256.h"

#include <QByteArray>
#include <QString>

#include <concepts>
#include <cstdint>
#include <filesystem>
#include <memory>

template <class T>
struct CList;

/**
 * The program's growable text: a whole web page, message body or file held in one heap buffer
 * that grows by whole blocks (32000 bytes unless a constructor says otherwise).
 *
 * Storage. The object owns its buffer of capacity() + 1 bytes; buffer()[length()] is always a
 * NUL. Sizing for n bytes gives the smallest multiple of block() strictly greater than n, so a
 * 32000-byte text has a capacity of 64000. The text may hold NUL bytes of its own (append(),
 * operator+=(char)); searches read it as a C string and stop at the first one.
 *
 * The no-buffer state. After construction from a null C string, a failed allocation or an
 * inverted (begin, end) pair, buffer() is null and length() and capacity() are 0. This is not
 * the empty text: appends, edits and operator=(const CText&) quietly do nothing on it, searches
 * answer -1 and tests 0. Assigning a C string, a character or a number gives it a buffer again.
 *
 * A pointer from buffer() stays valid until the text grows, is assigned or is destroyed.
 *
 * Positions are signed byte offsets from the start of the text; ranges include both ends.
 * Positions beyond the text are clamped into it, never trusted: see each operation.
 *
 * Numbers. The number overloads take long or long long (the same width on this platform), and
 * a character overload exists beside them. An int argument (5, 0, an int32_t) is therefore
 * ambiguous and does not compile: write 5L for a number and 'c' or static_cast<char>(c) for a
 * character. The report lines take only long, so append_named_value("n", 3) compiles.
 *
 * Failures are never thrown nor reported: operations answer 0, null or -1, file operations a
 * status (0, or the errno of the call that failed; ENOMEM when no buffer could be had).
 * Single-threaded, like the rest of the text layer.
 */
class CText {
public:
    static constexpr int32_t default_block = 32000;

    /** The empty text with a buffer of one block. */
    CText();
    /**
     * A null s gives the no-buffer state. Explicit, as are the number forms: no C string or
     * number turns into a CText unasked.
     */
    explicit CText(const char* s);
    /**
     * As CText(s), growing by the given block; a block below 1 is taken as default_block.
     * A literal 0 as block is ambiguous with the (begin, end) form and does not compile.
     */
    CText(const char* s, long block);
    /**
     * The bytes from begin to end inclusive, up to the first NUL among them. End before begin
     * (or a null begin) gives the no-buffer state.
     */
    CText(const char* begin, const char* end);
    /** The decimal form of v. */
    explicit CText(long v);
    explicit CText(long long v);
    /** A copy, label included; the copy of a text with no buffer is empty, of capacity 0. */
    CText(const CText& other);
    /**
     * The whole content of a file, read by init_from_file() (its status is lost: test
     * buffer() or use init_from_file() itself). Only a std::filesystem::path selects this
     * form, so that a string meant as text is never taken for a file name.
     */
    template <class Path>
    requires std::same_as<Path, std::filesystem::path>
    explicit CText(const Path& file, long block = default_block) {
        block_ = checked_block(block);
        init_from_file(file);
    }
    ~CText();

    /**
     * Replaces the text by s and empties the label; a null s leaves the no-buffer state (the
     * label kept). Allocation failure also leaves the no-buffer state.
     */
    CText& init_from_chars(const char* s);
    /**
     * A copy of other: bytes, length, capacity, block and label. When other has no buffer the
     * result is empty with capacity 0 and block default_block.
     */
    CText& init_from_ctext(const CText& other);

    /** A null s is taken as the empty text. */
    CText& operator=(const char* s);
    /** The one character c; a NUL gives the empty text. */
    CText& operator=(char c);
    CText& operator=(long v);
    CText& operator=(long long v);
    /**
     * The ISO Latin-1 bytes of s, up to its first U+0000. An empty s, or one with a character
     * outside Latin-1, leaves the text unchanged.
     */
    CText& operator=(const QString& s);
    /** The block's bytes up to its first NUL. */
    CText& operator=(const QByteArray& block);
    /**
     * Copies other, but does nothing at all when either side has no buffer: such an assignment
     * is ignored rather than clearing the target.
     */
    CText& operator=(const CText& other);

    /**
     * Adds block × (n ÷ block + 1) bytes of capacity, at least one whole block (a negative n
     * counts as 0). Answers the new capacity, or 0 with nothing changed when there is no
     * buffer or no memory.
     */
    long resize_by(long n);

    // Appending. Each checks the spare room once and grows at most once; when growth fails
    // nothing is appended. With no buffer they do nothing, except operator+=(char). A source
    // that lies within this text itself is safe.

    /** With no buffer, acts as operator=(c). A NUL is stored as a byte of the text. */
    CText& operator+=(char c);
    /** Exactly n bytes from p (which must hold them), NULs included; nothing for a null p. */
    CText& append(const char* p, long n);
    /** Other's length() bytes; nothing when other has no buffer. */
    CText& operator+=(const CText& other);
    /** A null s appends nothing. */
    CText& operator+=(const char* s);
    CText& operator+=(const CString256& s);
    /** The Latin-1 form of s, by the rule of operator=(const QString&) (nothing when it fails). */
    CText& operator+=(const QString& s);
    CText& operator+=(long v);
    CText& operator+=(long long v);
    /** Prepends s. A null s changes nothing. */
    CText& operator-=(const char* s);

    // Report lines for diagnostic listings. The pretty forms append "\t\t", name, " : ", value,
    // "\r\r"; the plain ones name, " ", value, then a bullet (U+2022 in UTF-8) and "\r". List
    // elements are separated by ",". A string literal as value goes through CString256 and is
    // cut at 255 bytes; pass a CText for longer values.

    void pretty_append_named_value(const char* name, const CText& value);
    void pretty_append_named_value(const char* name, const CString256& value);
    void pretty_append_named_value(const char* name, long value);
    void pretty_append_named_list(const char* name, const CList<CString256>& values);
    void append_named_value(const char* name, const CText& value);
    void append_named_value(const char* name, const CString256& value);
    void append_named_value(const char* name, long value);
    void append_named_list(const char* name, const CList<CString256>& values);

    // In-place edits of the length() bytes; nothing happens with no buffer.

    /** Every NUL within the text becomes a space, making it one C string. */
    void replace_nil_chars_by_space();
    void to_lower();
    void reverse();
    /** The same as reverse(). */
    void reverse_text();
    /** Reverses the first n bytes of s in place; a null s or n below 2 changes nothing. */
    static void reverse(char* s, long n);
    /**
     * Writes the decimal form of v to out: at most max - 1 digits (the least significant are
     * kept), a "-" for a negative value, a terminator. out must hold max + 1 bytes.
     */
    static void itoa(char* out, short max, long long v);
    static void itoa(char* out, short max, long v);

    // Search. start is clamped to [0, length()]. A null pattern or no buffer answers -1.

    /** The position of the first p at or after start, or -1. An empty p answers start. */
    long find_pattern(long start, const char* p) const;
    long find_pattern(const char* p) const;
    /**
     * The same without regard to case (STRSTR). An empty p answers start - 1, so from 0 it
     * reads as absent.
     */
    long find_pattern_nocase(long start, const char* p) const;
    long find_pattern_nocase(const char* p) const;
    /** The free STRSTR, STRNCMP of CString256.h, for code written against this class. */
    static char* STRSTR(const char* haystack, const char* needle);
    static int STRNCMP(const char* a, const char* b, int n);

    // Prefix and suffix tests over the pattern's length() (or strlen) bytes: 1 or 0. A pattern
    // longer than the text, or no buffer on either side, answers 0; an empty pattern matches.

    int beginsWith_case(const CText& p) const;
    int beginsWith_nocase(const CText& p) const;
    int beginsWith_nocase(const char* p) const;
    int endsWith_case(const CText& p) const;
    int endsWith_nocase(const CText& p) const;
    int endsWith_nocase(const char* p) const;

    /** 1 when no byte of the text needs URL encoding (NeedsURLEncoding), else 0. */
    int isURLEncoded() const;
    /**
     * 1 when every byte is a letter, digit, safe, extra, reserved or punctuation character of
     * the URL grammar (national characters such as "{" are not), else 0.
     */
    int isSafeEncoded() const;

    // Whole files. Status: 0, or the errno of the call that failed (ENOMEM without memory).

    /**
     * Replaces the text by the file's bytes, NULs turned into spaces, sized by the capacity
     * rule for the file's size. A file that cannot be opened leaves the empty text; one that
     * fails while being read leaves what was read.
     */
    int init_from_file(const std::filesystem::path& file);
    /** As init_from_file(), but a file that does not exist leaves the text as it was. */
    int operator<<(const char* path);
    /** Appends the file's content, read as by init_from_file(); nothing when it fails. */
    int append_file(const std::filesystem::path& file);
    /**
     * Writes the text to a new file at path: an existing file there is deleted first, so hard
     * links to it and programs that have it open keep the old content.
     */
    int operator>>(const char* path) const;
    /** Overwrites an existing file with the text; answers 0, writing nothing, when there is none.
     */
    int write_to_existing_file(const std::filesystem::path& file) const;

    // Pattern operations (CTextPatterns.cpp). Patterns are C strings; a null or empty pattern
    // is taken as absent. Searches from start clamp it as find_pattern() does. Patterns and
    // replacements may lie within this text (they are read before it changes) but not within
    // an out parameter, which is emptied first.

    /**
     * A new text owned by the caller holding the bytes from..to, up to the first NUL among
     * them; null when this text has no buffer. from > to gives an empty text; otherwise from is
     * raised to 0 and to lowered to length() - 1, and a range that then starts beyond the end
     * gives a text with no buffer.
     */
    std::unique_ptr<CText> extract_between(long from, long to) const;
    /** out = extract_between(from, to), by operator=(const CText&) (ignored without buffers). */
    void extract_between(long from, long to, CText& out) const;
    /**
     * Removes the bytes from..to. Nothing happens when from > to as given; then the range is
     * clamped into the text, and nothing happens when it lies wholly outside.
     */
    void remove_range(long from, long to);
    /**
     * The same with pointers into buffer(). A template only so that a literal 0 selects the
     * position form above.
     */
    template <class Char>
    requires std::same_as<Char, char>
    void remove_range(const Char* from, const Char* to) {
        remove_range(offset_of(from), offset_of(to));
    }
    /**
     * Inserts s before position at, which is clamped to [0, length()]. A null or empty s
     * changes nothing.
     */
    void insert_pattern(long at, const char* s);
    /** The same with a pointer into buffer() (a template for the reason given above). */
    template <class Char>
    requires std::same_as<Char, char>
    void insert_pattern(const Char* at, const char* s) { insert_pattern(offset_of(at), s); }
    /** remove_range(from, to), then insert_pattern(from, s); nothing at all when s is null. */
    void replace_range(long from, long to, const char* s);

    // Between-pattern operations. The ones with an out parameter empty it first, then search
    // open from start (0 in the forms without start) and close after the end of the open match,
    // and answer 1 when both were found, 0 otherwise (the text unchanged). Their edit of the
    // text always acts on the first match searched from position 0, whatever start was. The
    // case of the search follows the name: _nocase / _no_case ignore it.

    /** Copies what lies between the patterns to out. */
    int extract_between_patterns(long start, const char* open, const char* close, CText& out) const;
    int extract_between_patterns(const char* open, const char* close, CText& out) const;
    int extract_between_patterns_nocase(long start, const char* open, const char* close,
                                        CText& out) const;
    int extract_between_patterns_nocase(const char* open, const char* close, CText& out) const;
    /**
     * Copies the patterns and what lies between them to out. close is searched from the first
     * byte of the open match, so it may be found within the open pattern itself.
     */
    int extract_between_patterns_nocase_inclusive(long start, const char* open, const char* close,
                                                  CText& out) const;
    int extract_between_patterns_nocase_inclusive(const char* open, const char* close,
                                                  CText& out) const;
    /** Copies the inner bytes to out, then removes the first whole span (patterns included). */
    int extract_and_remove_between_patterns(long start, const char* open, const char* close,
                                            CText& out);
    int extract_and_remove_between_patterns(const char* open, const char* close, CText& out);
    int extract_and_remove_between_patterns_nocase(long start, const char* open, const char* close,
                                                   CText& out);
    int extract_and_remove_between_patterns_nocase(const char* open, const char* close, CText& out);
    /** As above, out cut to 255 bytes. */
    int extract_and_remove_between_patterns_nocase(const char* open, const char* close,
                                                   CString256& out);
    /** Copies the inner bytes to out, then removes the inner bytes of the first match only. */
    int extract_and_remove_between_patterns_nocase_not_inclusive(long start, const char* open,
                                                                 const char* close, CText& out);
    int extract_and_remove_between_patterns_nocase_not_inclusive(const char* open,
                                                                 const char* close, CText& out);
    /** Copies the inner bytes to out, then replaces the first whole span by s (null: removes). */
    int extract_and_replace_between_patterns(long start, const char* open, const char* close,
                                             const char* s, CText& out);
    int extract_and_replace_between_patterns(const char* open, const char* close, const char* s,
                                             CText& out);

    /** Removes what lies between the first open and the close after it; patterns stay. */
    void remove_between_patterns(const char* open, const char* close);
    void remove_between_patterns_no_case(const char* open, const char* close);
    /** Removes the first open, the close after it and all between. */
    void remove_between_patterns_inclusive(const char* open, const char* close);
    void remove_between_patterns_inclusive_nocase(const char* open, const char* close);
    /** Removes every whole span, searching again from the start after each removal. */
    void remove_between_patterns_inclusive_all_nocase(const char* open, const char* close);
    /** Replaces the first whole span by s; a null s only removes it. */
    void replace_between_patterns_inclusive(const char* open, const char* close, const char* s);
    void replace_between_patterns_inclusive_nocase(const char* open, const char* close,
                                                   const char* s);
    /**
     * Replaces what lies between the first open and a close by s (a null s only removes it);
     * the patterns stay. close is searched from strlen(open) bytes after the end of the open
     * match, so a close within those first bytes of the content is skipped.
     */
    void replace_between_patterns_nocase(const char* open, const char* close, const char* s);
    /**
     * Within the content between the first outerOpen and the following outerClose (found
     * case-sensitively), removes every open … close span, then puts the content back with
     * replace_between_patterns_nocase(outerOpen, outerClose, ...), case-insensitive and with
     * that member's offset rule.
     */
    void remove_between_patterns_inclusive_all_nocase_between(const char* open, const char* close,
                                                              const char* outerOpen,
                                                              const char* outerClose);

    /**
     * Replaces the first p found without regard to case from start by s. Nothing happens when
     * there is no buffer, s is null or p is absent or empty.
     */
    void replace_pattern_nocase(long start, const char* p, const char* s);
    void replace_pattern_nocase(const char* p, const char* s);
    /**
     * The same with texts: p is searched as a C string and replaced over its length() bytes.
     * Nothing happens when either has no buffer.
     */
    void replace_pattern_nocase(long start, const CText& p, const CText& s);
    void replace_pattern_nocase(const CText& p, const CText& s);
    /**
     * Replaces every p without regard to case by s, left to right; the search resumes after
     * each inserted replacement, so a replacement is never scanned again ('aa' in 'aaa' by
     * 'b' gives 'ba'; 'a' by 'aa' in 'aa' gives 'aaaa').
     */
    void replace_pattern_all_nocase(const char* p, const char* s);

    /**
     * Takes the first open … close span out of the text (case-sensitive) and, when found,
     * replaces list by its content split at ",": empty items are dropped, spaces kept, each cut
     * to 255 bytes. When nothing is found the list and the text stay as they were.
     */
    void extract_list(const char* open, const char* close, CList<CString256>& list);

    /** Null in the no-buffer state. Bytes may be changed in place; length() does not follow. */
    char* buffer() { return buffer_; }
    const char* buffer() const { return buffer_; }
    int32_t length() const { return length_; }
    int32_t capacity() const { return capacity_; }
    int32_t block() const { return block_; }
    /**
     * A name that travels with the text: copied with it, emptied when the text is assigned
     * from anything else (chars, numbers, strings, a file); read by no operation here.
     */
    const CString256& label() const { return label_; }
    void set_label(const CString256& label) { label_ = label; }

private:
    enum class Match : unsigned char { exact, nocase };
    /** Where the close pattern is searched from, relative to the open match. */
    enum class CloseFrom : unsigned char { open_end, open_start, open_length_past_open_end };
    /** Which bytes of a match an edit or an extraction covers: between the patterns, or all. */
    enum class Part : unsigned char { inner, whole };
    enum class Affix : unsigned char { prefix, suffix };
    enum class LineStyle : unsigned char { pretty, plain };
    /** A match: first byte of open, first after open, first of close, first after close. */
    struct Span {
        long open, inner, close, end;
    };

    static int32_t checked_block(long block);
    /** A buffer for n bytes by the capacity rule, or null; its capacity goes to capacity. */
    char* new_buffer(long n, int32_t& capacity) const;
    /** Releases the buffer and takes fresh (null: the no-buffer state), terminating it. */
    void adopt(char* fresh, int32_t capacity, int32_t length);
    void release();
    bool assign_bytes(const char* p, long n);
    /** Grows when n bytes exceed the spare room (capacity - length - 1); false on failure. */
    bool make_room(long n);
    void append_bytes(const char* p, long n, long room);
    long clamp(long position) const;
    long offset_of(const char* p) const;
    bool owns(const char* p) const;
    /** s, or a copy of it when it lies within this text and an edit would move it. */
    const char* detach(const char* s, std::unique_ptr<char[]>& copy) const;
    int affix_matches(Affix affix, const char* p, long n, Match match) const;
    int read_file(int fd);
    template <class Value>
    void append_line(LineStyle style, const char* name, const Value& value);

    long find(long start, const char* p, Match match) const;
    bool find_span(long start, const char* open, const char* close, Match match, CloseFrom from,
                   Span& span) const;
    int extract(long start, const char* open, const char* close, Match match, CloseFrom from,
                Part part, CText& out) const;
    /** Edits the first match searched from 0: replaces part by s, or removes it when s is null. */
    bool edit_first(const char* open, const char* close, Match match, CloseFrom from, Part part,
                    const char* s);
    int extract_and_edit(long start, const char* open, const char* close, Match match, Part edited,
                         const char* s, CText& out);
    void replace_found(long start, const char* p, long n, const char* s);

    char* buffer_ = nullptr;
    int32_t length_ = 0;
    int32_t capacity_ = 0;
    int32_t block_ = default_block;
    CString256 label_;
};
