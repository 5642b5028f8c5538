#pragma once

#include <cstdint>
#include <string>
#include <unordered_set>
#include <utility>
#include <variant>
#include <vector>

namespace KPRV::kldrcim {

/// The two texts that collectors of metrics read. They differ in how counters and information are announced.
enum class Metrics_Notation
{
    /// Text format of Prometheus, version 0.0.4, which files for the node exporter are written in.
    PROMETHEUS,
    /// OpenMetrics, version 1.0.0.
    OPENMETRICS,
};

/// As Content-Type and Accept of HTTP have it.
const char* media_type(Metrics_Notation notation);

/// What kind of metric a family is.
enum class Metric_Type
{
    GAUGE,
    /// Its name ends in "_total".
    COUNTER,
    /// Facts in labels, its value is 1. Its name ends in "_info".
    INFO,
};

struct Metric_Family
{
    const char* name;
    Metric_Type type;
    /// One sentence, without a backslash or line break.
    const char* help;
};

using Labels = std::vector<std::pair<const char*, std::string>>;

/// Composes such a text: of each family first what it is, then its samples.
class Exposition
{
public:
    explicit Exposition(Metrics_Notation notation) : _notation(notation) {}

    void begin(const Metric_Family& family);
    /// Of the family that was begun last. Labels that it has already are left out: collectors refuse a text
    /// that says two things of one.
    void add(const Labels& labels, std::variant<std::uint64_t, double> value);

    /// The text with its end.
    std::string text() const { return _text + "# EOF\n"; }

private:
    Metrics_Notation _notation;
    std::string _name;
    /// Labels of the samples of this family.
    std::unordered_set<std::string> _added;
    std::string _text;
};

} // namespace KPRV::kldrcim
