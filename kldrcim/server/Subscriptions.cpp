#include "kldrcim/server/Subscriptions.h"

#include "kldrcim/server/State_File.h"

#include <algorithm>
#include <random>

namespace KPRV::kldrcim {

namespace {

constexpr const char* filter_class = "CIM_IndicationFilter";
constexpr const char* listener_class = "CIM_ListenerDestination";
constexpr const char* subscription_class = "CIM_IndicationSubscription";
constexpr std::uint64_t TRANSIENT = 3, DISABLED = 4;
/// Of all three kinds.
constexpr std::size_t MOST_INSTANCES = 1000;
constexpr std::size_t LONGEST_QUERY = std::size_t(16) << 10;

std::string text_of(const Instance_Value& instance, std::string_view name)
{
    const Plain_Value* value = instance.property(name);
    return value && !value->null ? value->as_text() : std::string();
}

const Path_Value* end_of(const Instance_Value& subscription, std::string_view role)
{
    const Plain_Value* value = subscription.property(role);
    return value && !value->null ? value->as_path() : nullptr;
}

std::uint64_t number_of(const Instance_Value& instance, std::string_view name)
{
    const Plain_Value* value = instance.property(name);
    return value && !value->null ? value->as_uint() : 0;
}

/// True for a subscription with this filter or listener.
bool uses(const Instance_Value& subscription, const Path_Value& path)
{
    const Path_Value* filter = end_of(subscription, "Filter");
    const Path_Value* handler = end_of(subscription, "Handler");
    return (filter && same_object(*filter, path)) || (handler && same_object(*handler, path));
}

bool is_url(const std::string& text)
{
    const std::string lower = lower_name(text);
    const std::size_t scheme = lower.starts_with("http://") ? 7 : lower.starts_with("https://") ? 8 : 0;
    return scheme != 0 && text.size() > scheme && text[scheme] != '/' &&
           text.find_first_of(" \t\r\n") == text.npos;
}

/// Clients compare it to see that a server has begun anew.
std::string new_context(const std::string& system_name)
{
    std::random_device random;
    return system_name + ":" + std::to_string(std::uint64_t(random()) << 32 | random());
}

void default_value(Instance_Value& instance, const char* name, Plain_Value value)
{
    const Plain_Value* present = instance.property(name);
    if (!present || present->null)
        set_value(instance.properties, name, std::move(value));
}

} // namespace

/// A subscription as it is looked at for each indication.
struct Subscriptions::Active
{
    Path_Value path;
    Select_Query query;
    std::vector<std::string> provider_classes;
    std::shared_ptr<Indication_Exporter> exporter;
};

Subscriptions::Subscriptions(Local_Server& host, const Interop_Classes& classes, Options options)
    : _host(host), _classes(classes), _options(std::move(options))
{
    _host.set_sink(
        [this](const std::string&, const Instance_Value& indication) { return distribute(indication); });
}

Subscriptions::~Subscriptions()
{
    // The module is asked to stop before those go who would be told.
    {
        const Auto_Lock lock(_mutex);
        _providers.clear();
    }
    _host.set_sink({});
}

bool Subscriptions::restore(std::string& error)
{
    std::vector<Instance_Value> kept;
    if (_options.state_file.empty())
        return true;
    if (!read_state(_options.state_file, _classes, kept, error))
        return false;
    const Auto_Lock lock(_mutex);
    for (Instance_Value& instance : kept) {
        const std::string name = instance.path.class_name;
        const Result result = add(std::move(instance));
        if (!result.ok())
            _options.log("a kept " + name + " is dropped: " + result.message);
    }
    return true;
}

Subscriptions::Kind Subscriptions::kind_of(std::string_view class_name) const
{
    return _classes.is_a(class_name, filter_class)     ? Kind::FILTER
           : _classes.is_a(class_name, listener_class) ? Kind::LISTENER
                                                       : Kind::SUBSCRIPTION;
}

bool Subscriptions::owns(std::string_view class_name) const
{
    return _classes.is_a(class_name, filter_class) || _classes.is_a(class_name, listener_class) ||
           _classes.is_a(class_name, subscription_class);
}

std::vector<Instance_Value> Subscriptions::instances() const
{
    const Auto_Lock lock(_mutex);
    return _instances;
}

Instance_Value* Subscriptions::find(const Path_Value& path)
{
    const auto found = std::ranges::find_if(
        _instances, [&](const Instance_Value& each) { return same_object(each.path, path); });
    return found == _instances.end() ? nullptr : &*found;
}

void Subscriptions::complete(Instance_Value& instance) const
{
    const Class_Info* info = _classes.find(instance.path.class_name);
    instance.path.class_name = info->name;
    if (kind_of(info->name) == Kind::SUBSCRIPTION) {
        constexpr std::uint64_t ENABLED = 2, ignore = 2, none = 2;
        default_value(instance, "SubscriptionState", Plain_Value::unsigned_number(CMPI_uint16, ENABLED));
        default_value(instance, "OnFatalErrorPolicy", Plain_Value::unsigned_number(CMPI_uint16, ignore));
        default_value(instance, "RepeatNotificationPolicy", Plain_Value::unsigned_number(CMPI_uint16, none));
        // Where the ends are is known: other names of this server, and of its name space, are not kept.
        for (const char* role : {"Filter", "Handler"})
            if (const Path_Value* end = end_of(instance, role)) {
                Path_Value path = *end;
                path.host.clear();
                path.name_space = _options.interop_names.front();
                set_value(instance.properties, role, Plain_Value::path(std::move(path)));
            }
    } else {
        default_value(instance, "SystemCreationClassName", Plain_Value::text("CIM_ComputerSystem"));
        default_value(instance, "SystemName", Plain_Value::text(_options.system_name));
        default_value(instance, "CreationClassName", Plain_Value::text(info->name));
        default_value(instance, "Name", Plain_Value::text(new_context(info->name)));
    }
    instance.path.keys.clear();
    for (const Feature_Info& feature : info->properties)
        if (const Plain_Value* value = feature.key ? instance.property(feature.name) : nullptr)
            instance.path.keys.push_back({feature.name, *value});
}

Result Subscriptions::check_filter(const Instance_Value& filter) const
{
    const std::string query = text_of(filter, "Query");
    if (query.size() > LONGEST_QUERY)
        return failed(CMPI_RC_ERR_INVALID_QUERY, "the query is too long");
    Query_Error error;
    const auto parsed = Select_Query::parse(query, text_of(filter, "QueryLanguage"), error);
    if (!parsed)
        return failed(error.rc, error.text);
    const Class_Info* info = _classes.find(parsed->class_name());
    if (!info || !info->is_indication)
        return failed(CMPI_RC_ERR_INVALID_CLASS, parsed->class_name() + " is no class of indications");
    std::vector<std::string> sources;
    if (const Plain_Value* list = filter.property("SourceNamespaces"))
        for (const Plain_Value& each : list->elements())
            sources.push_back(each.as_text());
    if (sources.empty() && !text_of(filter, "SourceNamespace").empty())
        sources.push_back(text_of(filter, "SourceNamespace"));
    // Who says none, or where filters live, means where the indications are.
    std::erase_if(sources, [&](const std::string& each) {
        return same_name(each, _host.options().name_space) ||
               std::ranges::any_of(_options.interop_names,
                                   [&](const std::string& name) { return same_name(name, each); });
    });
    return sources.empty() ? Result() : failed(CMPI_RC_ERR_INVALID_NAMESPACE, sources.front());
}

Result Subscriptions::check(const Instance_Value& instance) const
{
    const Kind kind = kind_of(instance.path.class_name);
    if (kind == Kind::FILTER)
        return check_filter(instance);
    return kind == Kind::SUBSCRIPTION || is_url(text_of(instance, "Destination"))
               ? Result()
               : failed(CMPI_RC_ERR_INVALID_PARAMETER, "Destination is no URL of http or https");
}

Result Subscriptions::add(Instance_Value instance)
{
    if (_instances.size() >= MOST_INSTANCES)
        return failed(CMPI_RC_ERR_FAILED, "too many filters, listeners and subscriptions");
    complete(instance);
    if (find(instance.path))
        return failed(CMPI_RC_ERR_ALREADY_EXISTS, "");
    Result result = check(instance);
    std::shared_ptr<Active> active;
    if (result.ok() && kind_of(instance.path.class_name) == Kind::SUBSCRIPTION)
        result = prepare(instance, active);
    if (!result.ok())
        return result;
    exchange(instance.path, std::move(active));
    result.paths.push_back(instance.path);
    _instances.push_back(std::move(instance));
    return result;
}

Result Subscriptions::create(Instance_Value instance)
{
    const Auto_Lock lock(_mutex);
    Result result = add(std::move(instance));
    if (result.ok())
        keep();
    return result;
}

Result Subscriptions::merge(Instance_Value& into, const Instance_Value& changes,
                            const Property_List& names) const
{
    const Class_Info* info = _classes.find(into.path.class_name);
    const auto has = [&](const std::string& name) { return info->property(name) != nullptr; };
    std::vector<std::string> changed = names.value_or(std::vector<std::string>());
    if (!names)
        for (const Named_Value& each : changes.properties)
            changed.push_back(each.name);
    for (const std::string& name : changed) {
        if (!has(name))
            return failed(CMPI_RC_ERR_NO_SUCH_PROPERTY, name);
        const Feature_Info& feature = *info->property(name);
        const Plain_Value* value = changes.property(name);
        set_value(into.properties, feature.name, value ? *value : Plain_Value::null_of(feature.type));
    }
    const Path_Value path = into.path;
    complete(into);
    return same_object(into.path, path) ? Result()
                                        : failed(CMPI_RC_ERR_INVALID_PARAMETER, "keys cannot be changed");
}

/// The subscriptions that an object is, or that use it, go over to what has changed all at once, or not at
/// all.
Result Subscriptions::replace(Instance_Value& present, Instance_Value changed)
{
    std::swap(present, changed);
    std::vector<std::pair<Path_Value, std::shared_ptr<Active>>> fresh;
    Result result;
    for (const Instance_Value& each : _instances)
        if (result.ok() && kind_of(each.path.class_name) == Kind::SUBSCRIPTION &&
            (&each == &present || uses(each, present.path))) {
            auto& [path, active] = fresh.emplace_back(each.path, nullptr);
            result = prepare(each, active);
        }
    if (!result.ok())
        std::swap(present, changed);
    for (auto& [path, active] : fresh)
        if (result.ok())
            exchange(path, std::move(active));
        else
            release(active);
    return result;
}

Result Subscriptions::modify(const Instance_Value& instance, const Property_List& properties)
{
    const Auto_Lock lock(_mutex);
    Instance_Value* const present = find(instance.path);
    if (!present)
        return failed(CMPI_RC_ERR_NOT_FOUND, "");
    Instance_Value changed = *present;
    Result result = merge(changed, instance, properties);
    if (result.ok())
        result = check(changed);
    if (result.ok())
        result = replace(*present, std::move(changed));
    if (result.ok())
        keep();
    return result;
}

bool Subscriptions::is_in_use(const Path_Value& path) const
{
    return std::ranges::any_of(_instances, [&](const Instance_Value& each) { return uses(each, path); });
}

Result Subscriptions::remove(const Path_Value& path)
{
    const Auto_Lock lock(_mutex);
    if (!find(path))
        return failed(CMPI_RC_ERR_NOT_FOUND, "");
    if (is_in_use(path))
        return failed(CMPI_RC_ERR_FAILED, "a subscription uses it");
    exchange(path, nullptr);
    std::erase_if(_instances, [&](const Instance_Value& each) { return same_object(each.path, path); });
    keep();
    return {};
}

/// The provider classes that make what a class stands for: itself and those below.
Result Subscriptions::use_provider_classes(const std::string& class_name, std::vector<std::string>& used)
{
    Result refused = failed(CMPI_RC_ERR_NOT_SUPPORTED, "nobody makes " + class_name);
    for (const std::string& name : _classes.class_names()) {
        const Class_Info* info = _classes.find(name);
        if (!info->is_indication || !info->has_provider || !_classes.is_a(name, class_name))
            continue;
        auto& [subscription, count] = _providers[name];
        if (!subscription) {
            auto fresh = std::make_unique<Subscription>(_host, name);
            if (const CMPIrc rc = fresh->add(_host.options().name_space); rc != CMPI_RC_OK) {
                refused = failed(rc, name + " takes no subscription");
                _providers.erase(name);
                continue;
            }
            subscription = std::move(fresh);
        }
        ++count;
        used.push_back(name);
    }
    return used.empty() ? refused : Result();
}

void Subscriptions::leave_provider_class(const std::string& provider_class)
{
    const auto found = _providers.find(provider_class);
    if (found != _providers.end() && --found->second.second == 0)
        _providers.erase(found);
}

Result Subscriptions::prepare(const Instance_Value& subscription, std::shared_ptr<Active>& active)
{
    const Path_Value* filter_path = end_of(subscription, "Filter");
    const Path_Value* handler_path = end_of(subscription, "Handler");
    const Instance_Value* filter = filter_path ? find(*filter_path) : nullptr;
    const Instance_Value* handler = handler_path ? find(*handler_path) : nullptr;
    if (!filter || !handler || kind_of(filter->path.class_name) != Kind::FILTER ||
        kind_of(handler->path.class_name) != Kind::LISTENER)
        return failed(CMPI_RC_ERR_INVALID_PARAMETER, "there is no such filter or listener");
    Query_Error error;
    auto query = Select_Query::parse(text_of(*filter, "Query"), text_of(*filter, "QueryLanguage"), error);
    if (!query)
        return failed(error.rc, error.text);
    if (number_of(subscription, "SubscriptionState") == DISABLED)
        return {};
    std::vector<std::string> used;
    if (Result result = use_provider_classes(query->class_name(), used); !result.ok())
        return result;
    const std::string url = text_of(*handler, "Destination");
    std::shared_ptr<Indication_Exporter> exporter = _exporters[url].lock();
    if (!exporter) {
        exporter = std::make_shared<Indication_Exporter>(url, new_context(_options.system_name), _options.log,
                                                         _options.deliver);
        _exporters[url] = exporter;
    }
    active =
        std::make_shared<Active>(Active{subscription.path, std::move(*query), std::move(used), exporter});
    return {};
}

void Subscriptions::exchange(const Path_Value& path, std::shared_ptr<Active> active)
{
    std::shared_ptr<Active> gone;
    {
        const Auto_Lock lock(_delivery_mutex);
        const auto found =
            std::ranges::find_if(_active, [&](const auto& each) { return same_object(each->path, path); });
        if (found != _active.end()) {
            gone = *found;
            _active.erase(found);
        }
        if (active)
            _active.push_back(std::move(active));
    }
    release(gone);
}

void Subscriptions::release(const std::shared_ptr<Active>& active)
{
    if (active)
        for (const std::string& provider_class : active->provider_classes)
            leave_provider_class(provider_class);
}

CMPIrc Subscriptions::distribute(const Instance_Value& indication)
{
    std::vector<std::shared_ptr<Active>> all;
    {
        const Auto_Lock lock(_delivery_mutex);
        all = _active;
    }
    for (const auto& each : all)
        if (each->query.matches(indication, _classes)) {
            Instance_Value own = indication;
            each->query.project(own);
            each->exporter->put(std::move(own));
        }
    return CMPI_RC_OK;
}

/// What is to outlive this process: not the transient listeners, and not what hangs on them.
void Subscriptions::keep()
{
    if (_options.state_file.empty())
        return;
    const auto is_transient = [&](const Path_Value* listener) REQUIRES(_mutex) {
        const Instance_Value* found = listener ? find(*listener) : nullptr;
        return found && number_of(*found, "PersistenceType") == TRANSIENT;
    };
    std::vector<Instance_Value> kept;
    for (const Instance_Value& each : _instances)
        if (!is_transient(&each.path) && !is_transient(end_of(each, "Handler")))
            kept.push_back(each);
    std::string error;
    if (!write_state(_options.state_file, kept, error))
        _options.log(error);
}

} // namespace KPRV::kldrcim
