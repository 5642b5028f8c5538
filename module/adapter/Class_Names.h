#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/String.h"

namespace KPRV {

/// `ProviderUtil::getClassName` as a text that all instances share.
const String& class_name_text(classId_t id);

} // namespace KPRV
