#include "kldrcim/verbs/Cli_Diag.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Cli_Output.h"
#include "kldrcim/verbs/Interruption.h"
#include "kldrcim/verbs/Result_Filter.h"
#include "kldrcim/walks/Diag_Job.h"
#include "kldrcim/walks/Diag_Names.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>

namespace KPRV::kldrcim {

namespace {

constexpr int REFUSED = 3;
constexpr std::uint64_t JOB_STARTED = 4096;

int complain_of(const Result& result)
{
    return complain(code_text(result.rc), FAILURE);
}

const std::string& text_of(const Instance_Value& instance, const char* name)
{
    static const std::string none;
    const Plain_Value* const value = instance.property(name);
    return value ? value->as_text() : none;
}

/// Of CIM's `Characteristics`.
constexpr std::uint64_t OUT_OF_SERVICE = 4;
constexpr std::uint64_t LOOPBACK_PLUG = 10;

bool has_characteristic(const Instance_Value& test, std::uint64_t number)
{
    const Plain_Value* const value = test.property("Characteristics");
    return value && std::ranges::any_of(value->elements(),
                                        [&](const Plain_Value& each) { return each.as_uint() == number; });
}

std::string characteristics_of(const Instance_Value& test)
{
    static constexpr std::pair<std::uint64_t, const char*> words[] = {
        {OUT_OF_SERVICE, "takes it out of service"}, {LOOPBACK_PLUG, "needs a loopback plug"}};
    std::string text;
    for (const auto& [number, word] : words)
        if (has_characteristic(test, number))
            text += (text.empty() ? "" : ", ") + std::string(word);
    return text;
}

/// The tests, and behind them what they can be run on.
class Tests_Table final : public Result_Writer
{
public:
    explicit Tests_Table(Connection& connection) : _connection(connection) {}

    bool instance(Instance_Value&& test) override
    {
        _tests.push_back(
            {text_of(test, "Name"), element_words(test.path.class_name), characteristics_of(test)});
        return true;
    }
    bool path(Path_Value&&) override { return true; }
    void end(bool) override
    {
        put(rows_as_table({"Test", "On", "Remarks"}, _tests));
        std::vector<std::vector<std::string>> rows;
        for (const Element_Kind& kind : element_kinds())
            for (const Instance_Value& each : _connection.enumerate_instances(kind.class_name).instances)
                rows.push_back({text_of(each, "DeviceID"), kind.words, text_of(each, "ElementName")});
        put("\n" + rows_as_table({"Element", "Kind", "Name"}, rows));
    }

private:
    Connection& _connection;
    std::vector<std::vector<std::string>> _tests;
};

int list(const Cli_Options& options, Connection& connection)
{
    std::string error;
    if (!check_filter(options, connection.classes(), test_class, false, error))
        return complain(error, USAGE_ERROR);
    Result tests = connection.enumerate_instances(test_class, properties_for(options));
    if (!tests.ok())
        return complain_of(tests);
    const bool has_own_table = options.format == Cli_Options::Format::TABLE && !options.properties;
    Result_Filter filter(options,
                         has_own_table ? std::make_unique<Tests_Table>(connection) : make_writer(options));
    for (Instance_Value& test : tests.instances)
        filter.instance(std::move(test));
    filter.end(true);
    return 0;
}

/// Why the module does not run the test.
std::string refusal(std::uint64_t code)
{
    static constexpr std::pair<std::uint64_t, const char*> meanings[] = {
        {1, "not supported: an FCoE port has no internal loopback test"},
        {4, "failed: another test is running, or the port's details cannot be read"},
        {5, "invalid parameter: the test is not for such an element, or its address is not one"}};
    for (const auto& [number, meaning] : meanings)
        if (code == number)
            return meaning;
    return "a value without a meaning";
}

int report(const Run_Report& outcome)
{
    std::vector<std::vector<std::string>> rows;
    for (const Run_Record& record : outcome.records)
        rows.push_back({std::to_string(record.number), record.time, record.outcome, record.text});
    put(rows_as_table({"Record", "Time", "Outcome", "Text"}, rows));
    put(outcome.passed ? "passed\n" : "failed\n");
    return outcome.passed ? 0 : 1;
}

bool takes_out_of_service(Connection& connection, const Path_Value& test)
{
    const Result result = connection.get_instance(test, {{"Characteristics"}});
    return result.ok() && !result.instances.empty() &&
           has_characteristic(result.instances[0], OUT_OF_SERVICE);
}

/// A test and its job that live in this process: whatever ends the verb, the element is brought back first. A
/// signal is an order to come to that end, a second one to leave at once. A server goes on without us.
class Running_Test
{
public:
    Running_Test(Connection& connection, bool out_of_service, std::string element)
        : _connection(connection), _out_of_service(out_of_service), _element(std::move(element))
    {
    }
    ~Running_Test() { wait_for_end(); }
    Running_Test(const Running_Test&) = delete;
    Running_Test& operator=(const Running_Test&) = delete;

    void wait_for_end()
    {
        while (_connection.is_at_work())
            wait();
    }
    /// For a moment. False if there is nothing to wait for any more.
    bool wait()
    {
        constexpr auto MOMENT = std::chrono::milliseconds(100);
        _interruption.wait(MOMENT);
        if (!_connection.is_in_process()) {
            if (_interruption.count() != 0)
                complain("interrupted: the server goes on with the test", 0);
            return _interruption.count() == 0;
        }
        if (_interruption.count() > 1)
            leave();
        if (_interruption.count() == 1 && !_told) {
            _told = true;
            complain(_out_of_service
                         ? "interrupted: waiting until the test has brought " + _element +
                               " back into service; a second signal leaves it as it is"
                         : "interrupted: waiting for the end of the test; a second signal ends it",
                     0);
        }
        return true;
    }
    /// The signal that has come; 0 for none.
    int signal() const { return _interruption.latest(); }

private:
    [[noreturn]] void leave()
    {
        complain(_out_of_service ? _element + " is left out of service: the test was ended while it ran"
                                 : "the test of " + _element + " was ended while it ran",
                 0);
        // Not by the usual end, which would wait for the provider.
        std::_Exit(status_of_signal(_interruption.latest()));
    }

    Connection& _connection;
    const bool _out_of_service;
    const std::string _element;
    bool _told = false;
    Interruption _interruption;
};

int run(const Cli_Options& options, Connection& connection)
{
    Path_Value test, element;
    std::string error;
    if (!find_test(connection, options.arguments[1], test, error) ||
        !find_element(connection, test.class_name, options.arguments[2], element, error))
        return complain(error, USAGE_ERROR);
    Running_Test running(connection, takes_out_of_service(connection, test), options.arguments[2]);
    const Result started =
        connection.invoke_method(test, "RunDiagnostic", {{"ManagedElement", Plain_Value::path(element)}});
    if (!started.ok())
        return complain_of(started);
    const std::uint64_t code = started.return_value.as_uint();
    if (code != JOB_STARTED)
        return complain("refused, RunDiagnostic returned " + std::to_string(code) + ": " + refusal(code),
                        REFUSED);
    const Plain_Value* const reference = find_value(started.out, "Job");
    if (!reference || !reference->as_path())
        return complain("the test was started without a job", FAILURE);
    const Path_Value& job = *reference->as_path();
    put(path_text(job) + "\n");
    flush_output();
    int status = 0;
    if (options.wait) {
        const Run_Report outcome = follow_job(connection, job, [&] { return running.wait(); });
        if (connection.is_in_process() || !running.signal())
            status = report(outcome);
    } else if (connection.is_in_process()) {
        // A server would go on; this one is the module's process, and its end would leave the element out of
        // service.
        complain("the test and its job live in this process, which waits for the end of the test and then "
                 "takes the "
                 "records with it; --wait shows them",
                 0);
        running.wait_for_end();
    }
    return running.signal() ? status_of_signal(running.signal()) : status;
}

} // namespace

int diag(const Cli_Options& options, Connection& connection)
{
    const std::vector<std::string>& words = options.arguments;
    if (words[0] == "list" && words.size() == 1 && !options.wait)
        return list(options, connection);
    const bool is_filtered = options.total || !filter_names(options).empty();
    if (words[0] == "run" && words.size() == 3 && !is_filtered)
        return run(options, connection);
    return complain("usage: kldrcim [options] diag list | diag run TEST ELEMENT [--wait]", USAGE_ERROR);
}

} // namespace KPRV::kldrcim
