#pragma once

#include "module/adapter/ProviderUtil.h"
#include "module/adapter/classId_t.h"
#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/ground/String.h"

#include <span>

namespace KPRV {

inline constexpr diag_test_id_t MEMORY_TEST{1};
inline constexpr diag_test_id_t INTERNAL_LOOPBACK_TEST{2};
inline constexpr diag_test_id_t EXTERNAL_LOOPBACK_TEST{3};
inline constexpr diag_test_id_t SERDES_LOOPBACK_TEST{4};
inline constexpr diag_test_id_t PCI_LOOPBACK_TEST{5};
inline constexpr diag_test_id_t EXTERNAL_ETH_LOOPBACK_TEST{6};
inline constexpr diag_test_id_t SERDES_ETH_LOOPBACK_TEST{7};

/// One test that the hardware knows. `ProviderUtil::getDiagTestName` has its name.
struct Diagnostic_Test
{
    diag_test_id_t id;
    /// Of the service instance.
    classId_t class_id;
    const char* element_name;
    /// Takes the element out of service.
    bool destructive;
    /// Needs a loopback plug.
    bool needs_plug;
    uint32 frame_count;
    uint32 data_pattern;
    /// 1 internal, 4 serdes, 8 external; 0 for a test that has no modes.
    uint32 mode;
    /// What the log says of the mode.
    const char* mode_line;
    /// What its thread does.
    Thread::Function run;
};

/// All of them, by id.
std::span<const Diagnostic_Test> diagnostic_tests();
/// Null for an id that is no test's.
const Diagnostic_Test* find_diagnostic_test(diag_test_id_t id);
/// The test of a class by its name, whatever its case; null if there is none.
const Diagnostic_Test* find_diagnostic_test(classId_t class_id, const String& name);

/// CIM's `Characteristics`: 2 exclusive, 4 destructive, 10 additional hardware required. An id that is no
/// test's has the 2 alone, and the log wonders.
Array<uint16> getDiagCharacteristics(diag_test_id_t id);

} // namespace KPRV
