#include "module/model/Port_Status.h"

#include <algorithm>
#include <iterator>

namespace KPRV {

namespace {

struct Status_Row
{
    sint32 status;
    uint16 enabled;
    uint16 health;
};

// clang-format off
constexpr Status_Row rows[] = {
//   status  EnabledState  HealthState
    { 6,     1,            15},
    { 8,     9,             5},
    { 9,     4,            10},
    {10,     3,            10},
    {11,     2,             5},
    {12,     1,             0},
    {13,     6,            10},
};
// clang-format on
constexpr Status_Row unknown = {0, 1, 0};

const Status_Row& row_of(sint32 status)
{
    const auto row = std::ranges::find(rows, status, &Status_Row::status);
    return row == std::end(rows) ? unknown : *row;
}

} // namespace

uint16 enabled_state(sint32 status)
{
    return row_of(status).enabled;
}

uint16 health_state(sint32 status)
{
    return row_of(status).health;
}

} // namespace KPRV
