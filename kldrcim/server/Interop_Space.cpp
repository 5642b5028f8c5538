#include "kldrcim/server/Interop_Space.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

/// What of the module's classes clients look for in this name space.
constexpr const char* profile_classes[] = {"CIM_RegisteredProfile"};
constexpr const char* shown_classes[] = {"CIM_RegisteredProfile", "CIM_ElementConformsToProfile",
                                         "CIM_ReferencedProfile"};

/// A value with each path in it changed.
template <class Change>
void change_paths(Plain_Value& value, const Change& change)
{
    if (const Path_Value* path = value.as_path()) {
        Path_Value moved = *path;
        change(moved);
        value = Plain_Value::path(std::move(moved));
    }
}

} // namespace

/// Lets objects through as they look from here.
class Moved_Objects final : public Receiver
{
public:
    Moved_Objects(const Interop_Space& space, Receiver& receiver) : _space(space), _receiver(receiver) {}

    bool instance(Instance_Value&& instance) override
    {
        _space.move_in(instance.path);
        for (Named_Value& property : instance.properties)
            change_paths(property.value, [&](Path_Value& path) { _space.move_in(path); });
        return _receiver.instance(std::move(instance));
    }
    bool path(Path_Value&& path) override
    {
        _space.move_in(path);
        return _receiver.path(std::move(path));
    }

private:
    const Interop_Space& _space;
    Receiver& _receiver;
};

Interop_Space::Interop_Space(std::string name, const Interop_Classes& classes,
                             std::vector<Interop_Objects*> objects, Broker_Space& model)
    : _name(std::move(name)), _classes(classes), _objects(std::move(objects)), _model(model)
{
}

bool Interop_Space::is_profile(std::string_view class_name) const
{
    return std::ranges::any_of(profile_classes,
                               [&](const char* each) { return _classes.is_a(class_name, each); });
}

bool Interop_Space::is_shown_here(std::string_view class_name) const
{
    return std::ranges::any_of(shown_classes,
                               [&](const char* each) { return _classes.is_a(class_name, each); });
}

Interop_Objects* Interop_Space::owner_of(std::string_view class_name) const
{
    const auto found =
        std::ranges::find_if(_objects, [&](const Interop_Objects* each) { return each->owns(class_name); });
    return found == _objects.end() ? nullptr : *found;
}

void Interop_Space::move_in(Path_Value& path) const
{
    for (Named_Value& key : path.keys)
        change_paths(key.value, [&](Path_Value& end) { move_in(end); });
    path.name_space = is_shown_here(path.class_name) ? _name : _model.name();
}

void Interop_Space::move_out(Path_Value& path) const
{
    for (Named_Value& key : path.keys)
        change_paths(key.value, [&](Path_Value& end) { move_out(end); });
    path.name_space = _model.name();
}

Result Interop_Space::forward(Request request, Receiver& receiver)
{
    move_out(request.path);
    Moved_Objects moved(*this, receiver);
    return _model.run(std::move(request), &moved);
}

Result Interop_Space::enumerate(const Request& request, Receiver& receiver)
{
    const bool names = request.operation == Operation::ENUMERATE_INSTANCE_NAMES;
    for (const Interop_Objects* each : _objects)
        for (Instance_Value& instance : each->instances()) {
            if (!_classes.is_a(instance.path.class_name, request.path.class_name))
                continue;
            instance.path.name_space = _name;
            if (!(names ? receiver.path(std::move(instance.path)) : receiver.instance(std::move(instance))))
                return {};
        }
    Result result;
    for (const std::string& name : _model.classes().class_names()) {
        const Class_Info* info = _model.classes().find(name);
        if (!info->has_provider || !is_shown_here(name) || !_classes.is_a(name, request.path.class_name))
            continue;
        Request one = request;
        one.path.class_name = name;
        result = forward(std::move(one), receiver);
        if (!result.ok() || result.stopped)
            break;
    }
    return result;
}

Result Interop_Space::get(const Request& request, Receiver& receiver)
{
    if (const Interop_Objects* owner = owner_of(request.path.class_name)) {
        for (Instance_Value& instance : owner->instances())
            if (same_object(instance.path, request.path)) {
                receiver.instance(std::move(instance));
                return {};
            }
        return failed(CMPI_RC_ERR_NOT_FOUND, "");
    }
    return is_shown_here(request.path.class_name) ? forward(request, receiver)
                                                  : failed(CMPI_RC_ERR_NOT_FOUND, "");
}

/// Subscriptions lead from filters to handlers and back; profiles to what the module knows of them.
Result Interop_Space::traverse(const Request& request, Receiver& receiver)
{
    if (is_profile(request.path.class_name))
        return forward(request, receiver);
    const Association_Filter& filter = request.filter;
    const bool references =
        request.operation == Operation::REFERENCES || request.operation == Operation::REFERENCE_NAMES;
    const bool names =
        request.operation == Operation::REFERENCE_NAMES || request.operation == Operation::ASSOCIATOR_NAMES;
    const auto fits = [&](const std::string& class_name, const std::string& wanted) {
        return wanted.empty() || _classes.is_a(class_name, wanted);
    };
    const auto in_role = [&](const Named_Value& end, const std::string& role) {
        return role.empty() || same_name(end.name, role);
    };
    for (const Interop_Objects* each : _objects)
        for (Instance_Value& link : each->instances()) {
            if (!fits(link.path.class_name, references ? filter.result_class : filter.association_class))
                continue;
            const auto near = std::ranges::find_if(link.path.keys, [&](const Named_Value& end) {
                return end.value.as_path() && same_object(*end.value.as_path(), request.path) &&
                       in_role(end, filter.role);
            });
            if (near == link.path.keys.end())
                continue;
            link.path.name_space = _name;
            if (references) {
                if (!(names ? receiver.path(std::move(link.path)) : receiver.instance(std::move(link))))
                    return {};
                continue;
            }
            for (const Named_Value& end : link.path.keys) {
                const Path_Value* far = end.value.as_path();
                if (&end == &*near || !far || !fits(far->class_name, filter.result_class) ||
                    !in_role(end, filter.result_role))
                    continue;
                Path_Value path = *far;
                path.name_space = _name;
                if (names) {
                    receiver.path(std::move(path));
                    continue;
                }
                Collector found;
                Request one;
                one.path = path;
                if (get(one, found).ok() && !found.instances.empty()) {
                    found.instances.front().path.name_space = _name;
                    receiver.instance(std::move(found.instances.front()));
                }
            }
        }
    return {};
}

Result Interop_Space::run(Request request, Receiver* receiver)
{
    const std::string& class_name = request.path.class_name;
    if (!_classes.find(class_name))
        return failed(CMPI_RC_ERR_INVALID_CLASS, class_name);
    Collector collector;
    Receiver& target = receiver ? *receiver : static_cast<Receiver&>(collector);
    Interop_Objects* const owner = owner_of(class_name);
    Result result;
    switch (request.operation) {
    case Operation::ENUMERATE_INSTANCES:
    case Operation::ENUMERATE_INSTANCE_NAMES:
        result = enumerate(request, target);
        break;
    case Operation::GET_INSTANCE:
        result = get(request, target);
        break;
    case Operation::CREATE_INSTANCE:
        result = owner ? owner->create(std::move(request.instance))
                       : failed(CMPI_RC_ERR_NOT_SUPPORTED, class_name);
        break;
    case Operation::MODIFY_INSTANCE:
        result = owner ? owner->modify(request.instance, request.properties)
                       : failed(CMPI_RC_ERR_NOT_SUPPORTED, class_name);
        break;
    case Operation::DELETE_INSTANCE:
        result = owner ? owner->remove(request.path) : failed(CMPI_RC_ERR_NOT_SUPPORTED, class_name);
        break;
    case Operation::INVOKE_METHOD:
        result = is_shown_here(class_name) ? forward(std::move(request), target)
                                           : failed(CMPI_RC_ERR_METHOD_NOT_AVAILABLE, class_name);
        break;
    default:
        result = traverse(request, target);
    }
    std::ranges::move(collector.instances, std::back_inserter(result.instances));
    std::ranges::move(collector.paths, std::back_inserter(result.paths));
    return result;
}

} // namespace KPRV::kldrcim
