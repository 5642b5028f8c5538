// Times past 2038 are to be the same in both word sizes.
#ifndef _FILE_OFFSET_BITS
#define _FILE_OFFSET_BITS 64
#endif
#ifndef _TIME_BITS
#define _TIME_BITS 64
#endif

#include "module/runtime/ground/Datetime.h"

#include "module/runtime/ground/Atomic.h"

#include <cstring>
#include <ctime>
#include <sys/time.h>

namespace KPRV {

static_assert(sizeof(time_t) == 8);

// Two references that nobody gives back forbid to write to it.
constinit Datetime_Rep Datetime::_zero = {2, 0, 0, 0};

namespace {

Datetime_Rep* make(uint64 usec, sint32 offset, uint32 is_timestamp)
{
    return new Datetime_Rep{1, usec, offset, is_timestamp};
}

Datetime_Rep* share(Datetime_Rep* rep)
{
    if (rep != &Datetime::_zero)
        atomic_inc(rep->refs);
    return rep;
}

void release(Datetime_Rep* rep)
{
    if (rep != &Datetime::_zero && atomic_release(rep->refs))
        delete rep;
}

bool _str_to_uint32(const char* text, size_t n, uint32& value)
{
    uint32 sum = 0;
    uint32 weight = 1;
    for (const char* p = text + n; p != text; weight *= 10) {
        const char c = *--p;
        if (c < '0' || c > '9')
            return false;
        sum += static_cast<uint32>(c - '0') * weight;
    }
    value = sum;
    return true;
}

/// Reads consecutive fields of the given widths.
template <size_t N>
bool parse_fields(const char* text, const uint8 (&widths)[N], uint32 (&values)[N])
{
    for (size_t i = 0; i < N; text += widths[i++]) {
        if (!_str_to_uint32(text, widths[i], values[i]))
            return false;
    }
    return true;
}

constexpr size_t TEXT_LENGTH = 25;
constexpr size_t POINT = 14;
constexpr size_t FRACTION = 15;
constexpr size_t SIGN = 21;

/// Seconds and microseconds of a count that may lie before the epoch.
struct Split
{
    explicit Split(uint64 usec)
    {
        const sint64 count = static_cast<sint64>(usec);
        const sint64 unit = static_cast<sint64>(Datetime::SEC);
        const bool before = count % unit < 0;
        seconds = count / unit - before;
        microseconds = static_cast<uint32>(count % unit + (before ? unit : 0));
    }
    sint64 seconds;
    uint32 microseconds;
};

} // namespace

Datetime::Datetime(const Datetime& x) : _rep(share(x._rep)) {}

Datetime::Datetime(const char* text) : _rep(make(0, 0, 1))
{
    set(text);
}

Datetime::Datetime(const String& text) : Datetime(text.c_str()) {}

Datetime::Datetime(uint64 usec) : _rep(make(usec, 0, 0)) {}

Datetime::Datetime(uint64 usec, sint32 offset) : _rep(make(usec, offset, 1)) {}

Datetime::~Datetime()
{
    release(_rep);
}

Datetime& Datetime::operator=(const Datetime& x)
{
    Datetime_Rep* old = _rep;
    _rep = share(x._rep);
    release(old);
    return *this;
}

Datetime Datetime::now()
{
    struct timeval tv;
    struct timezone tz;
    if (gettimeofday(&tv, &tz) != 0)
        return Datetime();
    return Datetime(static_cast<uint64>(tv.tv_sec) * SEC + static_cast<uint64>(tv.tv_usec),
                    -tz.tz_minuteswest);
}

void Datetime::_cow()
{
    if (atomic_get(_rep->refs) == 1)
        return;
    Datetime_Rep* old = _rep;
    _rep = make(old->usec, old->offset, old->is_timestamp);
    release(old);
}

bool Datetime::set(const char* text)
{
    if (!text || strnlen(text, TEXT_LENGTH + 1) != TEXT_LENGTH || text[POINT] != '.')
        return false;
    uint32 usec;
    if (!_str_to_uint32(text + FRACTION, SIGN - FRACTION, usec))
        return false;

    const char sign = text[SIGN];
    if (sign == ':') {
        // The three characters behind the colon are not looked at.
        uint32 f[4];
        if (!parse_fields(text, {8, 2, 2, 2}, f))
            return false;
        set_interval(f[0], f[1], f[2], f[3], usec);
        return true;
    }
    if (sign != '+' && sign != '-')
        return false;
    uint32 f[6];
    uint32 offset;
    if (!parse_fields(text, {4, 2, 2, 2, 2, 2}, f) ||
        !_str_to_uint32(text + SIGN + 1, TEXT_LENGTH - SIGN - 1, offset))
        return false;
    const sint32 utc = static_cast<sint32>(offset);
    set_timestamp(f[0], f[1], f[2], f[3], f[4], f[5], usec, sign == '-' ? -utc : utc);
    return true;
}

void Datetime::set(uint64 usec)
{
    _cow();
    _rep->usec = usec;
    _rep->offset = 0;
    _rep->is_timestamp = 0;
}

void Datetime::set(uint64 usec, sint32 offset)
{
    _cow();
    _rep->usec = usec;
    _rep->offset = offset;
    _rep->is_timestamp = 1;
}

void Datetime::set_interval(uint32 days, uint32 hours, uint32 minutes, uint32 seconds, uint32 microseconds)
{
    set(days * DAY + hours * HOUR + minutes * MIN + seconds * SEC + microseconds * USEC);
}

void Datetime::get_interval(uint32& days, uint32& hours, uint32& minutes, uint32& seconds,
                            uint32& microseconds) const
{
    const uint64 x = _rep->usec;
    days = static_cast<uint32>(x / DAY);
    hours = static_cast<uint32>(x % DAY / HOUR);
    minutes = static_cast<uint32>(x % HOUR / MIN);
    seconds = static_cast<uint32>(x % MIN / SEC);
    microseconds = static_cast<uint32>(x % SEC / USEC);
}

void Datetime::set_timestamp(uint32 year, uint32 month, uint32 day, uint32 hours, uint32 minutes,
                             uint32 seconds, uint32 microseconds, sint32 utc)
{
    struct tm tm = {};
    tm.tm_year = static_cast<int>(year) - 1900;
    tm.tm_mon = static_cast<int>(month) - 1;
    tm.tm_mday = static_cast<int>(day);
    tm.tm_hour = static_cast<int>(hours);
    tm.tm_min = static_cast<int>(minutes);
    tm.tm_sec = static_cast<int>(seconds);
    tm.tm_isdst = -1;
    // Local time on purpose, whatever the offset says: texts then read back as they were written.
    set(static_cast<uint64>(mktime(&tm)) * SEC + microseconds, utc);
}

void Datetime::get_timestamp(uint32& year, uint32& month, uint32& day, uint32& hours, uint32& minutes,
                             uint32& seconds, uint32& microseconds, sint32& utc) const
{
    const Split split(_rep->usec);
    const time_t t = split.seconds;
    struct tm tm = {};
    localtime_r(&t, &tm);
    year = static_cast<uint32>(tm.tm_year + 1900);
    month = static_cast<uint32>(tm.tm_mon + 1);
    day = static_cast<uint32>(tm.tm_mday);
    hours = static_cast<uint32>(tm.tm_hour);
    minutes = static_cast<uint32>(tm.tm_min);
    seconds = static_cast<uint32>(tm.tm_sec);
    microseconds = split.microseconds;
    utc = _rep->offset;
}

void Datetime::clear()
{
    *this = Datetime();
}

bool Datetime::equal(const Datetime& x) const
{
    return _rep == x._rep || (_rep->usec == x._rep->usec && _rep->offset == x._rep->offset &&
                              is_timestamp() == x.is_timestamp());
}

void Datetime::ascii(char* buffer, bool pretty) const
{
    // Texts of years beyond 9999 are cut at the size that callers promise.
    constexpr size_t SIZE = 32;
    uint32 days, hours, minutes, seconds, usec;
    if (is_interval()) {
        get_interval(days, hours, minutes, seconds, usec);
        (void)!snprintf(buffer, SIZE, pretty ? "%08u %02u %02u %02u.%06u:000" : "%08u%02u%02u%02u.%06u:000",
                        days, hours, minutes, seconds, usec);
        return;
    }
    uint32 year, month;
    sint32 utc;
    get_timestamp(year, month, days, hours, minutes, seconds, usec, utc);
    (void)!snprintf(buffer, SIZE,
                    pretty ? "%04d/%02d/%02d %02d:%02d:%02d.%06d%c%03u"
                           : "%04d%02d%02d%02d%02d%02d.%06d%c%03u",
                    int(year), int(month), int(days), int(hours), int(minutes), int(seconds), int(usec),
                    utc < 0 ? '-' : '+', utc < 0 ? 0u - unsigned(utc) : unsigned(utc));
}

String Datetime::ascii(bool pretty) const
{
    char buffer[32];
    ascii(buffer, pretty);
    return String(buffer);
}

void Datetime::print(FILE* file, bool pretty) const
{
    char buffer[32];
    ascii(buffer, pretty);
    fputs(buffer, file);
}

} // namespace KPRV
