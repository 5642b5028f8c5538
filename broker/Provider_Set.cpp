#include "broker/Provider_Set.h"

#include "broker/Mi_Call.h"

#include <algorithm>

namespace KPRV::broker {

namespace {

template <class Mi>
using Factory = Mi* (*)(const CMPIBroker*, const CMPIContext*, CMPIStatus*);

/// The status is preset to 0; an interface counts only if it is still 0 afterwards.
template <class Mi>
void* call_factory(Mi_Frame& frame, void* factory, const CMPIBroker* broker, Result& answer)
{
    Mi* mi = nullptr;
    frame.run(answer, [&] {
        CMPIStatus status = {CMPI_RC_OK, nullptr};
        mi = reinterpret_cast<Factory<Mi>>(factory)(broker, frame.context(), &status);
        return status;
    });
    return mi && mi->ft && answer.ok() ? mi : nullptr;
}

template <class Mi>
CMPIrc call_cleanup(void* mi, const CMPIContext* context, bool terminating)
{
    auto* typed = static_cast<Mi*>(mi);
    return typed->ft->cleanup ? typed->ft->cleanup(typed, context, terminating).rc : CMPI_RC_OK;
}

} // namespace

CMPIInstanceMI* Provider_Set::instance(const std::string& class_name, Result& answer)
{
    return static_cast<CMPIInstanceMI*>(get(class_name, Mi_Kind::INSTANCE, answer));
}

CMPIAssociationMI* Provider_Set::association(const std::string& class_name, Result& answer)
{
    return static_cast<CMPIAssociationMI*>(get(class_name, Mi_Kind::ASSOCIATION, answer));
}

CMPIMethodMI* Provider_Set::method(const std::string& class_name, Result& answer)
{
    return static_cast<CMPIMethodMI*>(get(class_name, Mi_Kind::METHOD, answer));
}

CMPIIndicationMI* Provider_Set::indication(const std::string& class_name, Result& answer)
{
    return static_cast<CMPIIndicationMI*>(get(class_name, Mi_Kind::INDICATION, answer));
}

void* Provider_Set::get(const std::string& class_name, Mi_Kind kind, Result& answer)
{
    const Auto_Lock lock(_mutex);
    auto at = _made.find({class_name, kind});
    if (at != _made.end())
        return at->second;
    void* mi = make(class_name, kind, answer);
    if (mi)
        _made[{class_name, kind}] = mi;
    return mi;
}

void* Provider_Set::make(const std::string& class_name, Mi_Kind kind, Result& answer)
{
    void* factory = _module.factory(class_name, kind);
    if (!factory)
        return nullptr;
    Mi_Frame frame(_broker, {});
    switch (kind) {
    case Mi_Kind::INSTANCE:
        return call_factory<CMPIInstanceMI>(frame, factory, _broker.cmpi(), answer);
    case Mi_Kind::ASSOCIATION:
        return call_factory<CMPIAssociationMI>(frame, factory, _broker.cmpi(), answer);
    case Mi_Kind::METHOD:
        return call_factory<CMPIMethodMI>(frame, factory, _broker.cmpi(), answer);
    default:
        return call_factory<CMPIIndicationMI>(frame, factory, _broker.cmpi(), answer);
    }
}

CMPIrc Provider_Set::cleanup_one(void* mi, Mi_Kind kind, bool terminating)
{
    Argument<Context_Object> context(*_broker.core());
    Call_Frame frame(_broker.core(), context.cmpi());
    switch (kind) {
    case Mi_Kind::INSTANCE:
        return call_cleanup<CMPIInstanceMI>(mi, context.cmpi(), terminating);
    case Mi_Kind::ASSOCIATION:
        return call_cleanup<CMPIAssociationMI>(mi, context.cmpi(), terminating);
    case Mi_Kind::METHOD:
        return call_cleanup<CMPIMethodMI>(mi, context.cmpi(), terminating);
    default:
        return call_cleanup<CMPIIndicationMI>(mi, context.cmpi(), terminating);
    }
}

template <class Wanted>
CMPIrc Provider_Set::cleanup_if(Wanted wanted, bool terminating)
{
    const Auto_Lock lock(_mutex);
    CMPIrc highest = CMPI_RC_OK;
    for (Mi_Kind kind : mi_kinds) {
        for (auto at = _made.begin(); at != _made.end();) {
            if (at->first.second != kind || !wanted(at->first.first)) {
                ++at;
                continue;
            }
            CMPIrc rc = cleanup_one(at->second, kind, terminating);
            highest = std::max(highest, rc);
            bool kept = rc == CMPI_RC_DO_NOT_UNLOAD || rc == CMPI_RC_NEVER_UNLOAD;
            at = kept ? std::next(at) : _made.erase(at);
        }
    }
    return highest;
}

CMPIrc Provider_Set::cleanup(bool terminating)
{
    return cleanup_if([](const std::string&) { return true; }, terminating);
}

CMPIrc Provider_Set::cleanup(const std::string& class_name, bool terminating)
{
    return cleanup_if([&](const std::string& name) { return name == class_name; }, terminating);
}

std::size_t Provider_Set::count() const
{
    const Auto_Lock lock(_mutex);
    return _made.size();
}

} // namespace KPRV::broker
