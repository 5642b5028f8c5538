// The traps of CONTRIBUTING.md: that each example which the page calls right is code.

#include "module/adapter/Child_Program.h"
#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/ProviderUtil.h"
#include "module/cmpi/cmpi_text.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/dispatch/Handler.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/Mutex.h"
#include "module/schema/KALDERA_FCPort.h"

#include <deque>
#include <vector>

namespace KPRV::traps_page {

void counts(Enum_Instances_Handler<KALDERA_FCPort>* handler, uint64 speed)
{
    Ref<KALDERA_FCPort> port(create_null<KALDERA_FCPort>());
    port->Speed.set(speed);
    handler->handle(port.steal());
}

bool members(const Json::Value& answer)
{
    return hasMember(answer, "portData");
}

std::string conversions(const Json::Value& port)
{
    const std::string speed = asString(member(port, "speed"));
    return speed;
}

int null_answers(const Json::Value& answer)
{
    if (!ProviderUtil::isValidJsonResponse(answer))
        return -1;
    return 0;
}

String texts(const CMPIObjectPath* path)
{
    const String name = class_name_of(path);
    return name;
}

bool null_state(const CMPIData& data)
{
    if (data.state & CMPI_nullValue)
        return false;
    return true;
}

struct Locked
{
    void push(const Json::Value& query, Instance* alert)
    {
        const Json::Value answer = libGetPortByWwn(query);
        const Auto_Mutex lock(_queue_lock);
        _queue.push_back(alert);
    }
    Mutex _queue_lock;
    std::deque<Instance*> _queue GUARDED_BY(_queue_lock);
};

void stack()
{
    std::vector<char> text(64 * 1024);
}

int shell(const char* host, const char* file)
{
    const char* const words[] = {"tftp", host, "-c", "get", file, nullptr};
    return run_program(words);
}

constexpr const char* names[] = {"fc", "ethernet"};

const char* statics(bool ethernet)
{
    return names[ethernet];
}

} // namespace KPRV::traps_page
