#include "tests/bench/Plain_Provider.h"
#include "tests/bench/plain_lun.h"

#include <cstdio>

namespace KPRV::bench {

namespace {

/// Makes the instances of one request, with the arrays that all of them have.
class extent_maker
{
public:
    explicit extent_maker(const CMPIBroker* broker)
        : _broker(broker), _statuses(plain_array_of(broker, 2)),
          _descriptions(plain_array_of(broker, "It is a unique identification for a Storage Extent"))
    {
        plain_host_name(_host, sizeof _host);
    }

    const char* host() const { return _host; }

    /// One unit without a description puts those behind it on the same port under other rules.
    void look_at(const Json::Value& lun) { _no_description_seen |= lun["lunDescription"].isNull(); }
    void begin_port() { _no_description_seen = false; }

    /// Of the unit that was looked at last.
    CMPIInstance* make(const Json::Value& lun, const plain_lun_names& names) const
    {
        CMPIInstance* const instance =
            plain_device_instance(_broker, "KALDERA_StorageExtent", _host, names.id());
        plain_set_text(instance, "ElementName", names.element());
        const CMPIValue ids = plain_array_of(_broker, names.id());
        CMSetProperty(instance, "OtherIdentifyingInfo", &ids, CMPI_stringA);
        CMSetProperty(instance, "IdentifyingDescriptions", &_descriptions, CMPI_stringA);
        CMSetProperty(instance, "OperationalStatus", &_statuses, CMPI_uint16A);
        set_name(instance, lun);
        return instance;
    }

private:
    void set_name(CMPIInstance* instance, const Json::Value& lun) const
    {
        switch (id_type(lun)) {
        case 0:
            return set_name(instance, by_product(lun).c_str(), 7, 7);
        case 1:
            return set_name(instance, description(lun), 11, 4);
        case 2:
            return set_name(instance, description(lun), 10, 3);
        case 3:
            return set_name(instance, description(lun), 9, 2);
        case 8:
            return set_name(instance, description(lun), 1, 1);
        case 10:
            return set_name(instance, "Unable To Fetch", 0, 0);
        default:
            plain_set_text(instance, "Name", "");
        }
    }

    static void set_name(CMPIInstance* instance, const char* name, unsigned format, unsigned name_space)
    {
        plain_set_text(instance, "Name", name);
        plain_set_uint16(instance, "NameFormat", format);
        plain_set_uint16(instance, "NameNamespace", name_space);
    }

    unsigned id_type(const Json::Value& lun) const
    {
        if (!_no_description_seen)
            return lun["lunDescIdType"].asUInt();
        return lun["productSerialNumber"].isNull() ? 10 : 0;
    }

    static const char* description(const Json::Value& lun)
    {
        return plain_view(lun["lunDescription"]).data();
    }

    static std::string by_product(const Json::Value& lun)
    {
        std::string name(plain_trimmed(plain_view(lun["vendor"])));
        for (const char* part : {"productID", "productSerialNumber"})
            name.append("+").append(plain_trimmed(plain_view(lun[part])));
        return name;
    }

    const CMPIBroker* _broker;
    CMPIValue _statuses, _descriptions;
    char _host[256];
    bool _no_description_seen = false;
};

/// `visit(target)` for each target that has extents.
template <class Visit>
void for_each_disk(extent_maker& maker, Visit visit)
{
    plain_for_each_port([&](int, const Json::Value& port) {
        maker.begin_port();
        plain_for_each_target(port["wwn"], [&](const plain_target& target) {
            if (!target.is_tape())
                visit(target);
        });
    });
}

} // namespace

CMPIStatus plain_enumerate_extents(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath*)
{
    extent_maker maker(broker);
    for_each_disk(maker, [&](const plain_target& target) {
        plain_for_each_lun(target, [&](const Json::Value& lun, const plain_lun_names& names) {
            maker.look_at(lun);
            CMReturnInstance(result, maker.make(lun, names));
        });
    });
    CMReturnDone(result);
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus plain_get_extent(const CMPIBroker* broker, const CMPIResult* result, const CMPIObjectPath* cop)
{
    extent_maker maker(broker);
    if (!plain_is_device(cop, "KALDERA_StorageExtent", maker.host()))
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    const char* const wanted = plain_key(cop, "DeviceID");
    CMPIInstance* found = nullptr;
    for_each_disk(maker, [&](const plain_target& target) {
        if (found || strncmp(wanted, target.name, target.port_size) != 0)
            return;
        plain_for_each_lun(target, [&](const Json::Value& lun, const plain_lun_names& names) {
            maker.look_at(lun);
            if (!found && strcmp(names.id(), wanted) == 0)
                found = maker.make(lun, names);
        });
    });
    return plain_return_found(result, found);
}

} // namespace KPRV::bench
