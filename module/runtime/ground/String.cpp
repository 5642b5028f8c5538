#include "module/runtime/ground/String.h"

#include "module/runtime/ground/Answer_Blocks.h"
#include "module/runtime/ground/strutil.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <new>

namespace KPRV {

// Two references that nobody gives back: no mutator ever takes it for its own.
constinit String_Rep String::_empty = {2, 0, 0, {'\0', '\0', '\0', '\0'}};

uint32 _next_pow_2(uint32 n)
{
    // Above the last power of 2 there is no larger one.
    return n < 32 ? 32 : n > 0x80000000u ? n : std::bit_ceil(n);
}

namespace {

constexpr size_t EXTRA = 16;
/// The terminator, and on 32 bits the block, must have their place too.
constexpr uint32 MOST = NPOS - EXTRA;

/// A size or a capacity as a rep holds it.
uint32 checked(uint64 n)
{
    if (n > MOST)
        throw std::bad_alloc();
    return static_cast<uint32>(n);
}

size_t length_of(const char* text)
{
    return text ? strlen(text) : 0;
}

/// A rep with a count of 1 and room for `n` characters by the capacity rule; size 0, not terminated.
String_Rep* allocate(uint32 n)
{
    const uint32 cap = checked(_next_pow_2(n));
    return new (take_block(size_t(cap) + EXTRA)) String_Rep{1, 0, cap, {}};
}

/// The characters, which go on behind the four that the record declares.
char* characters(String_Rep* rep)
{
    return rep->data;
}

void finish(String_Rep* rep, uint32 size)
{
    rep->size = size;
    characters(rep)[size] = '\0';
}

String_Rep* make(const char* text, uint32 n, uint32 room)
{
    String_Rep* rep = allocate(room);
    memcpy(characters(rep), text, n);
    finish(rep, n);
    return rep;
}

String_Rep* make(const char* text, size_t n)
{
    return n == 0 ? &String::_empty : make(text, checked(n), checked(n));
}

/// Never true of `_empty`.
bool is_unique(const String_Rep* rep)
{
    return atomic_get(rep->refs) == 1;
}

} // namespace

String::String(const char* text) : _rep(make(text, length_of(text))) {}

String::String(const char* text, size_t n) : _rep(make(text, n)) {}

String::String(const char* a, const char* b) : String(a, b, nullptr) {}

String::String(const char* a, const char* b, const char* c) : _rep(&_empty)
{
    const char* const parts[] = {a, b, c};
    const uint32 lengths[] = {checked(length_of(a)), checked(length_of(b)), checked(length_of(c))};
    const uint32 total = checked(uint64(lengths[0]) + lengths[1] + lengths[2]);
    if (total == 0)
        return;
    _rep = allocate(total);
    for (int i = 0; i < 3; i++) {
        memcpy(characters(_rep) + _rep->size, parts[i] ? parts[i] : "", lengths[i]);
        _rep->size += lengths[i];
    }
    finish(_rep, total);
}

String String::joined(std::span<const std::string_view> parts)
{
    uint64 total = 0;
    for (const std::string_view part : parts)
        total += part.size();
    String joined;
    if (total == 0)
        return joined;
    joined._rep = allocate(checked(total));
    char* end = characters(joined._rep);
    for (const std::string_view part : parts)
        end += part.copy(end, part.size());
    finish(joined._rep, static_cast<uint32>(total));
    return joined;
}

void String::_release(String_Rep* rep)
{
    if (rep != &_empty && atomic_release(rep->refs))
        give_block(rep);
}

String& String::operator=(const char* text)
{
    assign(text);
    return *this;
}

void String::assign(const char* text)
{
    assign(text, length_of(text));
}

void String::assign(const char* text, size_t n)
{
    if (n <= _rep->cap && is_unique(_rep)) {
        // The text may be a stretch of this very string.
        memmove(characters(_rep), text ? text : "", n);
        finish(_rep, static_cast<uint32>(n));
        return;
    }
    String_Rep* old = _rep;
    _rep = make(text, n);
    _release(old);
}

void String::append(char c)
{
    if (_rep->size >= _rep->cap || !is_unique(_rep)) {
        // Doubles even when only the sharing forbids to write in place.
        String_Rep* old = _rep;
        _rep = make(characters(old), old->size, checked(2 * uint64(old->cap)));
        _release(old);
    }
    characters(_rep)[_rep->size] = c;
    finish(_rep, _rep->size + 1);
}

void String::append(const char* text)
{
    append(text, length_of(text));
}

void String::append(const char* text, size_t n)
{
    if (n == 0)
        return;
    const uint32 size = checked(uint64(_rep->size) + n);
    const uint32 room = _next_pow_2(size);
    // The text may be a stretch of this very string: the old rep goes last.
    String_Rep* old = _rep;
    const bool in_place = old->cap >= room && is_unique(old);
    if (!in_place)
        _rep = make(characters(old), old->size, room);
    memmove(characters(_rep) + old->size, text, n);
    if (!in_place)
        _release(old);
    finish(_rep, size);
}

void String::append(const String& x)
{
    append(x.c_str(), x.size());
}

void String::reserve(uint32 n)
{
    if (_rep->cap >= n && is_unique(_rep))
        return;
    String_Rep* old = _rep;
    _rep = make(characters(old), old->size, std::max(n, old->size));
    _release(old);
}

void String::clear()
{
    if (_rep->size == 0)
        return;
    if (is_unique(_rep)) {
        finish(_rep, 0);
        return;
    }
    _release(_rep);
    _rep = &_empty;
}

void String::remove(uint32 pos, uint32 n)
{
    if (pos >= _rep->size || n == 0)
        return;
    reserve(_rep->size);
    const uint32 tail = _rep->size - pos;
    n = std::min(n, tail);
    memmove(characters(_rep) + pos, characters(_rep) + pos + n, tail - n);
    finish(_rep, _rep->size - n);
}

void String::set(uint32 index, char c)
{
    reserve(_rep->size);
    characters(_rep)[index] = c;
}

String String::substr(uint32 pos, uint32 n) const
{
    if (pos >= _rep->size)
        return String();
    return String(characters(_rep) + pos, std::min(n, _rep->size - pos));
}

static uint32 index_of(const String_Rep* rep, const char* found)
{
    return found ? static_cast<uint32>(found - rep->data) : NPOS;
}

uint32 String::find(char c) const
{
    return index_of(_rep, strchr(characters(_rep), c));
}

uint32 String::find(char c, uint32 pos) const
{
    return pos > _rep->size ? NPOS : index_of(_rep, strchr(characters(_rep) + pos, c));
}

uint32 String::find(const char* text) const
{
    return index_of(_rep, strstr(characters(_rep), text));
}

bool String::equal(const String& x) const
{
    return _rep == x._rep || equal(characters(x._rep), x._rep->size);
}

bool String::equal(const char* text) const
{
    return length_of(text) == _rep->size && equal(text, _rep->size);
}

bool String::equal(const char* text, uint32 n) const
{
    return _rep->size == n && (n == 0 || memcmp(characters(_rep), text, n) == 0);
}

bool String::equal(uint32 pos, const char* text, uint32 n) const
{
    return pos <= _rep->size && n <= _rep->size - pos && memcmp(characters(_rep) + pos, text, n) == 0;
}

bool String::equali(const String& x) const
{
    return _rep->size == x._rep->size && folded_eq(characters(_rep), characters(x._rep), _rep->size);
}

bool String::equali(const char* text) const
{
    return _rep->size == length_of(text) && (!text || folded_eq(characters(_rep), text, _rep->size));
}

String operator+(const String& a, const String& b)
{
    String result(a);
    result.append(b);
    return result;
}

} // namespace KPRV
