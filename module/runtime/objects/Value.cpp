#include "module/runtime/objects/Value.h"

#include "module/runtime/objects/features.h"
#include "module/runtime/system/log.h"

#include <cstring>
#include <new>

namespace KPRV {

namespace {

constexpr const char* _type_names[] = {
    "BOOLEAN", "UINT8",  "SINT8",  "UINT16", "SINT16", "UINT32",   "SINT32",   "UINT64",
    "SINT64",  "REAL32", "REAL64", "CHAR16", "STRING", "DATETIME", "INSTANCE",
};

constexpr const char* _type_array_names[] = {
    "BOOLEAN_ARRAY", "UINT8_ARRAY",  "SINT8_ARRAY",  "UINT16_ARRAY",   "SINT16_ARRAY",
    "UINT32_ARRAY",  "SINT32_ARRAY", "UINT64_ARRAY", "SINT64_ARRAY",   "REAL32_ARRAY",
    "REAL64_ARRAY",  "CHAR16_ARRAY", "STRING_ARRAY", "DATETIME_ARRAY", "INSTANCE_ARRAY",
};

constexpr const char* _array_names[] = {
    "boolean_array", "uint8_array",  "sint8_array",  "uint16_array",   "sint16_array",
    "uint32_array",  "sint32_array", "uint64_array", "sint64_array",   "real32_array",
    "real64_array",  "char16_array", "string_array", "datetime_array", "instance_array",
};

using Targets = Array<Instance*>;

bool is_array(Value::Type type)
{
    // NONE is -1, with every bit set.
    return type != Value::NONE && (type & Value::ARRAY_BIT);
}

Type element_type(Value::Type type)
{
    return static_cast<Type>(type & ~Value::ARRAY_BIT);
}

Value::Type array_of(Type type)
{
    return static_cast<Value::Type>(Value::ARRAY_BIT | static_cast<sint32>(type));
}

const __Array_Traits* traits_of(Value::Type array_type)
{
    return array_type == Value::INSTANCE_ARRAY ? __Array_Traits_Factory<Instance*>::traits()
                                               : __cim_array_traits[element_type(array_type)];
}

void ref_all(const Targets& targets)
{
    for (const Instance* target : targets)
        ref(target);
}

/// The name in one of three tables; an unknown type has none.
const char* name_in(Value::Type type, const char* none, const char* instance, const char* const* scalars,
                    const char* const* arrays)
{
    if (type >= 0 && type < Value::INSTANCE)
        return scalars[type];
    if (type == Value::INSTANCE)
        return instance;
    if (type >= Value::ARRAY_BIT && type <= Value::INSTANCE_ARRAY)
        return arrays[element_type(type)];
    return none;
}

} // namespace

const char* _type_name(Value::Type type)
{
    return name_in(type, "NONE", "INSTANCE", _type_names, _type_array_names);
}

const char* name_of(Value::Type type)
{
    return name_in(type, "none", "instance", type_name, _array_names);
}

Value::Type type_of(const Meta_Feature* feature)
{
    return visit_feature(feature, Overloaded{
                                      [](Scalar_Feature f) { return Value::Type(f.type()); },
                                      [](Array_Feature f) { return array_of(f.type()); },
                                      [](Reference_Feature) { return Value::INSTANCE; },
                                      [](Reference_Array_Feature) { return Value::INSTANCE_ARRAY; },
                                      [](Method_Feature) { return Value::NONE; },
                                  });
}

Value::Value(const Value& x)
{
    _copy_from(x);
}

Value& Value::operator=(const Value& x)
{
    if (this != &x) {
        // Kept until the copy stands: x may live inside an instance that only this value holds.
        Value old;
        memcpy(old._bytes, _bytes, sizeof(_bytes));
        old.type = type;
        _copy_from(x);
    }
    return *this;
}

void Value::clear()
{
    _release();
    type = NONE;
    null = true;
}

void Value::_release()
{
    if (type == NONE)
        return;
    if (is_array(type)) {
        if (type == INSTANCE_ARRAY) {
            for (const Instance* target : _as<Targets>())
                unref(target);
        }
        __destruct(_as<__Array_Rep*>());
    } else if (type == INSTANCE) {
        unref(_as<Instance*>());
    } else {
        visit_storage(
            static_cast<uint16>(type), [this] { _as<String>().~String(); },
            [this] { _as<Datetime>().~Datetime(); }, [] {});
    }
    type = NONE;
    memset(_bytes, 0, sizeof(_bytes));
}

/// Writes over what stands here: the caller has released it.
void Value::_copy_from(const Value& x)
{
    memcpy(_bytes, x._bytes, sizeof(_bytes));
    if (is_array(x.type)) {
        _as<__Array_Rep*>() = _clone(x._as<__Array_Rep*>());
        if (x.type == INSTANCE_ARRAY)
            ref_all(_as<Targets>());
    } else if (x.type == INSTANCE) {
        ref(_as<Instance*>());
    } else if (x.type != NONE) {
        visit_storage(
            static_cast<uint16>(x.type), [&] { new (_bytes) String(x._as<String>()); },
            [&] { new (_bytes) Datetime(x._as<Datetime>()); }, [] {});
    }
    type = x.type;
    null = x.null;
}

void Value::set_value(Instance* x)
{
    _release();
    _as<Instance*>() = x;
    _become(INSTANCE);
}

void Value::set_null(Type x)
{
    if (x == NONE) {
        clear();
        return;
    }
    if (is_array(x)) {
        _release();
        __construct(_as<__Array_Rep*>(), traits_of(x));
        _become(x);
    } else if (x == INSTANCE) {
        set_value(static_cast<Instance*>(nullptr));
    } else {
        visit_type(static_cast<KPRV::Type>(x), [this](auto tag) { _set(typename decltype(tag)::type()); });
    }
    null = true;
}

void Value::_set_array(Type x, const __Array_Rep* rep)
{
    __Array_Rep* fresh = _clone(rep);
    _release();
    _as<__Array_Rep*>() = fresh;
    _become(x);
}

int Value::_get_array(Type x, __Array_Rep*& rep) const
{
    if (type != x)
        return -1;
    __assign(rep, _as<__Array_Rep*>());
    return 0;
}

int Value::get_value(Instance*& x) const
{
    if (type != INSTANCE)
        return -1;
    x = _as<Instance*>();
    return 0;
}

int Value::set(const Instance* instance, const Meta_Feature* feature)
{
    clear();
    return visit_feature(feature, Overloaded{
                                      [&](Scalar_Feature f) {
                                          visit_type(f.type(), [&](auto tag) {
                                              using T = typename decltype(tag)::type;
                                              _set(*static_cast<const T*>(f.value(instance)));
                                          });
                                          null = f.null(instance);
                                          return 0;
                                      },
                                      [&](Array_Feature f) {
                                          _set_array(array_of(f.type()), f.array(instance));
                                          null = f.null(instance);
                                          return 0;
                                      },
                                      [&](Reference_Feature f) {
                                          ref(f.target(instance));
                                          set_value(f.target(instance));
                                          null = !f.target(instance);
                                          return 0;
                                      },
                                      [&](Reference_Array_Feature f) {
                                          ref_all(f.targets(instance));
                                          set_value(f.targets(instance));
                                          null = f.null(instance);
                                          return 0;
                                      },
                                      [](Method_Feature) { return -1; },
                                  });
}

/// Whether a reference may point to the instance; null always fits.
static bool fits(const Instance* target, const Instance* instance, const Meta_Reference* meta)
{
    if (!target || is_subclass(meta->meta_class, target->__meta_class))
        return true;
    LOG_CONVERSION(WARN, "failed to assign instance of %s to %s.%s", target->__meta_class->name,
                   instance->__meta_class->name, meta->name);
    return false;
}

int Value::get(Instance* instance, const Meta_Feature* feature) const
{
    if (!instance) {
        LOG_CONVERSION(WARN, "null instance argument");
        return -1;
    }
    if (type != type_of(feature)) {
        LOG_CONVERSION(WARN, "type mismatch: %s.%s", instance->__meta_class->name, feature->name);
        return -1;
    }
    return visit_feature(feature, Overloaded{
                                      [&](Scalar_Feature f) {
                                          f.null(instance) = null;
                                          visit_type(f.type(), [&](auto tag) {
                                              using T = typename decltype(tag)::type;
                                              *static_cast<T*>(f.value(instance)) = _as<T>();
                                          });
                                          return 0;
                                      },
                                      [&](Array_Feature f) {
                                          f.null(instance) = null;
                                          __assign(f.array(instance), _as<__Array_Rep*>());
                                          return 0;
                                      },
                                      [&](Reference_Feature f) {
                                          Instance* target = _as<Instance*>();
                                          if (!fits(target, instance, f.meta))
                                              return -1;
                                          ref(target);
                                          f.target(instance) = target;
                                          return 0;
                                      },
                                      [&](Reference_Array_Feature f) {
                                          const Targets& targets = _as<Targets>();
                                          f.targets(instance) = targets;
                                          // The array stays assigned if one does not fit, so all are counted
                                          // at once: the instance will release each of them.
                                          ref_all(targets);
                                          for (const Instance* target : targets) {
                                              if (!fits(target, instance, f.meta))
                                                  return -1;
                                          }
                                          return 0;
                                      },
                                      [](Method_Feature) { return -1; },
                                  });
}

int Value::give(Instance* instance, const Meta_Feature* feature)
{
    if (type != static_cast<Type>(STRING) || !instance || type != type_of(feature))
        return get(instance, feature);
    const Scalar_Feature cell{static_cast<const Meta_Property*>(feature)};
    cell.null(instance) = null;
    *static_cast<String*>(cell.value(instance)) = std::move(_as<String>());
    return 0;
}

} // namespace KPRV
