#include "module/diagnostics/Diagnostic_Tests.h"

#include "module/diagnostics/DiagnosticHelper.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <iterator>

namespace KPRV {

namespace {

constexpr uint32 PATTERN = 0xB5B5B5B5;

constexpr Thread::Function memory = DiagnosticHelper::runMemoryTestThread;
constexpr Thread::Function loopback = DiagnosticHelper::runLoopbackTestThread;
constexpr Thread::Function pci = DiagnosticHelper::runPCILoopbackTestThread;
constexpr Thread::Function eth = DiagnosticHelper::runEthLoopbackTestThread;

constexpr const char* FC_INTERNAL = "Loopback test mode : internal";
constexpr const char* FC_EXTERNAL = "Loopback test mode : external";
constexpr const char* FC_SERDES = "Loopback test mode : serdes";
constexpr const char* ETH_EXTERNAL = "Eth Loopback test mode : external";
constexpr const char* ETH_SERDES = "Eth Loopback test mode : serdes";

// clang-format off
constexpr Diagnostic_Test tests[] = {
//   id                          class                      ElementName                     destr. plug   frames  pattern  mode mode_line     run
    {MEMORY_TEST,                MEMORYDIAGNOSTICTEST,      "Memory Diagnostic Test",       true,  false, 0,      0,       0,   nullptr,      memory},
    {INTERNAL_LOOPBACK_TEST,     LOOPBACKDIAGNOSTICTEST,    "Loopback Diagnostic Test",     true,  false, 131072, PATTERN, 1,   FC_INTERNAL,  loopback},
    {EXTERNAL_LOOPBACK_TEST,     LOOPBACKDIAGNOSTICTEST,    "Loopback Diagnostic Test",     true,  true,  131072, PATTERN, 8,   FC_EXTERNAL,  loopback},
    {SERDES_LOOPBACK_TEST,       LOOPBACKDIAGNOSTICTEST,    "Loopback Diagnostic Test",     true,  false, 131072, PATTERN, 4,   FC_SERDES,    loopback},
    {PCI_LOOPBACK_TEST,          PCILOOPBACKDIAGNOSTICTEST, "PCI Loopback Diagnostic Test", false, false, 131072, PATTERN, 0,   nullptr,      pci},
    {EXTERNAL_ETH_LOOPBACK_TEST, ETHLOOPBACKDIAGNOSTICTEST, "Eth Loopback Diagnostic Test", true,  true,  65536,  PATTERN, 8,   ETH_EXTERNAL, eth},
    {SERDES_ETH_LOOPBACK_TEST,   ETHLOOPBACKDIAGNOSTICTEST, "Eth Loopback Diagnostic Test", true,  false, 65536,  PATTERN, 4,   ETH_SERDES,   eth},
};
// clang-format on

static_assert(std::size(tests) + 1 == DIAG_NAME_INVALID);

template <class Choice>
const Diagnostic_Test* find(Choice choice)
{
    const auto found = std::ranges::find_if(tests, choice);
    return found == std::end(tests) ? nullptr : found;
}

} // namespace

std::span<const Diagnostic_Test> diagnostic_tests()
{
    return tests;
}

const Diagnostic_Test* find_diagnostic_test(diag_test_id_t id)
{
    return find([&](const Diagnostic_Test& test) { return test.id == id; });
}

const Diagnostic_Test* find_diagnostic_test(classId_t class_id, const String& name)
{
    return find([&](const Diagnostic_Test& test) {
        return test.class_id == class_id && name.equali(ProviderUtil::getDiagTestName(test.id));
    });
}

Array<uint16> getDiagCharacteristics(diag_test_id_t id)
{
    constexpr uint16 EXCLUSIVE = 2, DESTRUCTIVE = 4, ADDITIONAL_HARDWARE = 10;
    Array<uint16> characteristics(&EXCLUSIVE, 1);
    const Diagnostic_Test* const test = find_diagnostic_test(id);
    if (!test)
        LOG(WARN, "WARNING! Control should never come here");
    if (test && test->destructive)
        characteristics.append(DESTRUCTIVE);
    if (test && test->needs_plug)
        characteristics.append(ADDITIONAL_HARDWARE);
    return characteristics;
}

} // namespace KPRV
