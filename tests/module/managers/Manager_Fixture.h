#pragma once

#include "tests/support/Driver_Status_Override.h"
#include "tests/support/Fake_Library.h"
#include "tests/support/Fixed_Host.h"
#include "tests/support/Log_Capture.h"

#include "module/adapter/ProviderUtil.h"
#include "module/runtime/objects/Instance.h"

#include <gtest/gtest.h>

#include <vector>

namespace KPRV {

struct Manager_Fixture : testing::Test
{
    Fixed_Host host;
    Fake_Library library;
    Log_Capture log{"INFO"};

    /// Class name of each instance that a manager gives.
    template <class Manager>
    Lines classes(const Manager* manager, uint32 id)
    {
        Lines result;
        for (Instance* instance : manager->getInstances(classId_t(id))) {
            result.push_back(instance->__meta_class->name);
            destroy(instance);
        }
        return result;
    }

    /// Asks for every id; the ids that are served are those not refused.
    template <class Manager>
    std::vector<uint32> served(const Manager* manager)
    {
        std::vector<uint32> result;
        for (uint32 id = 0; id <= 40; id++) {
            log.clear();
            classes(manager, id);
            if (!log.has("INFO Requested class is NOT supported."))
                result.push_back(id);
        }
        return result;
    }

    static Lines requested(uint32 id)
    {
        return {"INFO Requested classId : " + std::to_string(id),
                std::string("INFO Requested class is: ") + ProviderUtil::getClassName(classId_t(id))};
    }
    static Lines requested(uint32 id, const char* then)
    {
        Lines lines = requested(id);
        lines.push_back(then);
        return lines;
    }
};

inline constexpr const char* NOT_SUPPORTED = "INFO Requested class is NOT supported.";
inline constexpr const char* NO_DRIVER =
    "ERR Driver is not installed or there is a zntl mismatch hence no instances returned";

} // namespace KPRV
