#include "text/CText.h"

#include "text/Containers.h"
#include "util/TextUtilities.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <fcntl.h>
#include <new>
#include <sys/stat.h>
#include <type_traits>
#include <unistd.h>

static_assert(sizeof(long) == sizeof(long long),
              "the long and long long overloads share one formatting path");

namespace {

// A 64-bit decimal has at most 19 digits and a sign; itoa writes max + 1 bytes.
constexpr short kNumberDigits = 31;

// U+2022 BULLET in UTF-8, then a carriage return: the end of a plain report line.
constexpr const char* kBulletLineEnd = "\xE2\x80\xA2\r";

uintptr_t address(const char* p) {
    return reinterpret_cast<uintptr_t>(p);
}

/** The Latin-1 bytes of s, or false when s is empty or holds a character outside Latin-1. */
bool toLatin1(const QString& s, QByteArray& out) {
    if (s.isEmpty())
        return false;
    for (QChar ch : s) {
        if (ch.unicode() > 0xff)
            return false;
    }
    out = s.toLatin1();
    return true;
}

bool allBytes(const char* p, long n, bool (*test)(unsigned char)) {
    return std::all_of(p, p + n, [test](char c) { return test(static_cast<unsigned char>(c)); });
}

bool isSafeEncodedByte(unsigned char c) {
    return isHiorLoAlpha(c) || isDig(c) || isSafe(c) || isExtra(c) || isReserved(c) ||
           isPunctuation(c);
}

bool needsNoURLEncoding(unsigned char c) {
    return !NeedsURLEncoding(c);
}

int closeStatus(int fd) {
    return ::close(fd) == 0 ? 0 : errno;
}

/** Writes n bytes to fd, then closes it: 0 or the first errno. */
int writeAndClose(int fd, const char* p, long n) {
    int status = 0;
    while (n > 0) {
        const ssize_t written = ::write(fd, p, static_cast<size_t>(n));
        if (written < 0) {
            if (errno == EINTR)
                continue;
            status = errno;
            break;
        }
        p += written;
        n -= written;
    }
    const int closed = closeStatus(fd);
    return status != 0 ? status : closed;
}

} // namespace

// Storage

int32_t CText::checked_block(long block) {
    return block < 1 || block > INT32_MAX ? default_block : static_cast<int32_t>(block);
}

char* CText::new_buffer(long n, int32_t& capacity) const {
    if (n < 0 || n > INT32_MAX)
        return nullptr;
    const long long sized = static_cast<long long>(block_) * (n / block_ + 1);
    if (sized > INT32_MAX)
        return nullptr;
    capacity = static_cast<int32_t>(sized);
    return new (std::nothrow) char[sized + 1];
}

void CText::adopt(char* fresh, int32_t capacity, int32_t length) {
    delete[] buffer_;
    buffer_ = fresh;
    capacity_ = fresh != nullptr ? capacity : 0;
    length_ = fresh != nullptr ? length : 0;
    if (fresh != nullptr)
        buffer_[length_] = 0;
}

void CText::release() {
    adopt(nullptr, 0, 0);
}

bool CText::assign_bytes(const char* p, long n) {
    // The new buffer is filled before the old one goes: p may lie within it.
    int32_t capacity = 0;
    char* fresh = new_buffer(n, capacity);
    if (fresh != nullptr)
        std::memcpy(fresh, p, static_cast<size_t>(n));
    adopt(fresh, capacity, static_cast<int32_t>(n));
    label_ = "";
    return fresh != nullptr;
}

CText::CText() {
    assign_bytes("", 0);
}

CText::CText(const char* s) {
    init_from_chars(s);
}

CText::CText(const char* s, long block) : block_(checked_block(block)) {
    init_from_chars(s);
}

CText::CText(const char* begin, const char* end) {
    if (begin == nullptr || address(end) < address(begin))
        return;
    const size_t span = address(end) - address(begin) + 1;
    assign_bytes(begin, static_cast<long>(strnlen(begin, span)));
}

CText::CText(long v) {
    *this = v;
}

CText::CText(long long v) {
    *this = v;
}

CText::CText(const CText& other) {
    init_from_ctext(other);
}

CText::~CText() {
    delete[] buffer_;
}

CText& CText::init_from_chars(const char* s) {
    if (s == nullptr)
        release();
    else
        assign_bytes(s, static_cast<long>(std::strlen(s)));
    return *this;
}

CText& CText::init_from_ctext(const CText& other) {
    if (&other == this)
        return *this;
    char* fresh = new (std::nothrow) char[static_cast<size_t>(other.capacity_) + 1];
    if (fresh != nullptr && other.buffer_ != nullptr) {
        std::memcpy(fresh, other.buffer_, static_cast<size_t>(other.length_) + 1);
        adopt(fresh, other.capacity_, other.length_);
        block_ = other.block_;
    } else {
        adopt(fresh, 0, 0);
        block_ = default_block;
    }
    label_ = other.label_;
    return *this;
}

// Assignment

CText& CText::operator=(const char* s) {
    return init_from_chars(s != nullptr ? s : "");
}

CText& CText::operator=(char c) {
    const char text[2] = {c, 0};
    return init_from_chars(text);
}

CText& CText::operator=(long v) {
    char digits[kNumberDigits + 1];
    itoa(digits, kNumberDigits, v);
    return init_from_chars(digits);
}

CText& CText::operator=(long long v) {
    return *this = static_cast<long>(v);
}

CText& CText::operator=(const QString& s) {
    QByteArray latin1;
    if (toLatin1(s, latin1))
        init_from_chars(latin1.constData());
    return *this;
}

CText& CText::operator=(const QByteArray& block) {
    const char* data = block.constData();
    assign_bytes(data, static_cast<long>(strnlen(data, static_cast<size_t>(block.size()))));
    return *this;
}

CText& CText::operator=(const CText& other) {
    if (buffer_ == nullptr || other.buffer_ == nullptr)
        return *this;
    return init_from_ctext(other);
}

// Growth and appending

long CText::resize_by(long n) {
    if (buffer_ == nullptr || n > INT32_MAX)
        return 0;
    n = std::max(n, 0L);
    const long long grown = capacity_ + static_cast<long long>(block_) * (n / block_ + 1);
    if (grown > INT32_MAX)
        return 0;
    char* fresh = new (std::nothrow) char[grown + 1];
    if (fresh == nullptr)
        return 0;
    std::memcpy(fresh, buffer_, static_cast<size_t>(length_) + 1);
    adopt(fresh, static_cast<int32_t>(grown), length_);
    return capacity_;
}

bool CText::make_room(long n) {
    const long spare = static_cast<long>(capacity_) - length_ - 1;
    return n <= spare || resize_by(n - spare) != 0;
}

void CText::append_bytes(const char* p, long n, long room) {
    if (buffer_ == nullptr || p == nullptr || n < 0 || n > INT32_MAX)
        return;
    // Growth frees the old buffer, which may be the source.
    const bool inside = owns(p);
    const long offset = offset_of(p);
    if (!make_room(room))
        return;
    if (inside)
        p = buffer_ + offset;
    std::memmove(buffer_ + length_, p, static_cast<size_t>(n));
    length_ += static_cast<int32_t>(n);
    buffer_[length_] = 0;
}

CText& CText::operator+=(char c) {
    if (buffer_ == nullptr)
        return *this = c;
    append_bytes(&c, 1, 1);
    return *this;
}

CText& CText::append(const char* p, long n) {
    // append() keeps one byte more spare than operator+= before growing: capacities show it.
    if (n >= 0 && n < INT32_MAX)
        append_bytes(p, n, n + 1);
    return *this;
}

CText& CText::operator+=(const CText& other) {
    append_bytes(other.buffer_, other.length_, other.length_);
    return *this;
}

CText& CText::operator+=(const char* s) {
    if (s != nullptr) {
        const auto n = static_cast<long>(std::strlen(s));
        append_bytes(s, n, n);
    }
    return *this;
}

CText& CText::operator+=(const CString256& s) {
    return *this += s.c_str();
}

CText& CText::operator+=(const QString& s) {
    QByteArray latin1;
    if (toLatin1(s, latin1))
        *this += latin1.constData();
    return *this;
}

CText& CText::operator+=(long v) {
    char digits[kNumberDigits + 1];
    itoa(digits, kNumberDigits, v);
    return *this += digits;
}

CText& CText::operator+=(long long v) {
    return *this += static_cast<long>(v);
}

CText& CText::operator-=(const char* s) {
    insert_pattern(0L, s);
    return *this;
}

// Report lines

template <class Value>
void CText::append_line(LineStyle style, const char* name, const Value& value) {
    const bool pretty = style == LineStyle::pretty;
    *this += pretty ? "\t\t" : "";
    *this += name;
    *this += pretty ? " : " : " ";
    if constexpr (std::is_same_v<Value, CList<CString256>>) {
        for (const elem<CString256>* node = value.first; node != nullptr; node = node->next) {
            *this += node->data;
            if (node->next != nullptr)
                *this += ",";
        }
    } else {
        *this += value;
    }
    *this += pretty ? "\r\r" : kBulletLineEnd;
}

void CText::pretty_append_named_value(const char* name, const CText& value) {
    append_line(LineStyle::pretty, name, value);
}
void CText::pretty_append_named_value(const char* name, const CString256& value) {
    append_line(LineStyle::pretty, name, value);
}
void CText::pretty_append_named_value(const char* name, long value) {
    append_line(LineStyle::pretty, name, value);
}
void CText::pretty_append_named_list(const char* name, const CList<CString256>& values) {
    append_line(LineStyle::pretty, name, values);
}
void CText::append_named_value(const char* name, const CText& value) {
    append_line(LineStyle::plain, name, value);
}
void CText::append_named_value(const char* name, const CString256& value) {
    append_line(LineStyle::plain, name, value);
}
void CText::append_named_value(const char* name, long value) {
    append_line(LineStyle::plain, name, value);
}
void CText::append_named_list(const char* name, const CList<CString256>& values) {
    append_line(LineStyle::plain, name, values);
}

// In-place edits

void CText::replace_nil_chars_by_space() {
    if (buffer_ != nullptr)
        std::replace(buffer_, buffer_ + length_, '\0', ' ');
}

void CText::to_lower() {
    for (int32_t i = 0; i < length_; ++i)
        buffer_[i] = static_cast<char>(std::tolower(static_cast<unsigned char>(buffer_[i])));
}

void CText::reverse() {
    reverse(buffer_, length_);
}

void CText::reverse_text() {
    reverse();
}

void CText::reverse(char* s, long n) {
    if (s != nullptr && n > 1)
        std::reverse(s, s + n);
}

void CText::itoa(char* out, short max, long long v) {
    ::itoa(out, max, static_cast<long>(v));
}

void CText::itoa(char* out, short max, long v) {
    ::itoa(out, max, v);
}

// Search and tests

long CText::clamp(long position) const {
    return std::clamp(position, 0L, static_cast<long>(length_));
}

long CText::offset_of(const char* p) const {
    // Integer arithmetic: p may lie before the buffer (STRSTR's answer for an empty needle).
    return static_cast<long>(address(p) - address(buffer_));
}

bool CText::owns(const char* p) const {
    return buffer_ != nullptr && address(p) >= address(buffer_) &&
           address(p) <= address(buffer_) + static_cast<uintptr_t>(capacity_);
}

const char* CText::detach(const char* s, std::unique_ptr<char[]>& copy) const {
    if (s == nullptr || !owns(s))
        return s;
    const size_t n = std::strlen(s) + 1;
    copy.reset(new (std::nothrow) char[n]);
    if (copy == nullptr)
        return nullptr;
    std::memcpy(copy.get(), s, n);
    return copy.get();
}

long CText::find(long start, const char* p, Match match) const {
    if (buffer_ == nullptr || p == nullptr)
        return -1;
    const char* from = buffer_ + clamp(start);
    const char* hit = match == Match::exact ? std::strstr(from, p) : STRSTR(from, p);
    return hit == nullptr ? -1 : offset_of(hit);
}

long CText::find_pattern(long start, const char* p) const {
    return find(start, p, Match::exact);
}

long CText::find_pattern(const char* p) const {
    return find(0, p, Match::exact);
}

long CText::find_pattern_nocase(long start, const char* p) const {
    return find(start, p, Match::nocase);
}

long CText::find_pattern_nocase(const char* p) const {
    return find(0, p, Match::nocase);
}

char* CText::STRSTR(const char* haystack, const char* needle) {
    return ::STRSTR(haystack, needle);
}

int CText::STRNCMP(const char* a, const char* b, int n) {
    return ::STRNCMP(a, b, n);
}

int CText::affix_matches(Affix affix, const char* p, long n, Match match) const {
    if (buffer_ == nullptr || p == nullptr || n > length_)
        return 0;
    const char* here = affix == Affix::prefix ? buffer_ : buffer_ + length_ - n;
    const auto count = static_cast<int>(n);
    return (match == Match::exact ? std::strncmp(here, p, static_cast<size_t>(count))
                                  : STRNCMP(here, p, count)) == 0;
}

int CText::beginsWith_case(const CText& p) const {
    return affix_matches(Affix::prefix, p.buffer_, p.length_, Match::exact);
}
int CText::beginsWith_nocase(const CText& p) const {
    return affix_matches(Affix::prefix, p.buffer_, p.length_, Match::nocase);
}
int CText::beginsWith_nocase(const char* p) const {
    return p == nullptr ? 0 : affix_matches(Affix::prefix, p, std::strlen(p), Match::nocase);
}
int CText::endsWith_case(const CText& p) const {
    return affix_matches(Affix::suffix, p.buffer_, p.length_, Match::exact);
}
int CText::endsWith_nocase(const CText& p) const {
    return affix_matches(Affix::suffix, p.buffer_, p.length_, Match::nocase);
}
int CText::endsWith_nocase(const char* p) const {
    return p == nullptr ? 0 : affix_matches(Affix::suffix, p, std::strlen(p), Match::nocase);
}

int CText::isURLEncoded() const {
    return allBytes(buffer_, length_, needsNoURLEncoding);
}

int CText::isSafeEncoded() const {
    return allBytes(buffer_, length_, isSafeEncodedByte);
}

// Whole files

int CText::read_file(int fd) {
    struct stat info {};
    if (::fstat(fd, &info) != 0) {
        const int status = errno;
        *this = "";
        return status;
    }
    int32_t capacity = 0;
    adopt(new_buffer(info.st_size > INT32_MAX ? -1 : static_cast<long>(info.st_size), capacity),
          capacity, 0);
    label_ = "";
    if (buffer_ == nullptr)
        return ENOMEM;
    // Read to the end rather than trust the size: files under /proc report 0, others grow.
    for (;;) {
        if (length_ == capacity_ && resize_by(0) == 0)
            return ENOMEM;
        const ssize_t got = ::read(fd, buffer_ + length_, static_cast<size_t>(capacity_ - length_));
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            return errno;
        if (got == 0)
            return 0;
        length_ += static_cast<int32_t>(got);
        buffer_[length_] = 0;
    }
}

int CText::init_from_file(const std::filesystem::path& file) {
    const int fd = ::open(file.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0) {
        const int status = errno;
        *this = "";
        return status;
    }
    const int status = read_file(fd);
    const int closed = closeStatus(fd);
    replace_nil_chars_by_space();
    return status != 0 ? status : closed;
}

int CText::operator<<(const char* path) {
    struct stat info {};
    if (path == nullptr)
        return EINVAL;
    if (::stat(path, &info) != 0)
        return errno;
    return init_from_file(path);
}

int CText::append_file(const std::filesystem::path& file) {
    CText content(nullptr);
    const int status = content.init_from_file(file);
    *this += content;
    return status;
}

int CText::operator>>(const char* path) const {
    if (path == nullptr)
        return EINVAL;
    if (::unlink(path) != 0 && errno != ENOENT)
        return errno;
    const int fd = ::open(path, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    if (fd < 0)
        return errno;
    return writeAndClose(fd, buffer_, length_);
}

int CText::write_to_existing_file(const std::filesystem::path& file) const {
    const int fd = ::open(file.c_str(), O_WRONLY | O_TRUNC | O_CLOEXEC);
    if (fd < 0)
        return errno == ENOENT ? 0 : errno;
    return writeAndClose(fd, buffer_, length_);
}
