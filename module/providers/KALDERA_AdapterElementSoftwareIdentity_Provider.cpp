#include "module/providers/controller_type.h"
#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/providers/token.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_SoftwareIdentity.h"
#include "module/schema/KALDERA_AdapterElementSoftwareIdentity_Skeleton.h"
#include "module/schema/KALDERA_AdapterSoftwareIdentity.h"
#include "module/schema/KALDERA_PortController.h"

#include <algorithm>

namespace KPRV {

namespace {

/// The network driver has nothing to do with a plain FC adapter.
constexpr const char* NETWORK_DRIVER = "zln";
/// Bytes of an `InstanceID` that are looked at.
constexpr uint32 INSTANCE_ID_ROOM = 64;
constexpr uint16 CLASSIFICATION_DRIVER = 2;

/// Which adapters an identity may belong to: a driver to all, any other to the one whose address begins its
/// `InstanceID`.
class Owners
{
public:
    explicit Owners(const List<KALDERA_AdapterSoftwareIdentity>& identities)
    {
        for (uint32 j = 0; j < identities.size(); j++) {
            _tokens.append(first_token(identities[j]->InstanceID.value, '_', INSTANCE_ID_ROOM));
            const Array<uint16>& kinds = identities[j]->Classifications.value;
            const bool is_driver =
                std::find(kinds.begin(), kinds.end(), CLASSIFICATION_DRIVER) != kinds.end();
            if (is_driver || _tokens[j].empty())
                _of_all.push_back(j);
            else
                _of_one.add(view_of(_tokens[j]), j);
        }
    }

    const String& token(uint32 j) const { return _tokens[j]; }

    /// Visits what belongs to the adapter, or could not be told, in list order.
    template <class Visit>
    void for_each_of(const String& address, Visit visit) const
    {
        static constexpr uint32 END = NPOS;
        const auto* own = _of_one.find(view_of(address));
        for (size_t a = 0, b = 0;;) {
            const uint32 of_all = a < _of_all.size() ? _of_all[a] : END;
            const uint32 of_one = own && b < own->size() ? (*own)[b] : END;
            if (of_all == END && of_one == END)
                return;
            if (of_all < of_one) {
                visit(of_all);
                a++;
            } else {
                visit(of_one);
                b++;
            }
        }
    }

private:
    Array<String> _tokens;
    std::vector<uint32> _of_all;
    Position_Index _of_one;
};

} // namespace

class KALDERA_AdapterElementSoftwareIdentity_Provider : public KALDERA_AdapterElementSoftwareIdentity_Skeleton
{
public:
    Enum_Instances_Status
    enum_instances(const KALDERA_AdapterElementSoftwareIdentity*,
                   Enum_Instances_Handler<KALDERA_AdapterElementSoftwareIdentity>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_AdapterSoftwareIdentity> identities(fc_hba_instances(ADAPTERSOFTWAREIDENTITY));
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_AdapterElementSoftwareIdentity::Antecedent,
                         &KALDERA_AdapterElementSoftwareIdentity::Dependent);
        const Owners owners(identities);
        for (uint32 i = 0; i < adapters.size(); i++) {
            owners.for_each_of(adapters[i]->DeviceID.value, [&](uint32 j) {
                const String& token = owners.token(j);
                if (token.empty())
                    LOG(INFO, "No MAC or NWWN returned from strtok function");
                else if (adapters[i]->ControllerType.value != CONTROLLER_FC ||
                         !name_eq(token.c_str(), NETWORK_DRIVER))
                    pair(identities[j], adapters[i]);
            });
        }
        return ENUM_INSTANCES_OK;
    }
};

PROVIDER_PROC(KALDERA_AdapterElementSoftwareIdentity)

} // namespace KPRV
