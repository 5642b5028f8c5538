#include "broker/Broker.h"

#include "module/runtime/system/Standard_Mutex.h"

#include <set>

namespace KPRV::broker {

namespace {

constinit Standard_Mutex<> brokers_mutex;

std::set<const Broker*>& brokers() REQUIRES(brokers_mutex)
{
    static std::set<const Broker*> all;
    return all;
}

} // namespace

Broker::Broker(std::shared_ptr<Core> core, Up_Calls& up_calls) : _core(std::move(core)), _up_calls(up_calls)
{
    _level_100 = {this, broker_table, broker_enc_table, broker_ext_table};
    const Auto_Lock lock(brokers_mutex);
    brokers().insert(this);
}

Broker::~Broker()
{
    const Auto_Lock lock(brokers_mutex);
    brokers().erase(this);
}

Broker* Broker::find(const CMPIBroker* address)
{
    const Auto_Lock lock(brokers_mutex);
    for (const Broker* broker : brokers())
        if (&broker->_level_100 == address)
            return const_cast<Broker*>(broker);
    return nullptr;
}

Broker_Call::Broker_Call(const char* name, const CMPIBroker* self, CMPIStatus* rc, const char* argument)
    : Call_Base(name, rc), _broker(Broker::find(self))
{
    if (!_broker) {
        if (Call_Frame* frame = Call_Frame::top())
            frame->core().violations.add(name, "this is not a broker of this server");
        set(CMPI_RC_ERR_INVALID_HANDLE);
    } else if (CMPIrc rc_told = core().calls.enter(name, argument ? argument : "")) {
        set(rc_told);
    }
}

Context_Object* Broker_Call::context(const CMPIContext* context)
{
    return argument_object<Context_Object>(*this, core(), context);
}

} // namespace KPRV::broker
