// Behaviours of what is set for paths behind a port: LUN masks and advanced I/O profiles.
#include "simulator/Behaviours.h"
#include "simulator/Lookup.h"
#include "simulator/Target.h"

// LUN masks and advanced I/O profiles: lists of a port, changed by what is to be removed and what is to
// be added. Members of a record tell what it is about: `lPortWwn`, `rPortWwn` and `lunId`, as far as the
// path goes down.

namespace KPRV::simulator {

namespace {

using Records = Path_Records Port::*;

// What a record of the port is about.
Target record_target(State& state, const Port& port, Json::Value record)
{
    for (const char* name : {"wwn", "mac", "pwwn", "pPortWwn", "portWwn"})
        record.removeMember(name);
    record["indexStr"] = port.address;
    return find_target(state.inventory, record, Scope::FC_PORT);
}

// A change that is checked as a whole before anything of it is done.
class Change
{
public:
    Change(State& state, Port& port, Records records) : _state(state), _port(port), _next(port.*records) {}

    void clear() { _next.clear(); }

    void remove(const Json::Value& list)
    {
        each_path(list, [&](const std::string& path, const Json::Value& record) {
            if (!_next.contains(path))
                refuse(Error_Code::NOT_FOUND, "no such record: " + compact_text(record));
            _next.remove(path);
        });
    }

    // `replaces`: whether a record may stand where there is one.
    void add(const Json::Value& list, bool replaces, bool of_luns)
    {
        each_path(list, [&](const std::string& path, const Json::Value& record) {
            if (of_luns && !record.isMember("lunId"))
                refuse(Error_Code::REQUEST, "a record must have lunId: " + compact_text(record));
            else if (!replaces && _next.contains(path))
                refuse(Error_Code::DUPLICATE, "there is such a record: " + compact_text(record));
            _next.put(path, record);
        });
    }

    Json::Value finish(Records records)
    {
        if (!_refusal.isNull())
            return _refusal;
        _port.*records = std::move(_next);
        return done_answer();
    }

private:
    template <typename Action>
    void each_path(const Json::Value& list, Action action)
    {
        if (!list.isNull() && !list.isArray())
            return refuse(Error_Code::REQUEST, "a list of records must be an array: " + compact_text(list));
        for (const Json::Value& record : list) {
            if (!record.isObject()) {
                refuse(Error_Code::REQUEST, "a record must be an object: " + compact_text(record));
                continue;
            }
            const Target target = record_target(_state, _port, record);
            if (target)
                action(target.path, record);
            else if (_refusal.isNull())
                _refusal = target.refusal;
        }
    }

    void refuse(Error_Code code, const std::string& reason)
    {
        if (_refusal.isNull())
            _refusal = error_answer(code, reason);
    }

    State& _state;
    Port& _port;
    Path_Records _next;
    Json::Value _refusal;
};

Json::Value records_answer(State& state, const Json::Value& request, const char* name, Records records)
{
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        Json::Value answer;
        answer[name] = (target.port->*records).list();
        return answer;
    });
}

void reset_io_data_at(State& state, const Target& target)
{
    state.inventory.reset_marks.reset(statistics_kind(Statistics::ADVANCED_IO).group, target.path);
}

// The range is of LUNs of one remote port; between its ends, numbers that no LUN has are nobody's.
Json::Value reset_lun_range(State& state, Json::Value request, const Target& first)
{
    request["lunId"] = request["endLunRange"];
    const Target last = find_target(state.inventory, request, Scope::FC_PORT);
    if (!last)
        return last.refusal;
    const unsigned from = first.lun ? (*first.lun)["number"].asUInt() : 0;
    const unsigned to = (*last.lun)["number"].asUInt();
    if (!first.lun || to < from)
        return error_answer(Error_Code::REQUEST, "endLunRange must not be below lunId");
    for (const Json::Value& lun : first.remote_port->complete["lunList"]) {
        request["lunId"] = lun["number"];
        if (lun["number"].isUInt() && lun["number"].asUInt() >= from && lun["number"].asUInt() <= to)
            reset_io_data_at(state, find_target(state.inventory, request, Scope::FC_PORT));
    }
    return done_answer();
}

} // namespace

Json::Value lun_masks(State& state, const Json::Value& request)
{
    return records_answer(state, request, "lunMaskData", &Port::lun_masks);
}

Json::Value set_lun_masks(State& state, const Json::Value& request)
{
    if (!request["clearLunMaskData"].isBool())
        return error_answer(Error_Code::REQUEST, "clearLunMaskData must be true or false");
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        Change change(state, *target.port, &Port::lun_masks);
        if (request["clearLunMaskData"].asBool())
            change.clear();
        change.remove(request["removedLunMaskData"]);
        change.add(request["addedLunMaskData"], false, true);
        return change.finish(&Port::lun_masks);
    });
}

Json::Value io_profiles(State& state, const Json::Value& request)
{
    return records_answer(state, request, "advancedIoProfiles", &Port::io_profiles);
}

Json::Value set_io_profiles(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        Change change(state, *target.port, &Port::io_profiles);
        change.remove(request["removedAdvancedIoProfiles"]);
        change.add(request["addedAdvancedIoProfiles"], true, false);
        return change.finish(&Port::io_profiles);
    });
}

Json::Value clear_io_profiles(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        target.port->io_profiles.remove_below(target.path);
        return done_answer();
    });
}

Json::Value reset_io_data(State& state, const Json::Value& request)
{
    return answer_for_target(state, request, Scope::FC_PORT, [&](const Target& target) {
        if (request.isMember("endLunRange"))
            return reset_lun_range(state, request, target);
        reset_io_data_at(state, target);
        return done_answer();
    });
}

} // namespace KPRV::simulator
