#pragma once

#include "broker/Subscription.h"
#include "kldrcim/server/Indication_Exporter.h"
#include "kldrcim/server/Interop_Space.h"
#include "kldrcim/server/Select_Query.h"

namespace KPRV::kldrcim {

/// Filters, listeners and subscriptions of clients: what they have created, kept in a file from one start to
/// the next, and the way of an indication from the module to each listener that has asked for it.
class Subscriptions final : public Interop_Objects
{
public:
    struct Options
    {
        /// Of the keys that clients leave out.
        std::string system_name;
        /// Names under which the interop name space is known.
        std::vector<std::string> interop_names;
        /// Empty: nothing is kept.
        std::string state_file = {};
        Indication_Exporter::Log log = [](const std::string&) {};
        Delivery_Function deliver = http_delivery();
    };

    Subscriptions(Local_Server& host, const Interop_Classes& classes, Options options);
    ~Subscriptions() override;

    /// What the file holds; false with `error` if it cannot be read. Subscriptions that the module refuses
    /// are told to the log and dropped.
    bool restore(std::string& error);

    bool owns(std::string_view class_name) const override;
    std::vector<Instance_Value> instances() const override;
    Result create(Instance_Value instance) override;
    Result modify(const Instance_Value& instance, const Property_List& properties) override;
    Result remove(const Path_Value& path) override;

private:
    enum class Kind
    {
        FILTER,
        LISTENER,
        SUBSCRIPTION,
    };
    struct Active;

    Kind kind_of(std::string_view class_name) const;
    Instance_Value* find(const Path_Value& path) REQUIRES(_mutex);
    Result add(Instance_Value instance) REQUIRES(_mutex);
    Result check(const Instance_Value& instance) const;
    Result check_filter(const Instance_Value& filter) const;
    /// The named properties of `changes`, or all that it has, into another instance.
    Result merge(Instance_Value& into, const Instance_Value& changes, const Property_List& names) const;
    Result replace(Instance_Value& present, Instance_Value changed) REQUIRES(_mutex);
    /// Tells the module, and what to look at for each indication; nothing for a disabled subscription.
    Result prepare(const Instance_Value& subscription, std::shared_ptr<Active>& active) REQUIRES(_mutex);
    /// In the place of what there was of that path, if there was any.
    void exchange(const Path_Value& path, std::shared_ptr<Active> active) REQUIRES(_mutex);
    void release(const std::shared_ptr<Active>& active) REQUIRES(_mutex);
    Result use_provider_classes(const std::string& class_name, std::vector<std::string>& used)
        REQUIRES(_mutex);
    void leave_provider_class(const std::string& provider_class) REQUIRES(_mutex);
    bool is_in_use(const Path_Value& path) const REQUIRES(_mutex);
    void complete(Instance_Value& instance) const;
    CMPIrc distribute(const Instance_Value& indication);
    void keep() REQUIRES(_mutex);

    Local_Server& _host;
    const Interop_Classes& _classes;
    const Options _options;
    /// Held across calls of the module, which must not be those that deliver: these take the other one.
    mutable Standard_Mutex<> _mutex;
    std::vector<Instance_Value> _instances GUARDED_BY(_mutex);
    std::map<std::string, std::pair<std::unique_ptr<Subscription>, unsigned>> _providers GUARDED_BY(_mutex);
    mutable Standard_Mutex<> _delivery_mutex;
    std::vector<std::shared_ptr<Active>> _active GUARDED_BY(_delivery_mutex);
    std::map<std::string, std::weak_ptr<Indication_Exporter>> _exporters GUARDED_BY(_mutex);
};

} // namespace KPRV::kldrcim
