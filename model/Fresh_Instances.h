#pragma once

#include "runtime/Array.h"
#include "runtime/Instance.h"

namespace KPRV {

/// Instances on their way to a caller. It owns them until `release`, so that nothing is lost when an
/// exception of the library passes.
class Fresh_Instances
{
public:
    Fresh_Instances() = default;
    ~Fresh_Instances()
    {
        for (Instance* instance : _instances)
            destroyer(instance);
    }
    Fresh_Instances(const Fresh_Instances&) = delete;
    Fresh_Instances& operator=(const Fresh_Instances&) = delete;

    /// Takes the instance over.
    void append(Instance* instance) { _instances.append(instance); }
    void append(const Array<Instance*>& instances) { _instances.append(instances.data(), instances.size()); }
    uint32 size() const { return _instances.size(); }

    /// Gives the instances away; the receiver owns them.
    Array<Instance*> release()
    {
        Array<Instance*> instances(_instances);
        _instances.clear();
        return instances;
    }

private:
    Array<Instance*> _instances;
};

} // namespace KPRV
