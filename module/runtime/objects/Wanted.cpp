#include "module/runtime/objects/Wanted.h"

#include "module/runtime/objects/features.h"

namespace KPRV {

/// An object goes by the class that its keys name; one of another class may have the same keys.
static bool is_of_its_class(const Instance* object)
{
    const Meta_Feature* const key = find_feature(object->__meta_class, "CreationClassName", FLAG_PROPERTY);
    if (!key || !is_key(key))
        return false;
    const auto* const property = static_cast<const Meta_Property*>(key);
    if (property->type != STRING || property->subscript)
        return false;
    const auto& name = cell_at<Property<String>>(object, property->offset);
    return !name.null && name.value == object->__meta_class->name;
}

Wanted Wanted::names()
{
    Wanted wanted;
    wanted._whole = false;
    return wanted;
}

Wanted Wanted::nothing()
{
    Wanted wanted = names();
    wanted._nothing = true;
    return wanted;
}

Wanted Wanted::named(const Instance* object)
{
    Wanted wanted = names();
    wanted._object = object;
    return wanted;
}

Wanted Wanted::object(const Instance* model)
{
    Wanted wanted;
    wanted._object = model;
    return wanted;
}

Wanted Wanted::touching(const Instance* end)
{
    Wanted wanted;
    if (is_of_its_class(end))
        wanted._touched = end;
    return wanted;
}

} // namespace KPRV
