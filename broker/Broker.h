#pragma once

#include "broker/Call.h"
#include "broker/Objects.h"
#include "broker/Up_Calls.h"

namespace KPRV::broker {

/// The server as a provider sees it: a `CMPIBroker` whose tables have all slots of level 1.0. The slots of
/// later levels are present and null, so that a provider that looks for them finds them missing. The broker
/// must outlive every provider that got it.
class Broker
{
public:
    Broker(std::shared_ptr<Core> core, Up_Calls& up_calls);
    ~Broker();
    Broker(const Broker&) = delete;
    Broker& operator=(const Broker&) = delete;

    const CMPIBroker* cmpi() const { return &_level_100; }
    const std::shared_ptr<Core>& core() const { return _core; }
    Up_Calls& up_calls() const { return _up_calls; }

    /// The broker at this address, null for any other.
    static Broker* find(const CMPIBroker* address);

private:
    std::shared_ptr<Core> _core;
    Up_Calls& _up_calls;
    CMPIBroker _level_100 = {};
    /// Where a provider of level 2.0 looks for the memory table.
    [[maybe_unused]] const void* _no_memory_table = nullptr;
};

/// One call through a broker table: like `Call`, but the object is the broker. Up-calls ask for a context
/// too.
class Broker_Call : public Call_Base
{
public:
    Broker_Call(const char* name, const CMPIBroker* self, CMPIStatus* rc, const char* argument = nullptr);

    Broker* operator->() const { return _broker; }
    Core& core() const { return *_broker->core(); }
    /// Null after a violation.
    Context_Object* context(const CMPIContext* context);

private:
    Broker* _broker;
};

extern const CMPIBrokerFT* const broker_table;
extern const CMPIBrokerEncFT* const broker_enc_table;
extern const CMPIBrokerExtFT* const broker_ext_table;

/// A table of level 1.0, followed by the slots that later levels have appended, all null.
template <class Table, std::size_t Later>
struct With_Null_Slots
{
    Table table;
    const void* later[Later];
};

} // namespace KPRV::broker
