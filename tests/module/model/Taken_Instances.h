#pragma once

#include "tests/support/Instance_Text.h"
#include "tests/support/Log_Lines.h"

#include "module/runtime/ground/Array.h"

#include <vector>

namespace KPRV {

/// What is set in each instance of a result, which is freed.
inline std::vector<Set_Properties> taken(const Array<Instance*>& instances)
{
    std::vector<Set_Properties> result;
    for (Instance* instance : instances) {
        result.push_back(set_properties(instance));
        destroy(instance);
    }
    return result;
}

/// One property of each.
inline Lines taken(const Array<Instance*>& instances, const char* property)
{
    Lines result;
    for (Set_Properties& set : taken(instances))
        result.push_back(set[property]);
    return result;
}

/// What is set in one instance, which is freed.
inline Set_Properties taken(Instance* instance)
{
    Array<Instance*> one;
    one.append(instance);
    return taken(one)[0];
}

} // namespace KPRV
