#include "host/Cli_Diag.h"

#include "host/Cli_Complaints.h"
#include "host/Cli_Output.h"
#include "host/Diag_Job.h"
#include "host/Diag_Names.h"
#include "host/Format_Table.h"
#include "host/Value_Text.h"

#include <algorithm>
#include <iterator>

namespace KPRV::host {

namespace {

constexpr int CIM_STATUS = 1;
constexpr int REFUSED = 3;
constexpr std::uint64_t JOB_STARTED = 4096;

int complain_of(const Result& result)
{
    return complain(code_text(result.rc), CIM_STATUS);
}

void put(const std::string& text)
{
    std::fwrite(text.data(), 1, text.size(), stdout);
}

const std::string& text_of(const Instance_Value& instance, const char* name)
{
    static const std::string none;
    const Value* const value = instance.property(name);
    return value ? value->as_text() : none;
}

/// CIM's `Characteristics` in words.
std::string characteristics_of(const Instance_Value& test)
{
    static constexpr std::pair<std::uint64_t, const char*> words[] = {{4, "takes it out of service"},
                                                                      {10, "needs a loopback plug"}};
    std::string text;
    const Value* const value = test.property("Characteristics");
    for (const auto& [number, word] : words)
        for (const Value& each : value ? value->elements() : std::vector<Value>())
            if (each.as_uint() == number)
                text += (text.empty() ? "" : ", ") + std::string(word);
    return text;
}

int list(const Cli_Options& options, Host& host)
{
    const Result tests = host.enumerate_instances(test_class, options.properties);
    if (!tests.ok())
        return complain_of(tests);
    if (options.format != Cli_Options::Format::TABLE || options.properties) {
        write_instances(options, tests.instances);
        return 0;
    }
    std::vector<std::vector<std::string>> rows;
    for (const Instance_Value& test : tests.instances)
        rows.push_back(
            {text_of(test, "Name"), element_words(test.path.class_name), characteristics_of(test)});
    put(rows_as_table({"Test", "On", "Remarks"}, rows));
    rows.clear();
    for (const Element_Kind& kind : element_kinds())
        for (const Instance_Value& element : host.enumerate_instances(kind.class_name).instances)
            rows.push_back({text_of(element, "DeviceID"), kind.words, text_of(element, "ElementName")});
    put("\n" + rows_as_table({"Element", "Kind", "Name"}, rows));
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
    std::printf("%s\n", outcome.passed ? "passed" : "failed");
    return outcome.passed ? 0 : 1;
}

int run(const Cli_Options& options, Host& host)
{
    Path_Value test, element;
    std::string error;
    if (!find_test(host, options.arguments[1], test, error) ||
        !find_element(host, test.class_name, options.arguments[2], element, error))
        return complain(error, USAGE_ERROR);
    const Result started =
        host.invoke_method(test, "RunDiagnostic", {{"ManagedElement", Value::path(element)}});
    if (!started.ok())
        return complain_of(started);
    const std::uint64_t code = started.return_value.as_uint();
    if (code != JOB_STARTED)
        return complain("refused, RunDiagnostic returned " + std::to_string(code) + ": " + refusal(code),
                        REFUSED);
    const Value* const reference = find_value(started.out, "Job");
    if (!reference || !reference->as_path())
        return complain("the test was started without a job", CIM_STATUS);
    const Path_Value& job = *reference->as_path();
    std::printf("%s\n", path_text(job).c_str());
    std::fflush(stdout);
    if (options.wait)
        return report(follow_job(host, job));
    // A server would go on; this one is the module's process, and its end would leave the element out of
    // service.
    complain(
        "the test and its job live in this process, which waits for the end of the test and then takes the "
        "records with it; --wait shows them",
        0);
    wait_for_end(host);
    return 0;
}

} // namespace

int diag(const Cli_Options& options, Host& host)
{
    const std::vector<std::string>& words = options.arguments;
    if (words[0] == "list" && words.size() == 1 && !options.wait)
        return list(options, host);
    if (words[0] == "run" && words.size() == 3)
        return run(options, host);
    return complain("usage: kldrcim [options] diag list | diag run TEST ELEMENT [--wait]", USAGE_ERROR);
}

} // namespace KPRV::host
