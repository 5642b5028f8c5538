#include "kldrcim/verbs/Cli_Conform.h"

#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/walks/Conformance.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Verdict = Conformance_Finding::Verdict;

std::string expected_text(const Conformance_Step& step)
{
    if (step.least == 0)
        return step.most == MANY ? "any" : "at most " + std::to_string(step.most);
    return std::to_string(step.least) + (step.most == MANY ? " or more" : "");
}

const char* word_of(Verdict verdict)
{
    switch (verdict) {
    case Verdict::OK:
        return "ok";
    case Verdict::NONE:
        return "none";
    case Verdict::MISSING:
        return "missing";
    default:
        return "not reached";
    }
}

std::string verdict_text(const Conformance_Finding& finding)
{
    std::string text = word_of(finding.verdict);
    const char* separator = ": ";
    for (const std::string& missing : finding.missing) {
        text += separator + missing;
        separator = ", ";
    }
    return text;
}

std::string findings_table(const std::vector<Conformance_Finding>& findings)
{
    std::vector<std::vector<std::string>> rows;
    for (const Conformance_Finding& finding : findings) {
        const Conformance_Step& step = *finding.step;
        rows.push_back({step.section ? step.section : "", step.name, step.class_name,
                        step.from ? step.from : "", expected_text(step), std::to_string(finding.found),
                        verdict_text(finding)});
    }
    auto missing = std::count_if(findings.begin(), findings.end(), [](const Conformance_Finding& finding) {
        return finding.verdict == Verdict::MISSING;
    });
    return rows_as_table({"Section", "Element", "Class", "Each of", "Expected", "Found", "Verdict"}, rows) +
           (missing ? "\nelements with something missing: " + std::to_string(missing)
                    : std::string("\neverything mandatory is there")) +
           "\n";
}

std::string json_or_null(const char* text)
{
    return text ? json_string(text) : "null";
}

std::string findings_json(const std::vector<Conformance_Finding>& findings)
{
    std::vector<std::string> elements;
    for (const Conformance_Finding& finding : findings) {
        const Conformance_Step& step = *finding.step;
        std::vector<std::string> missing;
        for (const std::string& text : finding.missing)
            missing.push_back(json_string(text));
        elements.push_back(json_object(
            {
                {"element", json_string(step.name)},
                {"class", json_string(step.class_name)},
                {"from", json_or_null(step.from)},
                {"association", json_or_null(step.association)},
                {"least", std::to_string(step.least)},
                {"most", step.most == MANY ? "null" : std::to_string(step.most)},
                {"found", std::to_string(finding.found)},
                {"verdict", json_string(word_of(finding.verdict))},
                {"missing", json_array(missing, 2)},
            },
            1));
    }
    return json_array(elements) + "\n";
}

} // namespace

int run_conform(const Cli_Options& options, Connection& connection)
{
    std::vector<Conformance_Finding> findings = check_conformance(connection);
    std::string text =
        options.format == Cli_Options::Format::JSON ? findings_json(findings) : findings_table(findings);
    put(text);
    return misses_something(findings);
}

} // namespace KPRV::kldrcim
