#pragma once

#include "module/schema/KALDERA_FCPort.h"

namespace KPRV {

/// The catalogue of the product.
inline const Meta_Repository* product_classes()
{
    return KALDERA_FCPort::static_meta_class.meta_repository;
}

} // namespace KPRV
