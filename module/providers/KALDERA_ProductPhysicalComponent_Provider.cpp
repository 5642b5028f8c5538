#include "module/providers/join.h"
#include "module/providers/managers.h"
#include "module/providers/proc.h"
#include "module/schema/CIM_PhysicalElement.h"
#include "module/schema/CIM_Product.h"
#include "module/schema/KALDERA_PhysicalPackage.h"
#include "module/schema/KALDERA_Product.h"
#include "module/schema/KALDERA_ProductPhysicalComponent_Skeleton.h"

namespace KPRV {

class KALDERA_ProductPhysicalComponent_Provider : public KALDERA_ProductPhysicalComponent_Skeleton
{
public:
    Enum_Instances_Status enum_instances(const KALDERA_ProductPhysicalComponent*,
                                         Enum_Instances_Handler<KALDERA_ProductPhysicalComponent>* handler)
    {
        LOG_SCOPE("enum_instances");
        List<KALDERA_PhysicalPackage> packages(fc_hba_instances(PHYSICALPACKAGE));
        List<KALDERA_Product> products(fc_hba_instances(PRODUCT));
        if (packages.size() != products.size())
            return SAYING(ERR, "Error: Improper Product Information!\n").answer(ENUM_INSTANCES_FAILED);
        TRACE_BUILDING();
        const Pairs pair(handler, &KALDERA_ProductPhysicalComponent::GroupComponent,
                         &KALDERA_ProductPhysicalComponent::PartComponent);
        return join_equal(Matches::FIRST, packages, &KALDERA_PhysicalPackage::SerialNumber, products,
                          &KALDERA_Product::IdentifyingNumber,
                          [&](const KALDERA_PhysicalPackage* package, const KALDERA_Product* product) {
                              pair(product, package);
                          });
    }
};

PROVIDER_PROC(KALDERA_ProductPhysicalComponent)

} // namespace KPRV
