// The entries of the indication table, and what the provider's thread calls with each indication.
#include "module/cmpi/Converter.h"
#include "module/cmpi/Made_Objects.h"
#include "module/cmpi/Operation_Scope.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/status_translation.h"
#include "module/runtime/system/Time.h"
#include "module/runtime/system/assert.h"

#include <memory>
#include <utility>

// Filters are not evaluated: what counts is in which name spaces there are active ones. Filters and enabling
// are independent of each other, since servers call them in either order.

namespace KPRV {

static CMPIStatus trace_ok(Call_Site site, const char* function)
{
    CMPI_Adapter::ret(site.file, site.line, function, CMPI_RC_OK);
    return {CMPI_RC_OK, nullptr};
}

static CMPIStatus authorizeFilter(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                                  const CMPIObjectPath*, const char*)
{
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "authorizeFilter");
    return trace_ok(LOG_HERE, "authorizeFilter");
}

static CMPIStatus mustPoll(CMPIIndicationMI*, const CMPIContext*, const CMPISelectExp*, const char*,
                           const CMPIObjectPath*)
{
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "mustPoll");
    return trace_ok(LOG_HERE, "mustPoll");
}

static CMPIStatus activateFilter(CMPIIndicationMI* mi, const CMPIContext*, const CMPISelectExp*, const char*,
                                 const CMPIObjectPath* cop, CMPIBoolean)
{
    CMPI_Adapter* const adapter = _adapter(mi);
    const Auto_Mutex lock(adapter->adapter_mutex);
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "activateFilter");

    const Name_Space_Entry entry{name_space_of(cop), 1};
    const uint32 index = adapter->name_spaces.find(entry);
    if (index == NPOS)
        adapter->name_spaces.append(entry);
    else
        adapter->name_spaces[index].count++;
    return trace_ok(LOG_HERE, "activateFilter");
}

static CMPIStatus deactivateFilter(CMPIIndicationMI* mi, const CMPIContext*, const CMPISelectExp*,
                                   const char*, const CMPIObjectPath* cop, CMPIBoolean)
{
    CMPI_Adapter* const adapter = _adapter(mi);
    const Auto_Mutex lock(adapter->adapter_mutex);
    CMPI_Adapter::ent(__FILE_NAME__, __LINE__, "deactivateFilter");

    const uint32 index = adapter->name_spaces.find({name_space_of(cop), 1});
    if (index != NPOS) {
        if (adapter->name_spaces[index].count > 1)
            adapter->name_spaces[index].count--;
        else
            adapter->name_spaces.remove(index);
    }
    return trace_ok(LOG_HERE, "deactivateFilter");
}

namespace {

/// Holds the adapter while a delivery is prepared. An operation that disables indications keeps the mutex
/// while it waits for the worker to end; a worker that waited for the mutex meanwhile would never end. It
/// goes on under the operation's hold instead: the operation does nothing but wait for it.
class SCOPED_CAPABILITY Delivery_Hold
{
public:
    explicit Delivery_Hold(CMPI_Adapter& adapter) ACQUIRE(adapter.adapter_mutex)
        : _mutex(adapter.adapter_mutex)
    {
        while (!(_is_own = _mutex.try_lock() == 0) && !adapter.is_disabling)
            Time::sleep(Time::MSEC);
    }
    ~Delivery_Hold() RELEASE()
    {
        if (_is_own)
            _mutex.unlock();
    }
    Delivery_Hold(const Delivery_Hold&) = delete;
    Delivery_Hold& operator=(const Delivery_Hold&) = delete;

private:
    Mutex& _mutex;
    bool _is_own;
};

/// Lets deliveries pass for as long as indications are being disabled.
class Disabling_Mark
{
public:
    explicit Disabling_Mark(CMPI_Adapter& adapter) : _mark(adapter.is_disabling) { _mark = true; }
    ~Disabling_Mark() { _mark = false; }
    Disabling_Mark(const Disabling_Mark&) = delete;
    Disabling_Mark& operator=(const Disabling_Mark&) = delete;

private:
    std::atomic<bool>& _mark;
};

} // namespace

/// Adds the first name space with filters that has not been served: false if there is none. Not by place,
/// since others may be removed while one is served.
static bool add_next(CMPI_Adapter& adapter, Array<Name_Space_Entry>& served)
{
    const Delivery_Hold hold(adapter);
    for (const Name_Space_Entry& entry : std::as_const(adapter.name_spaces))
        if (served.find(entry) == NPOS) {
            served.append(entry);
            return true;
        }
    return false;
}

/// What the provider's worker calls with each indication: sends it into every name space with filters. It
/// waits for operations, but none for it while it is in the server: sfcb deletes a subscription under a lock
/// that it wants for the delivery too, and calls `deactivateFilter` under it.
static bool _indication_proc(Instance* instance, void* client_data)
{
    auto* const adapter = static_cast<CMPI_Adapter*>(client_data);
    if (!instance) {
        const Delivery_Hold hold(*adapter);
        return false;
    }
    const Ref<Instance> owner(instance);

    Array<Name_Space_Entry> served;
    while (add_next(*adapter, served)) {
        const char* const name_space = served[served.size() - 1].name_space.c_str();
        CMPIInstance* ci = nullptr;
        if (make_cmpi_instance(adapter->broker, instance, name_space, nullptr, nullptr, ci) != CMPI_RC_OK)
            continue;
        // Given back also if the server throws.
        const std::unique_ptr<CMPIInstance, void (*)(CMPIInstance*)> made(ci, give_back<CMPIInstance>);
        const auto* const thread_context = static_cast<CMPI_Thread_Context*>(Thread_Context::top());
        CIMPLE_ASSERT(thread_context != 0);
        CBDeliverIndication(thread_context->broker(), thread_context->context(), name_space, ci);
    }
    return true;
}

static CMPIStatus enableIndications(CMPIIndicationMI* mi, const CMPIContext* context)
{
    CMPI_Adapter* const adapter = _adapter(mi);
    const Operation_Scope scope(adapter, context, "enableIndications", LOG_HERE);
    if (adapter->indications_enabled)
        return scope.ret(LOG_HERE, CMPI_RC_OK);

    // The mark stays when the provider fails: only a disabling in between makes for a second attempt.
    adapter->indications_enabled = true;
    const int status = adapter->enable_indications(_indication_proc, adapter);
    return scope.ret(LOG_HERE, translate(Status_Family::ENABLE_INDICATIONS, status));
}

static CMPIStatus disableIndications(CMPIIndicationMI* mi, const CMPIContext* context)
{
    CMPI_Adapter* const adapter = _adapter(mi);
    const Operation_Scope scope(adapter, context, "disableIndications", LOG_HERE);
    if (!adapter->indications_enabled)
        return {CMPI_RC_OK, nullptr};

    const Disabling_Mark mark(*adapter);
    const int status = adapter->disable_indications();
    adapter->indications_enabled = false;
    return scope.ret(LOG_HERE, translate(Status_Family::DISABLE_INDICATIONS, status));
}

void fill_indication_operations(CMPIIndicationMIFT& ft)
{
    ft.authorizeFilter = authorizeFilter;
    ft.mustPoll = mustPoll;
    ft.activateFilter = activateFilter;
    ft.deActivateFilter = deactivateFilter;
    ft.enableIndications = enableIndications;
    ft.disableIndications = disableIndications;
}

} // namespace KPRV
