#pragma once

#include "module/runtime/ground/Atomic.h"
#include "module/runtime/ground/Types.h"

#include <span>
#include <string_view>
#include <utility>

namespace KPRV {

/// The shared block behind a `String`: one allocation of `cap` plus 16 bytes, the text always
/// zero-terminated.
struct String_Rep
{
    sint32 refs;
    uint32 size;
    uint32 cap;
    char data[4];
};

/// Handle to a reference-counted, copy-on-write text; one machine word, so that it can sit in an instance.
/// Handles that share a text may be used from different threads; one handle is written by one thread at a
/// time. All zero bytes are not a valid `String`; the empty one points at `_empty`. A null text is taken for
/// an empty one, and a string may be given a stretch of its own text. What would grow to 4 GiB or more throws
/// `std::bad_alloc`, as every text does for which there is no memory.
class String
{
public:
    /// The one rep of every empty string. It is never counted.
    static String_Rep _empty;

    constexpr String() : _rep(&_empty) {}
    String(const String& x) : _rep(x._rep)
    {
        if (_rep != &_empty)
            atomic_inc(_rep->refs);
    }
    String(String&& x) noexcept : _rep(std::exchange(x._rep, &_empty)) {}
    String(const char* text);
    String(const char* text, size_t n);
    String(const char* a, const char* b);
    String(const char* a, const char* b, const char* c);
    /// The parts one behind the other.
    static String joined(std::span<const std::string_view> parts);
    ~String()
    {
        if (_rep != &_empty)
            _release(_rep);
    }

    String& operator=(const String& x)
    {
        assign(x);
        return *this;
    }
    String& operator=(String&& x) noexcept
    {
        std::swap(_rep, x._rep);
        return *this;
    }
    String& operator=(const char* text);

    void assign(const String& x)
    {
        if (_rep != x._rep)
            *this = String(x);
    }
    void assign(const char* text);
    void assign(const char* text, size_t n);

    void append(char c);
    void append(const char* text);
    void append(const char* text, size_t n);
    void append(const String& x);

    /// Makes the text this handle's own, with room for n characters.
    void reserve(uint32 n);
    void clear();
    /// n of `NPOS` means up to the end.
    void remove(uint32 pos, uint32 n = NPOS);
    /// Writes one character; the index is not tested.
    void set(uint32 index, char c);
    String substr(uint32 pos, uint32 n = NPOS) const;

    /// Positions, or `NPOS`.
    uint32 find(char c) const;
    uint32 find(char c, uint32 pos) const;
    uint32 find(const char* text) const;

    bool equal(const String& x) const;
    bool equal(const char* text) const;
    bool equal(const char* text, uint32 n) const;
    bool equal(uint32 pos, const char* text, uint32 n) const;
    /// Equality that folds ASCII case.
    bool equali(const String& x) const;
    bool equali(const char* text) const;

    const char* c_str() const { return _rep->data; }
    uint32 size() const { return _rep->size; }
    uint32 capacity() const { return _rep->cap; }
    bool empty() const { return _rep->size == 0; }
    char operator[](uint32 index) const { return c_str()[index]; }

private:
    /// Gives back one reference.
    static void _release(String_Rep* rep);

    String_Rep* _rep;
};

inline bool operator==(const String& a, const String& b)
{
    return a.equal(b);
}
inline bool operator==(const String& a, const char* b)
{
    return a.equal(b);
}
String operator+(const String& a, const String& b);

/// Capacity rule of a text: 32 below 32, otherwise the smallest power of 2 that is at least n.
uint32 _next_pow_2(uint32 n);

} // namespace KPRV
