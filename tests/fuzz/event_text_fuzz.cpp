// Any text as an event of the adapter library: alerts, or nothing, or the exception of a member of another
// type.
#include "module/alerts/IndicationHelper.h"
#include "tests/fuzz/Fuzz_Target.h"
#include "tests/support/Fake_Library.h"

#include <stdexcept>
#include <string>

using namespace KPRV;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static Fake_Library& library = *new Fake_Library;
    library.calls.clear();
    static IndicationHelper& helper = *IndicationHelper::getIndicationHelperInstance();
    static const bool ready = (helper.initEventDetailsMaps(), true);
    (void)ready;
    int queued = 0;
    try {
        queued = helper.processEvent(std::string(reinterpret_cast<const char*>(data), size).c_str());
    } catch (const std::exception&) {
    }
    int taken = 0;
    KALDERA_AlertIndication* alert = nullptr;
    while (helper.getIndicationObject(&alert)) {
        FUZZ_EXPECT(!alert->MessageID.null && !alert->SequenceNumber.null);
        destroy(alert);
        ++taken;
    }
    FUZZ_EXPECT(queued == (taken > 0) && taken <= 2);
    return 0;
}
