#include "tests/bench/requests.h"

#include <vector>

namespace KPRV::bench {

namespace {

constexpr const char* PATH_CLASS = "KALDERA_SCSIInitiatorTargetLogicalUnitPath";

std::string words(const Storage_Size& size)
{
    return std::to_string(size.all_ports()) + "x" + std::to_string(size.targets) + "x" +
           std::to_string(size.luns);
}

bool is_slow(const Storage_Size& size)
{
    return size.all_paths() > 10000;
}

const char* words(plain_join join)
{
    switch (join) {
    case plain_join::loops:
        return "nested loops";
    case plain_join::loops_outer_ends_once:
        return "nested loops, outer ends once";
    case plain_join::index:
        break;
    }
    return "index";
}

Twins paths(const Storage_Size& size, plain_join join)
{
    Twins twins =
        enumeration(std::string("B3 enumerate paths, ") + words(join) + "/" + words(size), PATH_CLASS, size,
                    [join](auto... request) { return plain_enumerate_paths(request..., join); });
    twins.slow = is_slow(size);
    return twins;
}

Twins ends(const Storage_Size& size, plain_join join)
{
    // The first, whose id all sizes have.
    const char* const unit = "20008c7c00000000_5006016000000000_ACME_Array 9000_LUN_0";
    Twins twins =
        associator_names(std::string("B3 ends of one logical unit, ") + words(join) + "/" + words(size),
                         PATH_CLASS, "KALDERA_StorageExtent", unit, size,
                         [join](auto... request) { return plain_path_associator_names(request..., join); });
    twins.slow = is_slow(size);
    return twins;
}

std::vector<Twins> all_forms(const Storage_Size& size)
{
    return {
        paths(size, plain_join::loops), paths(size, plain_join::loops_outer_ends_once),
        paths(size, plain_join::index), ends(size, plain_join::loops_outer_ends_once),
        ends(size, plain_join::index),
    };
}

} // namespace

void add_paths(bool tiny)
{
    constexpr Storage_Size smallest = {.adapters = 1, .ports = 2, .targets = 2, .luns = 2};
    constexpr Storage_Size sizes[] = {
        {.adapters = 4, .ports = 2, .targets = 16, .luns = 16},
        {.adapters = 8, .ports = 2, .targets = 32, .luns = 32},
        {.adapters = 8, .ports = 2, .targets = 64, .luns = 64},
    };
    for (const Twins& twins : all_forms(smallest)) {
        check_equal(twins);
        if (tiny)
            add(twins);
    }
    if (tiny)
        return;
    for (const Twins& twins : all_forms(sizes[0]))
        check_equal(twins);
    for (const Storage_Size& size : sizes) {
        for (const Twins& twins : all_forms(size))
            add(twins);
    }
}

} // namespace KPRV::bench
