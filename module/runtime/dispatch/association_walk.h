#pragma once

#include "module/runtime/objects/Instance.h"

#include <array>

namespace KPRV {

/// Room that a caller of `get_associators` gives: an association class has at most this many references.
inline constexpr size_t MAX_ASSOCIATORS = 16;

/// Which references may hold the object of a request. Asked for each of thousands of associations, the chain
/// of its classes is walked once for each reference.
class Fitting_References
{
public:
    explicit Fitting_References(const Instance* instance) : _class(instance->__meta_class) {}
    bool fits(const Meta_Reference* reference);

private:
    const Meta_Class* _class;
    struct Known
    {
        const Meta_Reference* reference;
        bool fits;
    };
    std::array<Known, 3> _known = {};
};

/// Fills `out` with the far ends of one association instance as seen from `instance`, without raising their
/// counts: they live as long as the association. Empty texts do not filter. Returns the number of far ends,
/// or -1 if the association does not touch the instance (in the given role). Every scalar reference of the
/// association should be set; one that is not is passed over.
int get_associators(const Instance* instance, const Instance* association, const String& result_class,
                    const String& role, const String& result_role, Instance* (&out)[MAX_ASSOCIATORS]);
/// The same for one association of many; `fitting` is the instance's.
int get_associators(const Instance* instance, Fitting_References& fitting, const Instance* association,
                    const String& result_class, const String& role, const String& result_role,
                    Instance* (&out)[MAX_ASSOCIATORS]);

/// True if a scalar reference of the association (the one named `role`, unless that is empty) has the keys of
/// the instance.
bool is_reference_of(const Instance* instance, const Instance* association, const String& role);

} // namespace KPRV
