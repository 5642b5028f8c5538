#include "kldrcim/formats/Health_Text.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Counted_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/formats/Visible_Text.h"
#include "kldrcim/walks/Property_Values.h"

#include <algorithm>
#include <cctype>

namespace KPRV::kldrcim {

namespace {

/// "FC port 10:00:..."; of what has no instance the name of its class.
std::string element_text(const Health_Finding& finding)
{
    if (finding.element.properties.empty())
        return finding.element.path.class_name;
    const Node_Label label = node_label({finding.element_kind, finding.element});
    return label.what + (label.name.empty() ? "" : " ") + label.name;
}

std::string detail_text(const Health_Finding& finding)
{
    if (std::string_view(finding.kind->name) != "link-slow")
        return visible_text(finding.detail);
    const auto speed = [&](const char* property) {
        return speed_text(number_of(finding.element, property).value_or(0));
    };
    return speed("Speed") + " of " + speed("MaxSpeed");
}

/// "the link is slower than it could be (4 Gb/s of 8 Gb/s)".
std::string words_of(const Health_Finding& finding)
{
    const std::string detail = detail_text(finding);
    return finding.kind->words + (detail.empty() ? "" : " (" + detail + ")");
}

/// Empty where there is no instance.
std::string path_of(const Health_Finding& finding)
{
    return finding.element.path.keys.empty() ? "" : path_text(finding.element.path);
}

std::string counted(const Health_Report& report)
{
    return counted_text(report.adapters, "adapter") + ", " + counted_text(report.ports, "port") + ", " +
           counted_text(report.targets, "target");
}

std::size_t count_of(const Health_Report& report, Rank rank)
{
    return static_cast<std::size_t>(std::ranges::count(
        report.findings, rank, [](const Health_Finding& finding) { return finding.kind->rank; }));
}

/// What is counted, by the names that programs know. Ports have a most: all that there are.
struct Figure
{
    const char* name;
    std::uint64_t value;
    std::optional<std::uint64_t> most = {};
};

std::vector<Figure> figures_of(const Health_Report& report)
{
    std::vector<Figure> figures = {
        {"critical", count_of(report, Rank::CRITICAL)},
        {"warning", count_of(report, Rank::WARNING)},
        {"unknown", count_of(report, Rank::UNKNOWN)},
        {"adapters", report.adapters},
        {"ports", report.ports},
        {"ports_in_service", report.ports_in_service, report.ports},
        {"targets", report.targets},
    };
    if (report.errors_grown)
        figures.push_back({"errors_grown", *report.errors_grown});
    return figures;
}

} // namespace

std::string health_lines(const Health_Report& report)
{
    if (report.findings.empty())
        return "ok        nothing is wrong with " + counted(report) + "\n";
    std::string text;
    for (const Health_Finding& finding : report.findings) {
        const std::string rank = rank_name(finding.kind->rank), path = path_of(finding);
        text += rank + std::string(10 - rank.size(), ' ') + element_text(finding) + ": " + words_of(finding) +
                "; " + finding.kind->advice + (path.empty() ? "" : "  " + path) + "\n";
    }
    return text;
}

std::string health_json(const Health_Report& report)
{
    std::vector<std::string> findings;
    for (const Health_Finding& finding : report.findings)
        findings.push_back(json_object({{"rank", json_string(rank_name(finding.kind->rank))},
                                        {"finding", json_string(finding.kind->name)},
                                        {"element", json_string(element_text(finding))},
                                        {"words", json_string(finding.kind->words)},
                                        {"detail", json_string(detail_text(finding))},
                                        {"advice", json_string(finding.kind->advice)},
                                        {"path", json_string(path_of(finding))}},
                                       4));
    std::vector<std::pair<std::string, std::string>> members = {
        {"status", json_string(rank_name(report.rank))}, {"findings", json_array(findings, 2)}};
    for (const Figure& figure : figures_of(report))
        members.emplace_back(figure.name, std::to_string(figure.value));
    return json_object(members) + "\n";
}

std::string health_plugin_line(const Health_Report& report)
{
    std::string status = rank_name(report.rank);
    std::ranges::transform(status, status.begin(), [](unsigned char c) { return std::toupper(c); });
    std::string line = "KALDERA " + status + " - ";
    if (report.findings.empty())
        line += counted(report);
    else
        line += element_text(report.findings[0]) + ": " + words_of(report.findings[0]);
    if (report.findings.size() > 1)
        line += ", and " + std::to_string(report.findings.size() - 1) + " more";
    // A bar begins the performance data.
    std::ranges::replace(line, '|', '/');
    line += " |";
    for (const Figure& figure : figures_of(report))
        line += std::string(" ") + figure.name + "=" + std::to_string(figure.value) + ";;;0" +
                (figure.most ? ";" + std::to_string(*figure.most) : "");
    return line + "\n";
}

} // namespace KPRV::kldrcim
