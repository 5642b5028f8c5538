#pragma once

#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/dispatch/provider_status.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <utility>

namespace KPRV {

/// What a provider says when its list does not have the count that it needs; `text` null says nothing. Write
/// it as `SAYING(ERR, "...")` or `SAYING_NOTHING`, which add the provider's own file and line.
struct Message
{
    Call_Site site;
    Log_Level level;
    const char* text;

    void say() const
    {
        if (text)
            log(level, site.file, site.line, "%s", text);
    }
    Enum_Instances_Status answer(Enum_Instances_Status status) const
    {
        say();
        return status;
    }
    void trace(const char* words) const { LOG_LINE(DBG, site.file, site.line, "%s", words); }
};

#define SAYING(level, text) (::KPRV::Message{LOG_HERE, ::KPRV::Log_Level::level, text})
#define SAYING_NOTHING (::KPRV::Message{LOG_HERE, ::KPRV::Log_Level::DBG, nullptr})

/// Owner of the elements that a manager hands out: what was not delivered is released, also when an
/// exception passes.
template <class T>
class List
{
public:
    explicit List(Array<Instance*>&& instances) noexcept : _instances(std::move(instances)) {}
    ~List()
    {
        for (Instance* instance : _instances)
            unref(instance);
    }
    List(const List&) = delete;
    List& operator=(const List&) = delete;

    uint32 size() const { return _instances.size(); }
    bool empty() const { return size() == 0; }
    /// Null for an element that is no T, or not wanted.
    const T* operator[](uint32 i) const { return cast<T>(const_cast<const Instance*>(_instances[i])); }

    /// Hands each element over to the handler, in order.
    void deliver(Enum_Instances_Handler<T>& handler)
    {
        for (Instance*& instance : _instances) {
            Ref<Instance> owner(std::exchange(instance, nullptr));
            if (T* element = cast<T>(owner.ptr())) {
                owner.steal();
                handler.handle(element);
            }
        }
    }

private:
    Array<Instance*> _instances;
};

/// Delivers the list, whatever its length; an empty one is said and is a success.
template <class T>
Enum_Instances_Status deliver_all(Array<Instance*>&& instances, Enum_Instances_Handler<T>& handler,
                                  const Message& when_empty)
{
    List<T> list(std::move(instances));
    if (list.empty())
        return when_empty.answer(ENUM_INSTANCES_OK);
    when_empty.trace("Returning instances");
    list.deliver(handler);
    return ENUM_INSTANCES_OK;
}

/// Delivers a list of exactly one; any other count is said and answered with `otherwise`.
template <class T>
Enum_Instances_Status deliver_one(List<T>& list, Enum_Instances_Handler<T>& handler,
                                  const Message& when_not_one, Enum_Instances_Status otherwise)
{
    if (list.size() != 1)
        return when_not_one.answer(otherwise);
    when_not_one.trace("Returning instances");
    list.deliver(handler);
    return ENUM_INSTANCES_OK;
}

template <class T>
Enum_Instances_Status deliver_one(Array<Instance*>&& instances, Enum_Instances_Handler<T>& handler,
                                  const Message& when_not_one, Enum_Instances_Status otherwise)
{
    List<T> list(std::move(instances));
    return deliver_one(list, handler, when_not_one, otherwise);
}

} // namespace KPRV
