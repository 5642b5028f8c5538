#pragma once

#include "broker/Mi_Call.h"
#include "broker/Server_Store.h"
#include "broker/values/Cim_Operations.h"
#include "module/runtime/system/Standard_Mutex.h"

namespace KPRV::broker {

/// A CIM server in one process: opens one provider module as servers do, offers the CIM operations on it, and
/// serves its up-calls, which come back into the same module on the same thread. Several threads may call it
/// at once. Destruction cleans all providers up (terminating) and closes the library.
///
///     std::string error;
///     auto host = Local_Server::open("./libkldrprovider_Module.so", {}, error);
///     Result result = host->enumerate_instances("KALDERA_FCPort");
///     ASSERT_EQ("", host->violations().text());
class Local_Server final : public Cim_Operations, private Up_Calls
{
public:
    using Sink = std::function<CMPIrc(const std::string& name_space, const Instance_Value& indication)>;

    /// Null if the library cannot be opened; `error` then holds the loader's text.
    static std::unique_ptr<Local_Server> open(const std::string& library, Server_Options options,
                                              std::string& error);
    ~Local_Server() override;

    /// A client's operation; its context gets the usual entries where it has none. A path without a name
    /// space gets that of the options. An enumeration of a superclass asks the providers of all its
    /// subclasses; the first that fails ends it. Rc 5 for a class that neither the catalogue nor a factory
    /// knows, 7 for one that nobody serves.
    ///
    /// An association request goes to the providers of the class that its filter names and of the subclasses,
    /// or, without such a filter, to every association with a role that can hold the path's class; objects
    /// that several report come once, and it fails only if all fail. Rc 5 if the named class is unknown, 7 if
    /// it has no provider.
    Result run(Request request, Receiver* receiver = nullptr) override;
    /// The association calls of one provider class, whatever the path's class.
    Result associators(const std::string& provider_class, const Path_Value& path,
                       const Association_Filter& filter, const Property_List& properties = {});
    Result associator_names(const std::string& provider_class, const Path_Value& path,
                            const Association_Filter& filter);
    Result references(const std::string& provider_class, const Path_Value& path,
                      const Association_Filter& filter, const Property_List& properties = {});
    Result reference_names(const std::string& provider_class, const Path_Value& path,
                           const Association_Filter& filter);

    /// The same, at the provider of one class.
    Result run_at(const std::string& provider_class, Request request, Receiver* receiver = nullptr);

    /// The calls of an indication interface. The path of a filter is its name space and class.
    CMPIrc authorize_filter(const std::string& provider_class, const std::string& name_space);
    CMPIrc must_poll(const std::string& provider_class, const std::string& name_space);
    CMPIrc activate_filter(const std::string& provider_class, const std::string& name_space,
                           bool first = true);
    CMPIrc deactivate_filter(const std::string& provider_class, const std::string& name_space,
                             bool last = true);
    CMPIrc enable_indications(const std::string& provider_class);
    CMPIrc disable_indications(const std::string& provider_class);
    /// Gets each delivered indication, on the thread that delivers it. Without a sink they are dropped.
    void set_sink(Sink sink);

    /// Cleans providers up, all or one class's; see `Provider_Set::cleanup`. They come back with the next
    /// call.
    CMPIrc unload(bool terminating) { return _providers->cleanup(terminating); }
    CMPIrc unload(const std::string& class_name, bool terminating);

    const Server_Options& options() const { return _core->options; }
    const Class_Catalogue& catalogue() const { return *_catalogue; }
    const Module& module() const { return *_module; }
    Provider_Set& providers() { return *_providers; }
    Broker& broker() { return *_broker; }
    Server_Store& store() { return _store; }
    Violations& violations() { return _core->violations; }
    Ledger& ledger() { return _core->ledger; }
    Call_Log& calls() { return _core->calls; }

private:
    Local_Server(std::unique_ptr<Module> module, Server_Options options);

    Result up_call(const Request& request) override;
    CMPIrc deliver(const std::string& name_space, const Instance_Value& indication) override;

    bool may_be_asked(const Request& request) const;
    /// To one provider, or to all below a class that is enumerated.
    Result route(const Request& request, Receiver* receiver = nullptr);
    /// To every association that the request concerns.
    Result traverse(const Request& request, Receiver* receiver = nullptr);
    std::vector<std::string> classes_that_serve(const Request& request) const;
    bool is_known_class(const std::string& class_name) const;
    void add_context(Request& request) const;
    template <class Entry, class... Arguments>
    CMPIrc filter_call(const std::string& provider_class, const std::string& name_space, Entry entry,
                       Arguments... arguments);
    template <class Entry>
    CMPIrc switch_call(const std::string& provider_class, Entry entry);

    std::shared_ptr<Core> _core;
    std::unique_ptr<Module> _module;
    std::unique_ptr<Class_Catalogue> _catalogue;
    std::unique_ptr<Broker> _broker;
    std::unique_ptr<Provider_Set> _providers;
    Server_Store _store;
    Standard_Mutex<> _sink_mutex;
    Sink _sink GUARDED_BY(_sink_mutex);
};

} // namespace KPRV::broker
