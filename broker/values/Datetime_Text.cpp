#include "broker/values/Datetime_Text.h"

#include <chrono>
#include <cstdio>

namespace KPRV::broker {

namespace {

using namespace std::chrono;

bool all_digits(std::string_view text)
{
    return text.find_first_not_of("0123456789*") == text.npos;
}

std::int64_t number(std::string_view text, std::size_t at, std::size_t size)
{
    std::int64_t value = 0;
    for (char c : text.substr(at, size))
        value = 10 * value + (c == '*' ? 0 : c - '0');
    return value;
}

std::int64_t time_of_day(std::string_view text)
{
    return ((number(text, 8, 2) * 60 + number(text, 10, 2)) * 60 + number(text, 12, 2)) * 1000000 +
           number(text, 15, 6);
}

} // namespace

bool is_datetime_text(std::string_view text)
{
    return text.size() == 25 && all_digits(text.substr(0, 14)) && text[14] == '.' &&
           all_digits(text.substr(15, 6)) &&
           std::string_view("+-:").find(text[21]) != std::string_view::npos && all_digits(text.substr(22)) &&
           (text[21] != ':' || text.substr(22) == "000");
}

bool is_interval_text(std::string_view text)
{
    return is_datetime_text(text) && text[21] == ':';
}

std::uint64_t datetime_microseconds(std::string_view text)
{
    constexpr std::int64_t DAY = 86400000000;
    if (is_interval_text(text))
        return static_cast<std::uint64_t>(number(text, 0, 8) * DAY + time_of_day(text));
    year_month_day date(year(static_cast<int>(number(text, 0, 4))),
                        month(static_cast<unsigned>(number(text, 4, 2))),
                        std::chrono::day(static_cast<unsigned>(number(text, 6, 2))));
    std::int64_t days = sys_days(date).time_since_epoch().count();
    std::int64_t offset = number(text, 22, 3) * 60000000;
    return static_cast<std::uint64_t>(days * DAY + time_of_day(text) + (text[21] == '+' ? -offset : offset));
}

std::string datetime_text(std::uint64_t microseconds, bool interval)
{
    constexpr std::uint64_t DAY = 86400000000;
    unsigned long long days = microseconds / DAY, rest = microseconds % DAY;
    unsigned long long second = rest / 1000000, micro = rest % 1000000;
    char date[16], text[40];
    if (interval) {
        std::snprintf(date, sizeof date, "%08llu", days % 100000000);
    } else {
        year_month_day ymd(sys_days(std::chrono::days(static_cast<int>(days))));
        std::snprintf(date, sizeof date, "%04d%02u%02u", static_cast<int>(ymd.year()) % 10000,
                      static_cast<unsigned>(ymd.month()), static_cast<unsigned>(ymd.day()));
    }
    std::snprintf(text, sizeof text, "%.8s%02llu%02llu%02llu.%06llu%s", date, second / 3600, second / 60 % 60,
                  second % 60, micro, interval ? ":000" : "+000");
    return text;
}

} // namespace KPRV::broker
