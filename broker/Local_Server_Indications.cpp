// The indication calls of the server.
#include "broker/Local_Server.h"

namespace KPRV::broker {

/// Calls an entry that takes a filter: context, select expression and class path are made for it.
template <class Entry, class... Arguments>
CMPIrc Local_Server::filter_call(const std::string& provider_class, const std::string& name_space,
                                 Entry entry, Arguments... arguments)
{
    Result result;
    CMPIIndicationMI* mi = _providers->indication(provider_class, result);
    if (!mi || !(mi->ft->*entry))
        return result.ok() ? CMPI_RC_ERR_NOT_SUPPORTED : result.rc;
    Request request;
    request.path = {.name_space = name_space, .class_name = provider_class};
    add_context(request);
    Mi_Frame frame(*_broker, request.context);
    Argument<Select_Object> filter(*_core, "SELECT * FROM " + provider_class, std::string("WQL"));
    Argument<Path_Object> path(*_core, request.path);
    frame.run(result, [&] {
        return (mi->ft->*entry)(mi, frame.context(), filter.cmpi(), provider_class.c_str(), path.cmpi(),
                                arguments...);
    });
    return result.rc;
}

template <class Entry>
CMPIrc Local_Server::switch_call(const std::string& provider_class, Entry entry)
{
    Result result;
    CMPIIndicationMI* mi = _providers->indication(provider_class, result);
    if (!mi || !(mi->ft->*entry))
        return result.ok() ? CMPI_RC_ERR_NOT_SUPPORTED : result.rc;
    Request request;
    request.path.name_space = _core->options.name_space;
    add_context(request);
    Mi_Frame frame(*_broker, request.context);
    frame.run(result, [&] { return (mi->ft->*entry)(mi, frame.context()); });
    return result.rc;
}

CMPIrc Local_Server::authorize_filter(const std::string& provider_class, const std::string& name_space)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::authorizeFilter, "owner");
}

CMPIrc Local_Server::must_poll(const std::string& provider_class, const std::string& name_space)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::mustPoll);
}

CMPIrc Local_Server::activate_filter(const std::string& provider_class, const std::string& name_space,
                                     bool first)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::activateFilter,
                       static_cast<CMPIBoolean>(first));
}

CMPIrc Local_Server::deactivate_filter(const std::string& provider_class, const std::string& name_space,
                                       bool last)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::deActivateFilter,
                       static_cast<CMPIBoolean>(last));
}

CMPIrc Local_Server::enable_indications(const std::string& provider_class)
{
    return switch_call(provider_class, &CMPIIndicationMIFT::enableIndications);
}

CMPIrc Local_Server::disable_indications(const std::string& provider_class)
{
    return switch_call(provider_class, &CMPIIndicationMIFT::disableIndications);
}

void Local_Server::set_sink(Sink sink)
{
    const Auto_Lock lock(_sink_mutex);
    _sink = std::move(sink);
}

CMPIrc Local_Server::deliver(const std::string& name_space, const Instance_Value& indication)
{
    Sink sink;
    {
        const Auto_Lock lock(_sink_mutex);
        sink = _sink;
    }
    return sink ? sink(name_space, indication) : CMPI_RC_OK;
}

} // namespace KPRV::broker
