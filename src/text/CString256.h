#pragma once

#include "text/CPool.h"

#include <QByteArray>
#include <QString>

template <class T>
struct CList;

/**
 * A value string of at most 255 bytes plus its terminator, held inline.
 *
 * Every assignment and append keeps the text NUL-terminated and silently truncates what does
 * not fit; nothing here reports an error. The bytes are taken as they come (ISO Latin-1 when
 * converted from or to QString); no multi-byte character is interpreted. Heap objects come
 * from a class-wide pool of 256-object blocks that is never given back.
 *
 * c_str() points into the object itself and is valid for as long as the object lives.
 */
class CString256 : public CPooled<CString256> {
public:
    static constexpr int max_length = 255;

    CString256() { text[0] = 0; }
    CString256(const CString256& other);
    CString256(const char* s);
    /** From a Pascal string: a length byte followed by that many bytes. */
    explicit CString256(const unsigned char* pascal);
    ~CString256() = default;

    CString256& operator=(const CString256& other);
    CString256& operator=(const char* s);
    CString256& operator=(const unsigned char* pascal);
    /** ISO Latin-1 bytes of s; characters outside Latin-1 are dropped. */
    CString256& operator=(const QString& s);
    /** The first min(size, 255) bytes of a sized block, NULs included. */
    CString256& operator=(const QByteArray& block);
    CString256& operator=(long value);
    /**
     * Formats the low 32 bits of value as a signed 32-bit number: 2^31 prints as
     * -2147483648 and 2^32 + 1 as 1. Kept narrow on purpose, for values written by older
     * versions of this program.
     */
    CString256& operator=(unsigned long long value);

    CString256& operator+=(const char* s);
    CString256& operator+=(const CString256& s);
    CString256& operator+=(const unsigned char* pascal);
    /** Appends c only while the length is at most 253: one character never fills the last byte. */
    CString256& operator+=(char c);
    CString256& operator+=(long value);
    CString256& operator+=(const QString& s);

    /** Unchecked access; storing a NUL cuts the text. */
    char& operator[](int i) { return text[i]; }
    const char& operator[](int i) const { return text[i]; }

    const char* c_str() const { return text; }
    int length() const;

    void to_lower();
    /** The text decoded as ISO Latin-1. */
    QString MakeQString() const;

    /**
     * Appends the text and a line feed to the caller's C string, which must have room.
     * Returns the length the buffer had before the line feed was added.
     */
    int print(char* buffer) const;
    /** Writes the text and a line feed to an open descriptor in one write: 0, or -1 on failure. */
    int print(int fd) const;

    int beginsWith(const CString256* prefix, unsigned char nocase) const;
    int beginsWith(const char* prefix, unsigned char nocase) const;
    int endsWith(const CString256* suffix, unsigned char nocase) const;
    int endsWith(const char* suffix, unsigned char nocase) const;
    int beginsWith_nocase(const CString256& prefix) const { return beginsWith(prefix.text, 1); }
    int beginsWith_nocase(const char* prefix) const { return beginsWith(prefix, 1); }
    int endsWith_nocase(const CString256& suffix) const { return endsWith(suffix.text, 1); }
    int endsWith_nocase(const char* suffix) const { return endsWith(suffix, 1); }

    /** Empties the text, then joins the elements with separator, truncating at 255. */
    void flatten_list(char separator, const CList<CString256>& list);
    /** Empties list, then appends every non-empty token of the text split at any delimiter. */
    void parse_into_list(const char* delimiters, CList<CString256>& list) const;
    /** Replaces what follows the last "." by suffix, or adds "." and suffix when there is none. */
    void change_suffix(const char* suffix);
    /** Removes every byte that is neither alphanumeric nor punctuation (spaces, controls). */
    void filter_to_alnum_or_punct();

    void match_case_exact(const CString256& other, float* score) const;
    void match_nocase_exact(const CString256& other, float* score) const;
    void match_case_partial(const CString256& other, float* score) const;
    void match_nocase_partial(const CString256& other, float* score) const;
    /** 1 - (|t - m| + |p - m|) / (p + t), m being the pattern's characters found in order. */
    void match_case_approximate(const CString256& other, float* score) const;
    void match_nocase_approximate(const CString256& other, float* score) const;
    /** 1.0 when every piece occurs in the text in list order, without overlap. */
    void match_wildcard_case(const CList<CString256>& pieces, float* score) const;
    void match_wildcard_nocase(const CList<CString256>& pieces, float* score) const;
    /** Calls matcher(this, data, score). */
    void match(void (*matcher)(void*, void*, float*), void* data, float* score);

private:
    void assign(const char* s, int n);
    void approximate(const CString256& other, bool nocase, float* score) const;

    char text[max_length + 1];
};

/**
 * Case-insensitive strstr (both sides folded with toupper). An empty needle answers one byte
 * before haystack: a caller that subtracts the start of its buffer reads that as position -1.
 */
char* STRSTR(const char* haystack, const char* needle);

/**
 * Compares at most n bytes folded with toupper. Returns 0 when they agree, otherwise the
 * difference of the raw bytes at the first position where the folded ones differ.
 */
int STRNCMP(const char* a, const char* b, int n);

// Adapters for CString256::match: subject is a CString256, other a C string (for the two
// wildcard adapters, other is a CList<CString256> of pieces).
void match_wildcard_case_256(void* subject, void* pieces, float* score);
void match_wildcard_nocase_256(void* subject, void* pieces, float* score);
void matcher_case_exact_256(void* subject, void* other, float* score);
void matcher_nocase_exact_256(void* subject, void* other, float* score);
void matcher_case_partial_256(void* subject, void* other, float* score);
void matcher_nocase_partial_256(void* subject, void* other, float* score);
void matcher_case_approximate_256(void* subject, void* other, float* score);
void matcher_nocase_approximate_256(void* subject, void* other, float* score);
