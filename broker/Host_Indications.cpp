// The indication calls of the host.
#include "broker/Host.h"

namespace KPRV::broker {

/// Calls an entry that takes a filter: context, select expression and class path are made for it.
template <class Entry, class... Arguments>
CMPIrc Host::filter_call(const std::string& provider_class, const std::string& name_space, Entry entry,
                         Arguments... arguments)
{
    Result result;
    CMPIIndicationMI* mi = providers_->indication(provider_class, result);
    if (!mi || !(mi->ft->*entry))
        return result.ok() ? CMPI_RC_ERR_NOT_SUPPORTED : result.rc;
    Request request;
    request.path = {.name_space = name_space, .class_name = provider_class};
    add_context(request);
    Mi_Frame frame(*broker_, request.context);
    Argument<Select_Object> filter(*core_, "SELECT * FROM " + provider_class, std::string("WQL"));
    Argument<Path_Object> path(*core_, request.path);
    frame.run(result, [&] {
        return (mi->ft->*entry)(mi, frame.context(), filter.cmpi(), provider_class.c_str(), path.cmpi(),
                                arguments...);
    });
    return result.rc;
}

template <class Entry>
CMPIrc Host::switch_call(const std::string& provider_class, Entry entry)
{
    Result result;
    CMPIIndicationMI* mi = providers_->indication(provider_class, result);
    if (!mi || !(mi->ft->*entry))
        return result.ok() ? CMPI_RC_ERR_NOT_SUPPORTED : result.rc;
    Request request;
    request.path.name_space = core_->options.name_space;
    add_context(request);
    Mi_Frame frame(*broker_, request.context);
    frame.run(result, [&] { return (mi->ft->*entry)(mi, frame.context()); });
    return result.rc;
}

CMPIrc Host::authorize_filter(const std::string& provider_class, const std::string& name_space)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::authorizeFilter, "owner");
}

CMPIrc Host::must_poll(const std::string& provider_class, const std::string& name_space)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::mustPoll);
}

CMPIrc Host::activate_filter(const std::string& provider_class, const std::string& name_space, bool first)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::activateFilter,
                       static_cast<CMPIBoolean>(first));
}

CMPIrc Host::deactivate_filter(const std::string& provider_class, const std::string& name_space, bool last)
{
    return filter_call(provider_class, name_space, &CMPIIndicationMIFT::deActivateFilter,
                       static_cast<CMPIBoolean>(last));
}

CMPIrc Host::enable_indications(const std::string& provider_class)
{
    return switch_call(provider_class, &CMPIIndicationMIFT::enableIndications);
}

CMPIrc Host::disable_indications(const std::string& provider_class)
{
    return switch_call(provider_class, &CMPIIndicationMIFT::disableIndications);
}

void Host::set_sink(Sink sink)
{
    const Auto_Lock lock(sink_mutex_);
    sink_ = std::move(sink);
}

CMPIrc Host::deliver(const std::string& name_space, const Instance_Value& indication)
{
    Sink sink;
    {
        const Auto_Lock lock(sink_mutex_);
        sink = sink_;
    }
    return sink ? sink(name_space, indication) : CMPI_RC_OK;
}

} // namespace KPRV::broker
