#pragma once

#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Ref.h"

#include <vector>

namespace KPRV {

/// Instances on their way to a caller. It owns them until `release`, so that nothing is lost when an
/// exception of the library passes.
///
/// How it works. A helper walks the library and builds an instance for each thing it finds; the next question
/// to the library may throw, and so may the memory for the next place. An instance is therefore owned at each
/// moment by one: by the builder's `Ref`, by this list from `append` on, by the caller from `release` on.
/// `append` holds it while it makes room, and lets go when the place is taken. `release` copies the pointers
/// into an array first, which may throw, and forgets its own afterwards, which may not.
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

    /// Takes the instance over. Null: one that was seen and is not wanted, which is counted and goes along.
    void append(Instance* instance)
    {
        Ref<Instance> held(instance);
        _instances.push_back(instance);
        held.steal();
    }
    /// Takes all of them over, also where there is no room for them.
    void append(const Array<Instance*>& instances)
    {
        struct Given
        {
            ~Given()
            {
                if (still_ours)
                    for (Instance* instance : instances)
                        destroyer(instance);
            }
            const Array<Instance*>& instances;
            bool still_ours = true;
        } given{instances};
        _instances.insert(_instances.end(), instances.begin(), instances.end());
        given.still_ours = false;
    }
    uint32 size() const { return static_cast<uint32>(_instances.size()); }

    /// Gives the instances away; the receiver owns them.
    Array<Instance*> release()
    {
        Array<Instance*> instances(_instances.data(), size());
        _instances.clear();
        return instances;
    }

private:
    // An array grows by exactly what is appended, which is too slow for the LUNs of a large host.
    std::vector<Instance*> _instances;
};

/// A list of the one instance, which it takes over; the receiver owns it.
inline Array<Instance*> only(Instance* instance)
{
    Fresh_Instances one;
    one.append(instance);
    return one.release();
}

} // namespace KPRV
