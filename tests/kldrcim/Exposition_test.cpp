#include "kldrcim/formats/Exposition.h"

#include <gtest/gtest.h>

namespace KPRV::kldrcim {
namespace {

std::string composed(Metrics_Notation notation)
{
    Exposition text(notation);
    text.begin({"kldr_errors_total", Metric_Type::COUNTER, "Errors."});
    text.add({{"port", "a\"b\\c\nd\xFF"}}, std::uint64_t(18446744073709551615u));
    text.add({{"port", "two"}, {"target", ""}}, 0.0065);
    // Said already.
    text.add({{"port", "two"}, {"target", ""}}, 7.0);
    text.begin({"kldr_module_info", Metric_Type::INFO, "Module."});
    text.add({}, std::uint64_t(1));
    // Of another family, the same labels are something else.
    text.begin({"kldr_seconds", Metric_Type::GAUGE, "Seconds."});
    text.add({}, 1e-7);
    return text.text();
}

TEST(Exposition, TextOfPrometheus)
{
    EXPECT_EQ("# HELP kldr_errors_total Errors.\n"
              "# TYPE kldr_errors_total counter\n"
              "kldr_errors_total{port=\"a\\\"b\\\\c\\nd\xEF\xBF\xBD\"} 18446744073709551615\n"
              "kldr_errors_total{port=\"two\",target=\"\"} 0.0065\n"
              "# HELP kldr_module_info Module.\n"
              "# TYPE kldr_module_info gauge\n"
              "kldr_module_info 1\n"
              "# HELP kldr_seconds Seconds.\n"
              "# TYPE kldr_seconds gauge\n"
              "kldr_seconds 1e-07\n"
              "# EOF\n",
              composed(Metrics_Notation::PROMETHEUS));
}

TEST(Exposition, OpenMetrics)
{
    EXPECT_EQ("# HELP kldr_errors Errors.\n"
              "# TYPE kldr_errors counter\n"
              "kldr_errors_total{port=\"a\\\"b\\\\c\\nd\xEF\xBF\xBD\"} 18446744073709551615\n"
              "kldr_errors_total{port=\"two\",target=\"\"} 0.0065\n"
              "# HELP kldr_module Module.\n"
              "# TYPE kldr_module info\n"
              "kldr_module_info 1\n"
              "# HELP kldr_seconds Seconds.\n"
              "# TYPE kldr_seconds gauge\n"
              "kldr_seconds 1e-07\n"
              "# EOF\n",
              composed(Metrics_Notation::OPENMETRICS));
}

} // namespace
} // namespace KPRV::kldrcim
