#pragma once

#include "module/runtime/ground/String.h"

#include <cstdio>

namespace KPRV {

/// The shared block behind a `Datetime`.
struct Datetime_Rep
{
    sint32 refs;
    uint64 usec;
    sint32 offset;
    uint32 is_timestamp;
};

/// Handle to a counted CIM datetime: a point in time (microseconds since the epoch and an offset east of UTC
/// in minutes) or an interval (microseconds). One machine word. Mutators copy a shared block first. Equality
/// is by all three fields, so the same moment in two time zones is not equal.
class Datetime
{
public:
    static constexpr uint64 USEC = 1;
    static constexpr uint64 MSEC = 1000 * USEC;
    static constexpr uint64 SEC = 1000 * MSEC;
    static constexpr uint64 MIN = 60 * SEC;
    static constexpr uint64 HOUR = 60 * MIN;
    static constexpr uint64 DAY = 24 * HOUR;

    /// The one rep of every zero interval that was never written, so that a datetime cell costs nothing until
    /// it has a value. It is never counted.
    static Datetime_Rep _zero;

    /// A zero interval.
    Datetime() : _rep(&_zero) {}
    Datetime(const Datetime& x);
    /// From the 25-character CIM text. A text that does not parse leaves a zero timestamp, not a zero
    /// interval.
    explicit Datetime(const char* text);
    explicit Datetime(const String& text);
    /// An interval.
    explicit Datetime(uint64 usec);
    /// A timestamp.
    Datetime(uint64 usec, sint32 offset);
    ~Datetime();
    Datetime& operator=(const Datetime& x);

    /// The present as a timestamp; a zero interval if the clock cannot be read.
    static Datetime now();

    /// False leaves the value as it was.
    bool set(const char* text);
    void set(uint64 usec);
    void set(uint64 usec, sint32 offset);

    void set_interval(uint32 days, uint32 hours, uint32 minutes, uint32 seconds, uint32 microseconds);
    void get_interval(uint32& days, uint32& hours, uint32& minutes, uint32& seconds,
                      uint32& microseconds) const;
    /// The fields are local time; the offset (minutes) is only carried along.
    void set_timestamp(uint32 year, uint32 month, uint32 day, uint32 hours, uint32 minutes, uint32 seconds,
                       uint32 microseconds, sint32 utc);
    void get_timestamp(uint32& year, uint32& month, uint32& day, uint32& hours, uint32& minutes,
                       uint32& seconds, uint32& microseconds, sint32& utc) const;

    uint64 usec() const { return _rep->usec; }
    sint32 offset() const { return _rep->offset; }
    bool is_timestamp() const { return _rep->is_timestamp != 0; }
    bool is_interval() const { return _rep->is_timestamp == 0; }
    /// Back to a zero interval.
    void clear();
    bool equal(const Datetime& x) const;

    /// Writes into a buffer of at least 32 bytes; pretty separates the fields for people.
    void ascii(char* buffer, bool pretty = false) const;
    String ascii(bool pretty = false) const;
    /// Writes the text, without a line end.
    void print(FILE* file, bool pretty = true) const;

private:
    void _cow();
    Datetime_Rep* _rep;
};

inline bool operator==(const Datetime& a, const Datetime& b)
{
    return a.equal(b);
}

} // namespace KPRV
