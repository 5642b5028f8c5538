#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_ManagedElement.h"
#include "module/schema/CIM_Product.h"
#include "module/schema/KALDERA_PortController.h"
#include "module/schema/KALDERA_Product.h"
#include "module/schema/KALDERA_ProductElementComponent_Skeleton.h"

namespace KPRV {

class KALDERA_ProductElementComponent_Provider : public KALDERA_ProductElementComponent_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ProductElementComponent*,
                                         Enum_Instances_Handler<KALDERA_ProductElementComponent>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PortController> adapters(fc_hba_instances(PORTCONTROLLER));
        List<KALDERA_Product> products(fc_hba_instances(PRODUCT));
        if (adapters.size() != products.size())
            return SAYING(ERR, "Invalid mapping information.").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_ProductElementComponent::GroupComponent,
                         &KALDERA_ProductElementComponent::PartComponent);
        return join_equal(Matches::FIRST, adapters, &KALDERA_PortController::Name, products,
                          &KALDERA_Product::IdentifyingNumber,
                          [&](const KALDERA_PortController* adapter, const KALDERA_Product* product) {
                              pair(product, adapter);
                          });
    }
};

PROVIDER_PROC(KALDERA_ProductElementComponent)

} // namespace KPRV
