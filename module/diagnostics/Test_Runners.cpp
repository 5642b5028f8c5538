// Of `DiagnosticHelper`, what the thread of a run does: ask the library, wait, write records, finish the
// job.
#include "module/diagnostics/DiagnosticHelper.h"
#include "module/diagnostics/Element_State.h"
#include "module/diagnostics/Record_Texts.h"
#include "module/diagnostics/Settle_Pause.h"

#include "module/adapter/Guarded_Call.h"
#include "module/adapter/Json_Access.h"
#include "module/model/PortHelper.h"
#include "module/runtime/system/log.h"

#include <cstdio>
#include <exception>
#include <string>

namespace KPRV {

namespace {

using namespace record_text;

/// What a thread says and does on the way, the same for all tests.
class Test_Run
{
public:
    explicit Test_Run(void* argument) : input(*static_cast<const DiagnosticTestInput*>(argument)) {}

    void progress(diag_record_msg_t text, Log_Level level = Log_Level::INFO) const
    {
        add(ProviderUtil::getRecordData(text), true, COMPLETION_PASSED, level);
    }
    void passed(diag_record_msg_t text) const
    {
        add(ProviderUtil::getRecordData(text), false, COMPLETION_PASSED, Log_Level::INFO);
    }
    void failed(diag_record_msg_t text, Log_Level level = Log_Level::INFO) const
    {
        failed(ProviderUtil::getRecordData(text), level);
    }
    void failed(const char* text, Log_Level level = Log_Level::INFO) const
    {
        add(text, false, COMPLETION_FAILED, level);
    }
    /// Formatted into 200 bytes and cut there.
    template <class... Arguments>
    void failed_with(Log_Level level, const char* format, Arguments... arguments) const
    {
        char text[200];
        if (snprintf(text, sizeof text, format, arguments...) >= 0)
            failed(text, level);
    }
    void close_job() const { input.helper->updateJobState(input.job_id); }

    const DiagnosticTestInput& input;

private:
    /// Without memory the record is lost, and nothing else of the run.
    void add(const char* text, bool is_service, diag_compl_record_state_t state, Log_Level level) const
    {
        log(level, __FILE_NAME__, __LINE__, "%s", text);
        try {
            input.helper->generateDiagnosticRecord(text, is_service, &input, state);
        } catch (const std::exception&) {
            log(Log_Level::ERR, __FILE_NAME__, __LINE__, "no memory for a record of %s",
                input.job_id.c_str());
        }
    }
};

/// The members of a test's answer. An absent one reads as 0 or the empty text; so does one of the wrong type,
/// which is told as the entry point's failure, too.
class Test_Answer
{
public:
    Test_Answer(const char* entry, const Json::Value& answer) : _entry(entry), _answer(answer) {}

    bool failed() const { return asBool(member(_answer, "failed")); }
    unsigned number(const char* name) const
    {
        unsigned value = 0;
        guarded(LOG_HERE, {_entry}, [&] { value = asUInt(member(_answer, name)); });
        return value;
    }
    std::string text(const char* name) const
    {
        std::string value;
        guarded(LOG_HERE, {_entry}, [&] { value = asString(member(_answer, name)); });
        return value;
    }

private:
    const char* _entry;
    const Json::Value& _answer;
};

/// A bad answer is told and changes nothing else: it reads as one that has not failed, and the run ends with
/// the record of success.
void check_answer(const char* entry, const Json::Value& answer)
{
    if (!ProviderUtil::isValidJsonResponse(answer))
        LOG(ERR, "%s response has error", entry);
}

/// In what the two loopback tests differ.
struct Loopback_Words
{
    const char* entry;
    diag_record_msg_t checking, running, checking_result, passed, failed;
    const char* status_format;
    bool pauses;
};

constexpr Loopback_Words FC_WORDS = {"libDiagLoopbackTest",
                                     CHECKING_PORT,
                                     RUNNING_LOOPBACK,
                                     CHECKING_LOOPBACK_RESULT,
                                     LOOPBACK_PASSED,
                                     LOOPBACK_FAILED,
                                     "Loopback test run status : %s",
                                     true};
constexpr Loopback_Words ETH_WORDS = {"libDiagEthLoopbackTest",
                                      CHECKING_PORT_FOR_ETH,
                                      RUNNING_ETH_LOOPBACK,
                                      CHECKING_ETH_RESULT,
                                      ETH_LOOPBACK_PASSED,
                                      ETH_LOOPBACK_FAILED,
                                      "EthLoopback test run status : %s",
                                      false};

void report_loopback(const Test_Run& run, const Loopback_Words& words, const Test_Answer& answer)
{
    if (!answer.failed())
        return run.passed(words.passed);
    run.failed(words.failed, Log_Level::ERR);
    run.failed_with(Log_Level::INFO, "Tx frames = %u, Rx frames = %u, OSF frames = %u",
                    answer.number("transmitFrames"), answer.number("GoodFrameRcv"),
                    answer.number("outstandingFrames"));
    const unsigned bad_number = answer.number("BadFrameNo");
    const unsigned bad_info = answer.number("BadFrameInfo");
    if (bad_number != 0 || bad_info != 0)
        run.failed_with(Log_Level::INFO, "Mis-match frame number = %u; Mis-match frame info = %u", bad_number,
                        bad_info);
    run.failed_with(Log_Level::ERR, words.status_format, answer.text("output").c_str());
}

/// What a loopback test of any kind is asked for.
Json::Value port_request(const DiagnosticTestInput& input, const String& index)
{
    Json::Value request(Json::objectValue);
    request["portWwn"] = index.c_str();
    request["dataPattern"] = input.data_pattern;
    request["frameCount"] = input.frame_count;
    return request;
}

/// A port is known by one of the two. A loopback test of an FC port was given a MAC if a client wrote one.
const String& port_address(const DiagnosticTestInput& input)
{
    return input.port_mac.empty() ? input.port_wwn : input.port_mac;
}

/// The road of both loopback tests. A port that somebody had disabled before is left so: it leaves the test
/// in the state in which it came.
///
/// Nothing guards the test's call: what the library throws there ends the process, as any uncaught exception
/// of a thread does. A guard would turn it into a bad answer, and a bad answer reads as success:
/// a hardware test that blew up would be recorded as passed.
template <class Add_Members>
void run_loopback(const Test_Run& run, const Loopback_Words& words, const JsonReqFP& entry,
                  Add_Members add_members)
{
    const auto pause = [&] {
        if (words.pauses)
            Settle_Pause::wait();
    };
    const String& address = port_address(run.input);
    const String index = ProviderUtil::getIndexInColonFormat(address);
    // Made before the port is touched: what fails for want of memory leaves it as it is.
    Json::Value request = port_request(run.input, index);
    request["mode"] = run.input.mode;
    add_members(request);
    run.progress(words.checking);
    const bool was_disabled = PortHelper::getPortHelperObject()->isPortDisabled(address);
    if (was_disabled) {
        run.progress(PORT_ALREADY_DISABLED);
    } else {
        run.progress(PORT_NOT_DISABLED);
        run.progress(DISABLING_PORT);
        if (setPortState(index, false) != 0) {
            run.close_job();
            return run.failed(DISABLING_FAILED, Log_Level::ERR);
        }
        pause();
    }
    run.progress(words.running);
    const Json::Value answer = [&]() noexcept { return entry(request); }();
    check_answer(words.entry, answer);
    pause();
    if (!was_disabled) {
        run.progress(ENABLING_PORT);
        setPortState(index, true);
        pause();
    }
    // The element is back in service before the job is closed, and the results come after.
    run.close_job();
    run.progress(words.checking_result);
    report_loopback(run, words, {words.entry, answer});
}

/// What is known of a failure, for the log alone.
void tell_memory_failure(const Test_Answer& answer)
{
    LOG(INFO, "Status         :\t0x%x", answer.number("status"));
    LOG(INFO, "Addr           :\t0x%x", answer.number("address"));
    LOG(INFO, "Expected value :\t0x%x", answer.number("expected value"));
    LOG(INFO, "Actual value   :\t0x%x", answer.number("actual value"));
    LOG(INFO, "Error state    :\t0x%x", answer.number("error status"));
    LOG(INFO, "Error address  :\t0x%x", answer.number("error address"));
    LOG(INFO, "Algorithm      :\t%s", answer.text("type").c_str());
}

} // namespace

void* DiagnosticHelper::runLoopbackTestThread(void* argument)
{
    LOG_SCOPE("runLoopbackTestThread");
    const Test_Run run(argument);
    run_loopback(run, FC_WORDS, libDiagLoopbackTest,
                 [&](Json::Value& request) { request["speed"] = run.input.speed; });
    return nullptr;
}

void* DiagnosticHelper::runEthLoopbackTestThread(void* argument)
{
    LOG_SCOPE("runEthLoopbackTestThread");
    const Test_Run run(argument);
    run_loopback(run, ETH_WORDS, libDiagEthLoopbackTest, [](Json::Value&) {});
    return nullptr;
}

void* DiagnosticHelper::runPCILoopbackTestThread(void* argument)
{
    LOG_SCOPE("runPCILoopbackTestThread");
    constexpr const char* ENTRY = "libDiagPCILoopbackTest";
    const Test_Run run(argument);
    run.progress(RUNNING_PCI);
    Json::Value response;
    guarded_call(LOG_HERE, {ENTRY}, libDiagPCILoopbackTest,
                 port_request(run.input, ProviderUtil::getIndexInColonFormat(port_address(run.input))),
                 response);
    check_answer(ENTRY, response);
    run.close_job();
    run.progress(CHECKING_PCI_RESULT);
    const Test_Answer answer(ENTRY, response);
    if (answer.failed()) {
        run.failed_with(Log_Level::ERR, "PCILoopback test run status : %s", answer.text("output").c_str());
        run.failed(PCI_FAILED);
    } else {
        run.passed(PCI_PASSED);
    }
    return nullptr;
}

void* DiagnosticHelper::runMemoryTestThread(void* argument)
{
    LOG_SCOPE("runMemoryTestThread");
    constexpr const char* ENTRY = "libDiagMemoryTest";
    const Test_Run run(argument);
    const String& address = run.input.adapter_address;
    run.progress(CHECKING_ADAPTER);
    const bool was_enabled = getAdapterStatus(address);
    if (was_enabled) {
        run.progress(ADAPTER_NOT_DISABLED);
        run.progress(DISABLING_ADAPTER, Log_Level::WARN);
        // If that fails, the test runs on an adapter in service.
        setAdapterStatus(address, false);
    } else {
        run.progress(ADAPTER_ALREADY_DISABLED);
    }
    run.progress(RUNNING_MEMORY);
    run.progress(MEMORY_TAKES_LONG);
    Json::Value request(Json::objectValue), response;
    request["hbaWwn"] = ProviderUtil::getIndexInColonFormat(address).c_str();
    guarded_call(LOG_HERE, {ENTRY}, libDiagMemoryTest, request, response);
    check_answer(ENTRY, response);
    if (was_enabled) {
        run.progress(ENABLING_ADAPTER, Log_Level::WARN);
        const int result = setAdapterStatus(address, true);
        LOG(INFO, "ret = %d adapterAddress = %s", result, address.c_str());
    }
    run.close_job();
    run.progress(CHECKING_MEMORY_RESULT);
    const Test_Answer answer(ENTRY, response);
    if (!answer.failed()) {
        run.passed(MEMORY_PASSED);
        return nullptr;
    }
    const std::string output = answer.text("output");
    if (answer.number("status") != 0) {
        run.failed(MEMORY_FAILED);
        tell_memory_failure(answer);
        LOG(INFO, "Memory test run status : %s", output.c_str());
    } else {
        LOG(INFO, "Memory test run status : %s", output.c_str());
        run.failed(MEMORY_FAILED);
    }
    return nullptr;
}

} // namespace KPRV
