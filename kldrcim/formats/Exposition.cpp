#include "kldrcim/formats/Exposition.h"

#include "kldrcim/formats/Utf8_Text.h"

#include <charconv>
#include <string_view>

namespace KPRV::kldrcim {

namespace {

/// What OpenMetrics adds to the name of a family to name its samples.
std::string_view suffix_of(Metric_Type type)
{
    return type == Metric_Type::COUNTER ? "_total" : type == Metric_Type::INFO ? "_info" : "";
}

const char* type_word(Metric_Type type, Metrics_Notation notation)
{
    if (type == Metric_Type::INFO && notation == Metrics_Notation::OPENMETRICS)
        return "info";
    return type == Metric_Type::COUNTER ? "counter" : "gauge";
}

std::string label_value(const std::string& text)
{
    std::string escaped;
    for (const char c : utf8_text(text)) {
        if (c == '\\' || c == '"')
            escaped += '\\';
        escaped += c == '\n' ? "\\n" : std::string(1, c);
    }
    return escaped;
}

} // namespace

const char* media_type(Metrics_Notation notation)
{
    return notation == Metrics_Notation::OPENMETRICS
               ? "application/openmetrics-text; version=1.0.0; charset=utf-8"
               : "text/plain; version=0.0.4; charset=utf-8";
}

void Exposition::begin(const Metric_Family& family)
{
    _name = family.name;
    _added.clear();
    std::string announced = _name;
    if (_notation == Metrics_Notation::OPENMETRICS)
        announced.resize(announced.size() - suffix_of(family.type).size());
    _text += "# HELP " + announced + " " + family.help + "\n# TYPE " + announced + " " +
             type_word(family.type, _notation) + "\n";
}

void Exposition::add(const Labels& labels, std::variant<std::uint64_t, double> value)
{
    std::string sample = _name;
    const char* before = "{";
    for (const auto& [name, text] : labels) {
        sample += before + std::string(name) + "=\"" + label_value(text) + "\"";
        before = ",";
    }
    sample += labels.empty() ? " " : "} ";
    if (!_added.insert(sample).second)
        return;
    char number[64];
    char* const end =
        std::visit([&](auto each) { return std::to_chars(number, std::end(number), each).ptr; }, value);
    _text += sample + std::string(number, end) + "\n";
}

} // namespace KPRV::kldrcim
