#pragma once

#include "broker/values/Class_Catalogue.h"
#include "kldrcim/formats/Result_Writer.h"
#include "kldrcim/input/Cli_Options.h"

#include <set>

namespace KPRV::kldrcim {

/// Hands on to the writer what the options want to see: --where, --sort, --count. Of a path the keys are
/// looked at. Sorting keeps all that it hands on until the end; all else goes through as it comes.
class Result_Filter final : public Result_Writer
{
public:
    Result_Filter(const Cli_Options& options, std::unique_ptr<Result_Writer> writer);

    bool instance(Instance_Value&& instance) override;
    bool path(Path_Value&& path) override;
    void end(bool complete) override;

    /// After the end: a name that there were results to look for in, of which none can have it. Empty for
    /// none.
    std::string missed_name(const Class_Catalogue& catalogue) const;

private:
    template <class Thing>
    bool take(std::vector<Thing>& kept, const std::string& class_name, const std::vector<Named_Value>& values,
              Thing&& thing);
    template <class Thing>
    void hand_on(std::vector<Thing>& kept);
    void look_for_names(const std::string& class_name, const std::vector<Named_Value>& values);
    bool give(Instance_Value&& instance);
    bool give(Path_Value&& path);

    const Cli_Options& _options;
    const std::unique_ptr<Result_Writer> _writer;
    /// Asked for to be looked at, not to be shown.
    std::vector<std::string> _extra;
    /// Names that no result had yet, and the classes of those results.
    std::vector<std::string> _missed;
    std::set<std::string> _classes;
    bool _are_paths = false;
    std::vector<Instance_Value> _instances;
    std::vector<Path_Value> _paths;
    std::size_t _count = 0;
};

/// What --where and --sort look at.
std::vector<std::string> filter_names(const Cli_Options& options);

/// Whether the first is to stand before the second by --sort. What has no such value stands last, either way.
bool sorts_before(const Cli_Options& options, const std::vector<Named_Value>& a,
                  const std::vector<Named_Value>& b);

/// Whether what has these values is as each --where wants it.
bool meets_conditions(const Cli_Options& options, const std::string& class_name,
                      const std::vector<Named_Value>& values);

/// The properties to ask for, so that they can be looked at.
Property_List properties_for(const Cli_Options& options);

/// False with a one-line `error` for names and values that results of that class never have, where it is
/// known.
bool check_filter(const Cli_Options& options, const Class_Catalogue& catalogue, const std::string& class_name,
                  bool are_paths, std::string& error);

/// The same for options that do not go together.
bool check_filter_options(const Cli_Options& options, std::string& error);

} // namespace KPRV::kldrcim
