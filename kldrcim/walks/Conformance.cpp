#include "kldrcim/walks/Conformance.h"

#include "broker/values/Path_Identity.h"
#include "broker/values/Type_Words.h"

#include <algorithm>
#include <map>
#include <set>
#include <sstream>

namespace KPRV::kldrcim {

namespace {

using Instances = std::vector<Instance_Value>;
using Verdict = Conformance_Finding::Verdict;

/// An empty text tells a client as little as none.
bool has_value(const Instance_Value& instance, const std::string& property)
{
    const Plain_Value* value = instance.property(property);
    return value && !value->null && (value->type != CMPI_string || !value->as_text().empty());
}

class Conformance_Walk
{
public:
    explicit Conformance_Walk(Connection& connection) : _connection(connection) {}

    Conformance_Finding take(const Conformance_Step& step)
    {
        _finding = {.step = &step};
        Instances& found = _objects[step.name];
        if (step.from)
            follow(step, _objects[step.from], found);
        else
            enumerate(step, found);
        _finding.found = found.size();
        if (_finding.verdict != Verdict::NO_START)
            judge(step, found);
        return _finding;
    }

private:
    void enumerate(const Conformance_Step& step, Instances& found)
    {
        Result all = _connection.enumerate_instances(step.class_name);
        note_failure(all);
        for (Instance_Value& instance : all.instances)
            if (const Plain_Value* name = instance.property("RegisteredName");
                name && name->as_text() == step.name)
                found.push_back(std::move(instance));
        count(step, found.size(), 1, found.size());
    }

    void follow(const Conformance_Step& step, const Instances& starts, Instances& found)
    {
        if (starts.empty()) {
            _finding.verdict = Verdict::NO_START;
            return;
        }
        std::size_t wrong = 0, example = 0;
        std::set<std::string> seen;
        for (const Instance_Value& start : starts) {
            Instances here = associators(step, start.path);
            if (here.size() < step.least || here.size() > step.most) {
                ++wrong;
                example = here.size();
            }
            for (Instance_Value& instance : here)
                if (seen.insert(path_identity(instance.path)).second)
                    found.push_back(std::move(instance));
        }
        if (wrong)
            count(step, example, wrong, starts.size());
    }

    Instances associators(const Conformance_Step& step, const Path_Value& start)
    {
        Request request{.operation = Operation::ASSOCIATORS, .path = start};
        request.filter = {.association_class = step.association,
                          .result_class = step.class_name,
                          .role = step.near_role,
                          .result_role = step.far_role};
        Result result = _connection.run(request);
        note_failure(result);
        std::erase_if(result.instances, [&](const Instance_Value& instance) {
            return !_connection.classes().is_a(instance.path.class_name, step.class_name);
        });
        return result.instances;
    }

    void count(const Conformance_Step& step, std::size_t have, std::size_t wrong, std::size_t starts)
    {
        if (have >= step.least && have <= step.most)
            return;
        std::string text = have == 0 ? "none" : std::to_string(have);
        if (step.from)
            text += " at " + std::to_string(wrong) + " of " + std::to_string(starts);
        _finding.missing.push_back(text);
    }

    void judge(const Conformance_Step& step, const Instances& found)
    {
        std::istringstream properties(step.properties);
        for (std::string property; properties >> property;) {
            auto without = std::count_if(found.begin(), found.end(), [&](const Instance_Value& instance) {
                return !has_value(instance, property);
            });
            if (without)
                _finding.missing.push_back(property + " in " + std::to_string(without) + " of " +
                                           std::to_string(found.size()));
        }
        if (!_finding.missing.empty())
            _finding.verdict = Verdict::MISSING;
        else if (found.empty())
            _finding.verdict = Verdict::NONE;
    }

    void note_failure(const Result& result)
    {
        if (!result.ok())
            _finding.missing.push_back(status_name(result.rc));
    }

    Connection& _connection;
    std::map<std::string, Instances> _objects;
    Conformance_Finding _finding{};
};

} // namespace

std::vector<Conformance_Finding> check_conformance(Connection& connection)
{
    Conformance_Walk walk(connection);
    std::vector<Conformance_Finding> findings;
    for (const Conformance_Step* step = conformance_steps; step->name; ++step)
        findings.push_back(walk.take(*step));
    return findings;
}

bool misses_something(const std::vector<Conformance_Finding>& findings)
{
    return std::any_of(findings.begin(), findings.end(), [](const Conformance_Finding& finding) {
        return finding.verdict == Verdict::MISSING;
    });
}

} // namespace KPRV::kldrcim
