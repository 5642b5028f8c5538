#include "kldrcim/verbs/Result_Filter.h"

#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Typed_Input.h"
#include "kldrcim/verbs/Value_Condition.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

bool is_backward(const Cli_Options& options)
{
    return options.sort.starts_with('-');
}

std::string sort_name(const Cli_Options& options)
{
    return options.sort.substr(is_backward(options) ? 1 : 0);
}

const std::vector<Named_Value>& values_of(const Instance_Value& instance)
{
    return instance.properties;
}

const std::vector<Named_Value>& values_of(const Path_Value& path)
{
    return path.keys;
}

} // namespace

std::vector<std::string> filter_names(const Cli_Options& options)
{
    std::vector<std::string> names;
    for (const Where_Clause& condition : options.conditions)
        names.push_back(condition.name);
    if (!options.sort.empty())
        names.push_back(sort_name(options));
    return names;
}

bool sorts_before(const Cli_Options& options, const std::vector<Named_Value>& a,
                  const std::vector<Named_Value>& b)
{
    const std::string name = sort_name(options);
    const Plain_Value *first = find_value(a, name), *second = find_value(b, name);
    if (!first || first->null || !second || second->null)
        return first && !first->null && (!second || second->null);
    return is_backward(options) ? stands_before(*second, *first) : stands_before(*first, *second);
}

Result_Filter::Result_Filter(const Cli_Options& options, std::unique_ptr<Result_Writer> writer)
    : _options(options), _writer(std::move(writer)), _missed(filter_names(options))
{
    if (options.properties)
        for (const std::string& name : _missed)
            if (!contains_name(*options.properties, name))
                _extra.push_back(name);
}

bool Result_Filter::instance(Instance_Value&& instance)
{
    return take(_instances, instance.path.class_name, instance.properties, std::move(instance));
}

bool Result_Filter::path(Path_Value&& path)
{
    _are_paths = true;
    return take(_paths, path.class_name, path.keys, std::move(path));
}

void Result_Filter::end(bool complete)
{
    hand_on(_instances);
    hand_on(_paths);
    if (!_options.total)
        _writer->end(complete);
    else if (complete)
        put(std::to_string(_count) + "\n");
}

std::string Result_Filter::missed_name(const Class_Catalogue& catalogue) const
{
    const auto is_known = [&](const std::string& name) {
        return std::ranges::any_of(_classes, [&](const std::string& class_name) {
            const Class_Info* const info = catalogue.find(class_name);
            const Feature_Info* const property = info ? info->property(name) : nullptr;
            return property && (property->key || !_are_paths);
        });
    };
    const auto missed = std::ranges::find_if_not(_missed, is_known);
    return missed == _missed.end() || _classes.empty() ? "" : *missed;
}

template <class Thing>
bool Result_Filter::take(std::vector<Thing>& kept, const std::string& class_name,
                         const std::vector<Named_Value>& values, Thing&& thing)
{
    look_for_names(class_name, values);
    if (!meets_conditions(_options, class_name, values))
        return true;
    ++_count;
    if (_options.total)
        return true;
    if (_options.sort.empty())
        return give(std::forward<Thing>(thing));
    kept.push_back(std::forward<Thing>(thing));
    return true;
}

template <class Thing>
void Result_Filter::hand_on(std::vector<Thing>& kept)
{
    std::ranges::stable_sort(kept, [&](const Thing& a, const Thing& b) {
        return sorts_before(_options, values_of(a), values_of(b));
    });
    for (Thing& thing : kept)
        if (!give(std::move(thing)))
            return;
}

void Result_Filter::look_for_names(const std::string& class_name, const std::vector<Named_Value>& values)
{
    std::erase_if(_missed, [&](const std::string& name) { return find_value(values, name) != nullptr; });
    if (!_missed.empty())
        _classes.insert(class_name);
}

bool Result_Filter::give(Instance_Value&& instance)
{
    if (!_extra.empty())
        std::erase_if(instance.properties,
                      [&](const Named_Value& property) { return contains_name(_extra, property.name); });
    const bool goes_on = _writer->instance(std::move(instance));
    flush_in_time();
    return goes_on;
}

bool Result_Filter::give(Path_Value&& path)
{
    const bool goes_on = _writer->path(std::move(path));
    flush_in_time();
    return goes_on;
}

bool meets_conditions(const Cli_Options& options, const std::string& class_name,
                      const std::vector<Named_Value>& values)
{
    const Class_Words words(class_name);
    return std::ranges::all_of(options.conditions, [&](const Where_Clause& condition) {
        return holds(condition, words.of(condition.name), find_value(values, condition.name));
    });
}

Property_List properties_for(const Cli_Options& options)
{
    Property_List properties = options.properties;
    const std::vector<std::string> names = filter_names(options);
    // Only counted: nothing else is looked at.
    if (options.total && !names.empty())
        return names;
    if (properties)
        for (const std::string& name : names)
            if (!contains_name(*properties, name))
                properties->push_back(name);
    return properties;
}

bool check_filter(const Cli_Options& options, const Class_Catalogue& catalogue, const std::string& class_name,
                  bool are_paths, std::string& error)
{
    const Class_Info* const info = catalogue.find(class_name);
    if (!info)
        return true;
    const std::vector<std::string> names = filter_names(options);
    if (!check_properties(catalogue, class_name, names, error))
        return false;
    for (const std::string& name : names)
        if (are_paths && !info->property(name)->key) {
            error = info->name + "." + info->property(name)->name + " is no key, and " + options.verb +
                    " brings keys only";
            return false;
        }
    return std::ranges::all_of(options.conditions, [&](const Where_Clause& condition) {
        return check_condition(catalogue, *info, condition, error);
    });
}

bool check_filter_options(const Cli_Options& options, std::string& error)
{
    if (options.total && !options.sort.empty())
        error = "--sort makes no sense with --count";
    return error.empty();
}

} // namespace KPRV::kldrcim
