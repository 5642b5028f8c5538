#include "tests/bench/Lean_Broker.h"
#include "tests/bench/Lean_Objects.h"
#include "tests/bench/Lean_Text.h"

#include <utility>

namespace KPRV::bench {

namespace {

// Larger than what any provider here keeps a handle across, and small enough to stay near the processor.
constexpr size_t BLOCK_SIZE = 16 << 20;
// The beginning is not used again during a call: the objects of the request lie there.
constexpr size_t REQUEST_SIZE = 64 << 10;

Lean_Broker& self(const CMPIBroker* broker)
{
    return *static_cast<Lean_Broker*>(const_cast<void*>(broker->hdl));
}

const CMPIBrokerFT broker_ft = [] {
    CMPIBrokerFT ft = {};
    ft.brokerVersion = 200;
    ft.brokerName = "lean";
    ft.prepareAttachThread = [](const CMPIBroker*, const CMPIContext* context) {
        return const_cast<CMPIContext*>(context);
    };
    ft.attachThread = [](const CMPIBroker*, const CMPIContext*) { return okay(); };
    ft.detachThread = [](const CMPIBroker*, const CMPIContext*) { return okay(); };
    ft.deliverIndication = [](const CMPIBroker* broker, const CMPIContext*, const char*,
                              const CMPIInstance*) {
        if (const auto on_indication = self(broker).on_indication)
            on_indication();
        return okay();
    };
    ft.getInstance = [](const CMPIBroker* broker, const CMPIContext*, const CMPIObjectPath* path,
                        const char** properties, CMPIStatus* status) {
        set_okay(status);
        return self(broker).fetch(path, properties);
    };
    return ft;
}();

const CMPIBrokerEncFT objects_ft = [] {
    CMPIBrokerEncFT ft = {};
    ft.ftVersion = 200;
    ft.newInstance = [](const CMPIBroker* broker, const CMPIObjectPath* path, CMPIStatus* status) {
        set_okay(status);
        return new_instance(self(broker), path);
    };
    ft.newObjectPath = [](const CMPIBroker* broker, const char* ns, const char* cn, CMPIStatus* status) {
        set_okay(status);
        return new_path(self(broker), ns, cn);
    };
    ft.newArgs = [](const CMPIBroker* broker, CMPIStatus* status) {
        set_okay(status);
        return new_args(self(broker));
    };
    ft.newString = [](const CMPIBroker* broker, const char* text, CMPIStatus* status) {
        set_okay(status);
        return new_string(self(broker), text);
    };
    ft.newDateTimeFromChars = [](const CMPIBroker* broker, const char* text, CMPIStatus* status) {
        set_okay(status);
        return new_datetime(self(broker), text);
    };
    ft.newArray = [](const CMPIBroker* broker, CMPICount count, CMPIType type, CMPIStatus* status) {
        set_okay(status);
        return new_array(self(broker), count, type);
    };
    return ft;
}();

const CMPIContextFT context_ft = [] {
    CMPIContextFT ft = {};
    ft.ftVersion = 200;
    ft.getEntry = [](const CMPIContext*, const char*, CMPIStatus* status) {
        if (status)
            *status = {CMPI_RC_ERR_NOT_FOUND, nullptr};
        return CMPIData{CMPI_null, CMPI_notFound, {}};
    };
    return ft;
}();

const CMPIResultFT result_ft = [] {
    CMPIResultFT ft = {};
    ft.ftVersion = 200;
    ft.returnData = [](const CMPIResult*, const CMPIValue*, CMPIType) { return okay(); };
    ft.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
        broker_of(result).deliver(instance);
        return okay();
    };
    ft.returnObjectPath = [](const CMPIResult* result, const CMPIObjectPath* path) {
        broker_of(result).deliver(path);
        return okay();
    };
    ft.returnDone = [](const CMPIResult*) { return okay(); };
    return ft;
}();

const CMPIResultFT fetching_ft = [] {
    CMPIResultFT ft = result_ft;
    ft.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) {
        broker_of(result).fetched(instance);
        return okay();
    };
    return ft;
}();

} // namespace

Lean_Broker& Lean_Broker::get()
{
    static Lean_Broker broker;
    return broker;
}

Lean_Broker::Lean_Broker()
    : _broker{}, _context{this, &context_ft}, _result{this, &result_ft}, _fetching{this, &fetching_ft}
{
    _broker.hdl = this;
    _broker.bft = &broker_ft;
    _broker.eft = &objects_ft;
    begin_call();
}

void Lean_Broker::begin_call(bool keep)
{
    _keep = keep;
    _delivered = 0;
    _instances.clear();
    _paths.clear();
    _texts.clear();
    if (_blocks.empty())
        _blocks.emplace_back(new char[BLOCK_SIZE]);
    _blocks.resize(1);
    _next = _blocks.front().get();
    _end = _next + BLOCK_SIZE;
}

void* Lean_Broker::allocate(size_t size)
{
    size = (size + alignof(std::max_align_t) - 1) & ~(alignof(std::max_align_t) - 1);
    if (_next + size > _end) {
        if (_keep)
            _blocks.emplace_back(new char[BLOCK_SIZE]);
        _next = _blocks.back().get() + REQUEST_SIZE;
        _end = _blocks.back().get() + BLOCK_SIZE;
    }
    return std::exchange(_next, _next + size);
}

void Lean_Broker::deliver(const CMPIInstance* instance)
{
    _delivered++;
    if (_keep)
        _instances.push_back(instance);
}

void Lean_Broker::deliver(const CMPIObjectPath* path)
{
    _delivered++;
    if (_keep)
        _paths.push_back(path);
}

CMPIInstance* Lean_Broker::fetch(const CMPIObjectPath* path, const char** properties)
{
    CMPIInstanceMI* const mi =
        provider_of(object_of<Lean_String>(object_of<Lean_Path>(path)->class_name)->text);
    _fetched = nullptr;
    mi->ft->getInstance(mi, &_context, &_fetching, path, properties);
    return const_cast<CMPIInstance*>(_fetched);
}

void Lean_Broker::deliver(const char* text)
{
    _delivered++;
    if (_keep)
        _texts.push_back(text);
}

std::vector<std::string> Lean_Broker::texts() const
{
    std::vector<std::string> texts = _texts;
    for (const CMPIInstance* instance : _instances)
        texts.push_back(text_of(*object_of<Lean_Instance>(instance)));
    for (const CMPIObjectPath* path : _paths)
        texts.push_back(text_of(*object_of<Lean_Path>(path)));
    return texts;
}

CMPIObjectPath* Lean_Broker::path(const char* class_name)
{
    return new_path(*this, NAME_SPACE, class_name);
}

void Lean_Broker::add_key(CMPIObjectPath* path, const char* name, const char* text)
{
    path->ft->addKey(path, name, reinterpret_cast<const CMPIValue*>(text), CMPI_chars);
}

void Lean_Broker::add_key(CMPIObjectPath* path, const char* name, CMPIObjectPath* target)
{
    CMPIValue value = {};
    value.ref = target;
    path->ft->addKey(path, name, &value, CMPI_ref);
}

CMPIArgs* Lean_Broker::args()
{
    return new_args(*this);
}

void Lean_Broker::add_argument(CMPIArgs* args, const char* name, const char* text)
{
    args->ft->addArg(args, name, reinterpret_cast<const CMPIValue*>(text), CMPI_chars);
}

const char* Lean_Broker::text_argument(const CMPIArgs* args, const char* name)
{
    CMPIStatus status = okay();
    const CMPIData data = args->ft->getArg(args, name, &status);
    return status.rc == CMPI_RC_OK && data.type == CMPI_string
               ? object_of<Lean_String>(data.value.string)->text
               : nullptr;
}

} // namespace KPRV::bench
