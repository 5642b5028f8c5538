#include "module/cmpi/CMPI_Adapter.h"
#include "module/cmpi/CMPI_Thread_Context.h"
#include "module/cmpi/rc_to_str.h"
#include "module/runtime/system/log.h"

#include <cstring>

namespace KPRV {

namespace {

/// Marks the block as without adapter when its adapter goes, by destruction or by a failing constructor.
class Static_Data_Guard
{
public:
    explicit Static_Data_Guard(CMPI_Static_Data* data) : _data(data) {}
    ~Static_Data_Guard()
    {
        if (_data) {
            _data->magic = STATIC_DATA_DEAD;
            _data->adapter = nullptr;
        }
    }
    void dismiss() { _data = nullptr; }
    Static_Data_Guard(const Static_Data_Guard&) = delete;
    Static_Data_Guard& operator=(const Static_Data_Guard&) = delete;

private:
    CMPI_Static_Data* _data;
};

} // namespace

CMPI_Adapter::CMPI_Adapter(const CMPIBroker* broker_, const CMPIContext* context, const char* provider_name,
                           const Registration* registration, CMPI_Static_Data* static_data_)
    : Provider_Handle(registration), broker(nullptr), static_data(static_data_), load_count(0),
      unload_allowed(true), model_meta_class(nullptr), indications_enabled(false), adapter_mutex(true)
{
    ent(__FILE_NAME__, __LINE__, "CMPI_Adapter");
    {
        const Context_Scope scope(broker_, context, this);
        Static_Data_Guard guard(static_data);
        fill(static_data, this, provider_name);
        load_count = 1;
        broker = broker_;
        load();
        get_meta_class(model_meta_class);
        guard.dismiss();
        ret(__FILE_NAME__, __LINE__, "CMPI_Adapter");
    }
}

CMPI_Adapter::~CMPI_Adapter()
{
    ent(__FILE_NAME__, __LINE__, "~CMPI_Adapter");
    {
        const Static_Data_Guard guard(static_data);
    }
    ret(__FILE_NAME__, __LINE__, "~CMPI_Adapter");
}

const Meta_Class* CMPI_Adapter::find_meta_class(const char* name) const
{
    const Meta_Repository* repository = nullptr;
    get_repository(repository);
    return KPRV::find_meta_class(repository, name);
}

const Meta_Class* CMPI_Adapter::find_model_meta_class(const char* name) const
{
    // Nearly always it is the provider's own, whose name no other class of the repository bears.
    if (model_meta_class && strcmp(model_meta_class->name, name) == 0)
        return model_meta_class;
    const Meta_Class* const found = find_meta_class(name);
    // The test of a class against itself always holds. It is not to be narrowed to the provider's own class:
    // the reach into the whole repository is used.
    return found && is_subclass(found, found) ? found : nullptr;
}

const Meta_Class* CMPI_Adapter::find_meta_class_callback(const char* name, void* data)
{
    return static_cast<CMPI_Adapter*>(data)->find_meta_class(name);
}

CMPIStatus CMPI_Adapter::cleanup(CMPI_Adapter* adapter, const CMPIContext*, bool terminating)
{
    constexpr const char* function = "cleanup";
    ent(__FILE_NAME__, __LINE__, function);

    if (!terminating && !adapter->unload_allowed) {
        ret(__FILE_NAME__, __LINE__, function, CMPI_RC_DO_NOT_UNLOAD, "cleanup do not unload");
        return {CMPI_RC_DO_NOT_UNLOAD, nullptr};
    }
    if (adapter->load_count != 1) {
        adapter->load_count--;
        ret(__FILE_NAME__, __LINE__, function, CMPI_RC_OK, "cleanup decrement");
        return {CMPI_RC_OK, nullptr};
    }
    adapter->unload();
    ret(__FILE_NAME__, __LINE__, function, CMPI_RC_OK, "cleanup unload");
    delete adapter;
    return {CMPI_RC_OK, nullptr};
}

void CMPI_Adapter::ent(const char* file, uint32 line, const char* function)
{
    LOG_LINE(DBG, file, line, "enter: %s()", function);
}

void CMPI_Adapter::ret(const char* file, uint32 line, const char* function)
{
    LOG_LINE(DBG, file, line, "return: %s()", function);
}

void CMPI_Adapter::ret(const char* file, uint32 line, const char* function, CMPIrc rc)
{
    LOG_LINE(DBG, file, line, "return: %s(): %s", function, _rc_to_str(rc));
}

void CMPI_Adapter::ret(const char* file, uint32 line, const char* function, CMPIrc rc, const char* text)
{
    LOG_LINE(DBG, file, line, "return: %s(): %s %s", function, _rc_to_str(rc), text);
}

void CMPI_Adapter::trc(const char* file, uint32 line, const char*, const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    vlog(Log_Level::DBG, file, line, format, arguments);
    va_end(arguments);
}

} // namespace KPRV
