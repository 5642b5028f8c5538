#include "module/providers/deliver.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/KALDERA_AlarmDevice_Skeleton.h"

namespace KPRV {

namespace {

/// What an alarm device can be asked for: its beacon off or on.
constexpr uint16 ALARM_OFF = 1;
constexpr uint16 ALARM_ON = 3;

/// The method's answer. A request for the state already in force has no value of its own and counts as a
/// failure.
uint32 return_value_of(int result)
{
    switch (result) {
    case 1:
        return 0;
    case 2:
        return 1;
    default:
        return 2;
    }
}

} // namespace

class KALDERA_AlarmDevice_Provider : public KALDERA_AlarmDevice_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_AlarmDevice*,
                                         Enum_Instances_Handler<KALDERA_AlarmDevice>* handler)
    {
        LOG_SCOPE("enum_instances");
        return deliver_all(fc_hba_instances(ALARMDEVICE, handler->wanted()), *handler,
                           SAYING(ERR, "Invalid number of Instances returned"));
    }

    Invoke_Method_Status SetAlarmState(const KALDERA_AlarmDevice* self,
                                       const Property<uint16>& RequestedAlarmState,
                                       Property<uint32>& return_value)
    {
        LOG_SCOPE("SetAlarmState");
        const uint16 state = RequestedAlarmState.value;
        if (state != ALARM_OFF && state != ALARM_ON) {
            LOG(ERR, "Error: Invalid Input State");
            return_value.set(2);
            return INVOKE_METHOD_OK;
        }
        // The object path may name another class of the module that has the method; it then names no port.
        if (!self) {
            return_value.set(2);
            return INVOKE_METHOD_OK;
        }
        const int result = FCHBAManager::getFCHBAManager()->setAlarmState(self->DeviceID.value, state);
        return_value.set(return_value_of(result));
        LOG(DBG, "return value = %d\n", int(return_value.value));
        return INVOKE_METHOD_OK;
    }
};

PROVIDER_PROC(KALDERA_AlarmDevice)

} // namespace KPRV
