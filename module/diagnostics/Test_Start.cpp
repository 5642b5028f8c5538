// Of `DiagnosticHelper`, the checks before a run, its job, and the start of its thread.
//
// How it works. A client's call is over at once: it gets the name of a job, and the test goes on without it.
// The call looks whether a job is running, at the element's address and at the test's name, in that order,
// and each refusal has its code. Then the input of the run is made ready, a job enters the helper's one place
// for it, and a thread begins. Nobody joins that thread, and nothing stops it: the module is pinned, so that
// its code stays when a server closes it, and its input outlives it.
//
// The thread (`Test_Runners.cpp`) takes the element out of service if it was in, lets the library test, and
// puts it back; what it does and finds becomes records, which clients read meanwhile. It closes its job
// before it writes the result: who sees the job ended may find that record a moment later. Whatever ends the
// thread early closes the job as well, or no test would ever start again.
#include "module/diagnostics/DiagnosticHelper.h"

#include "module/adapter/Json_Access.h"
#include "module/model/PortHelper.h"
#include "module/runtime/dispatch/Thread.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/Module_Pin.h"
#include "module/runtime/system/log.h"

#include <atomic>
#include <exception>
#include <memory>
#include <pthread.h>

namespace KPRV {

namespace {

constexpr uint32 FLAT_MAC_SIZE = 12;
constexpr uint32 FLAT_WWN_SIZE = 16;

using Input = std::unique_ptr<DiagnosticTestInput>;

/// The input of a run is never freed, since nobody learns when its thread is done with it. It stays
/// reachable from the run after.
void keep_for_ever(DiagnosticTestInput* input)
{
    static constinit std::atomic<DiagnosticTestInput*> latest;
    input->previous = latest.load();
    while (!latest.compare_exchange_weak(input->previous, input))
        continue;
}

/// False if the address is none of an Ethernet port.
bool take_mac(const String& port_id, DiagnosticTestInput& input)
{
    if (port_id.size() != FLAT_MAC_SIZE)
        return false;
    LOG(INFO, "Given Port MAC : %s", port_id.c_str());
    input.port_mac = port_id;
    input.class_id = ETHERNETPORT;
    return true;
}

/// False if the address is none of an FC port.
bool take_wwn(const String& port_id, DiagnosticTestInput& input)
{
    if (port_id.size() != FLAT_WWN_SIZE)
        return false;
    LOG(INFO, "Given Port WWN : %s", port_id.c_str());
    input.port_wwn = port_id;
    input.class_id = FCPORT;
    return true;
}

/// Where the thread of a run begins.
void* run_test(void* argument)
{
    // Nothing joins the thread, so that its stack must go back by itself.
    pthread_detach(pthread_self());
    const auto& input = *static_cast<const DiagnosticTestInput*>(argument);
    try {
        return find_diagnostic_test(input.test_id)->run(argument);
    } catch (const std::exception& error) {
        // Memory ran out, in the module's own words or in the JSON library's. Without an end of its job no
        // test would ever start again.
        input.helper->updateJobState(input.job_id);
        LOG(ERR, "test ended: %s", error.what());
        return nullptr;
    }
}

Run_Result refused(Run_Code code)
{
    return {code, nullptr};
}

/// The mode's line, for a name that is a test's. No instance of the module has another name.
const Diagnostic_Test* test_by_name(classId_t class_id, const String& name)
{
    const Diagnostic_Test* const test = find_diagnostic_test(class_id, name);
    if (test)
        LOG(INFO, "%s", test->mode_line);
    else
        LOG(ERR, "Invalid test name : %s", name.c_str());
    return test;
}

} // namespace

Run_Result DiagnosticHelper::start(const Diagnostic_Test& test, std::unique_ptr<DiagnosticTestInput> input)
{
    input->test_id = test.id;
    input->frame_count = test.frame_count;
    input->data_pattern = test.data_pattern;
    input->mode = test.mode;
    input->helper = this;
    LOG(INFO, "Creating the Job instance.");
    const DiagnosticJob job = createDiagnosticJob(input.get());
    Ref<KALDERA_ConcreteJob> instance(create<KALDERA_ConcreteJob>(true));
    instance->InstanceID.set(job.instance_id);
    input->job_id = job.instance_id;
    // Between the check for a running test and here no lock is held: two starts at the same moment can both
    // come through. The later job then takes the place of the other, and both tests run.
    addDiagnosticJob(job);
    Module_Pin::hold_for_ever();
    // A thread that the system does not make is not noticed: its job stays a running one, and refuses all
    // others. One for which there is no memory is.
    Thread thread;
    try {
        Thread::create_joinable(thread, run_test, input.get());
    } catch (...) {
        updateJobState(job.instance_id);
        throw;
    }
    keep_for_ever(input.release());
    return {RUN_JOB_STARTED, instance.steal()};
}

Run_Result DiagnosticHelper::runLoopbackTest(const String& portId, const String& testName)
{
    // Traced by hand: one refusal puts more words in the place of the name.
    constexpr const char* NAME = "runLoopbackTest";
    LOG(DBG, "Entering: %s", NAME);
    const Run_Result result = start_loopback(portId, testName);
    LOG(DBG, "Returning: %s",
        result.code == RUN_NOT_SUPPORTED ? "runLoopbackTest - RUN_DIAG_RETURN_UNSUPPORTED" : NAME);
    return result;
}

Run_Result DiagnosticHelper::start_loopback(const String& portId, const String& testName)
{
    if (isAnyJobRunning())
        return refused(RUN_FAILED);
    Input input = std::make_unique<DiagnosticTestInput>();
    if (take_mac(portId, *input)) {
        input->speed = 10;
        LOG(INFO, "Speed chosen : 10 GBS");
    } else if (take_wwn(portId, *input)) {
        input->speed = 4;
        LOG(INFO, "Speed chosen : 4 GBS");
    } else {
        LOG(ERR, "Invalid port WWN or MAC value");
        return refused(RUN_INVALID_PARAMETER);
    }
    Json::Value details;
    if (PortHelper::getPortHelperObject()->getPortDetails(portId, details) != 0) {
        LOG(ERR, "Unable get Port INFO for %s", portId.c_str());
        return refused(RUN_FAILED);
    }
    // A port that says anything of FCoE counts as one that speaks it, also if it says no.
    if (hasMember(details, "isFCoE")) {
        input->speed = 10;
        if (testName == ProviderUtil::getDiagTestName(INTERNAL_LOOPBACK_TEST))
            return refused(RUN_NOT_SUPPORTED);
    }
    const Diagnostic_Test* const test = test_by_name(LOOPBACKDIAGNOSTICTEST, testName);
    return test ? start(*test, std::move(input)) : refused(RUN_INVALID_PARAMETER);
}

Run_Result DiagnosticHelper::runEthLoopbackTest(const String& portId, const String& testName)
{
    LOG_SCOPE("runEthLoopbackTest");
    if (isAnyJobRunning())
        return refused(RUN_FAILED);
    Input input = std::make_unique<DiagnosticTestInput>();
    if (!take_mac(portId, *input)) {
        LOG(ERR, "Invalid port MAC value");
        return refused(RUN_INVALID_PARAMETER);
    }
    const Diagnostic_Test* const test = test_by_name(ETHLOOPBACKDIAGNOSTICTEST, testName);
    return test ? start(*test, std::move(input)) : refused(RUN_INVALID_PARAMETER);
}

Run_Result DiagnosticHelper::runPCILoopbackTest(const String& portId)
{
    LOG_SCOPE("runPCILoopbackTest");
    if (isAnyJobRunning())
        return refused(RUN_FAILED);
    Input input = std::make_unique<DiagnosticTestInput>();
    if (!take_mac(portId, *input) && !take_wwn(portId, *input)) {
        LOG(ERR, "%s - Invalid port WWN or MAC value", portId.c_str());
        return refused(RUN_INVALID_PARAMETER);
    }
    return start(*find_diagnostic_test(PCI_LOOPBACK_TEST), std::move(input));
}

Run_Result DiagnosticHelper::runMemoryTest(const String& address)
{
    LOG_SCOPE("runMemoryTest");
    LOG(INFO, "Adapter Address : %s", address.c_str());
    if (isAnyJobRunning())
        return refused(RUN_FAILED);
    // An adapter that the library does not know has the id -1, which passes: only 0, and an address that is
    // none, are refused.
    const int adapter_id = ProviderUtil::getAdapterId(address);
    const bool is_address = address.size() == FLAT_MAC_SIZE || address.size() == FLAT_WWN_SIZE;
    if (adapter_id == 0 || !is_address)
        return refused(RUN_INVALID_PARAMETER);
    LOG(INFO, "Adapter ID  : %d", adapter_id);
    Input input = std::make_unique<DiagnosticTestInput>();
    input->class_id = PORTCONTROLLER;
    input->adapter_id = adapter_id;
    input->adapter_address = address;
    return start(*find_diagnostic_test(MEMORY_TEST), std::move(input));
}

} // namespace KPRV
