#include "tests/bench/Ready_Objects.h"

#include <cstdio>
#include <cstdlib>
#include <string>
#include <unordered_set>
#include <utility>

namespace KPRV::bench {

namespace {

/// Texts and names are not the server's any more when they are handed over: each is kept once.
const char* kept(const char* text)
{
    static std::unordered_set<std::string>& texts = *new std::unordered_set<std::string>;
    return texts.insert(text).first->c_str();
}

const char* text_of(const CMPIString* text)
{
    return object_of<Lean_String>(text)->text;
}

} // namespace

Ready_Objects::Ready_Objects(const Lean_Broker& server)
{
    for (const CMPIInstance* each : server.instances()) {
        const Lean_Instance& instance = *object_of<Lean_Instance>(each);
        Delivery delivery = {take_path(&instance.path->handle), 0, true, take(instance.properties)};
        delivery.paths_end = _paths.size();
        _deliveries.push_back(delivery);
    }
    for (const CMPIObjectPath* each : server.paths()) {
        const size_t path = take_path(each);
        _deliveries.push_back({path, _paths.size(), false, {}});
    }
    _made.resize(_paths.size());
    _places.clear();
}

size_t Ready_Objects::take_path(const CMPIObjectPath* path)
{
    if (const auto known = _places.find(path); known != _places.end())
        return known->second;
    const Lean_Path& seen = *object_of<Lean_Path>(path);
    // Its references first: they are made before it.
    std::vector<Datum> keys = take(seen.keys);
    _paths.push_back({kept(text_of(seen.class_name)), std::move(keys)});
    return _places[path] = _paths.size() - 1;
}

std::vector<Ready_Objects::Datum> Ready_Objects::take(const Bag& bag)
{
    std::vector<Datum> data;
    for (const Named_Data* entry = bag.first; entry; entry = entry->next)
        data.push_back(take(kept(entry->name), entry->data.type, entry->data.value));
    return data;
}

Ready_Objects::Datum Ready_Objects::take(const char* name, CMPIType type, const CMPIValue& value)
{
    Datum datum = {.name = name, .type = type, .value = value};
    if (type == CMPI_string) {
        datum.text = kept(text_of(value.string));
    } else if (type == CMPI_dateTime) {
        datum.text = kept(text_of(object_of<Lean_Datetime>(value.dateTime)->text));
    } else if (type == CMPI_ref) {
        datum.path = take_path(value.ref);
    } else if (type & CMPI_ARRAY) {
        const Lean_Array& array = *object_of<Lean_Array>(value.array);
        for (CMPICount i = 0; i < array.count; i++)
            datum.elements.push_back(take(nullptr, array.type, array.elements[i]));
    } else if (!(type & (CMPI_SIMPLE | CMPI_INTEGER | CMPI_REAL))) {
        fprintf(stderr, "bench: the floor knows no data of type %x, which %s has\n", unsigned(type), name);
        exit(1);
    }
    return datum;
}

CMPIValue Ready_Objects::make(Lean_Broker& server, const Datum& datum) const
{
    CMPIValue value = datum.value;
    if (datum.type == CMPI_string) {
        value.string = CMNewString(server.broker(), datum.text, nullptr);
    } else if (datum.type == CMPI_dateTime) {
        value.dateTime = CMNewDateTimeFromChars(server.broker(), datum.text, nullptr);
    } else if (datum.type == CMPI_ref) {
        value.ref = _made[datum.path];
    } else if (datum.type & CMPI_ARRAY) {
        const CMPIType type = datum.type & ~CMPI_ARRAY;
        value.array = CMNewArray(server.broker(), CMPICount(datum.elements.size()), type, nullptr);
        for (CMPICount i = 0; i < datum.elements.size(); i++) {
            const CMPIValue element = make(server, datum.elements[i]);
            CMSetArrayElementAt(value.array, i, &element, type);
        }
    }
    return value;
}

void Ready_Objects::make_path(Lean_Broker& server, size_t place) const
{
    const Path& ready = _paths[place];
    CMPIObjectPath* const path =
        CMNewObjectPath(server.broker(), Lean_Broker::NAME_SPACE, ready.class_name, nullptr);
    for (const Datum& key : ready.keys) {
        const CMPIValue value = make(server, key);
        CMAddKey(path, key.name, &value, key.type);
    }
    _made[place] = path;
}

void Ready_Objects::hand_over(Lean_Broker& server) const
{
    size_t made = 0;
    for (const Delivery& delivery : _deliveries) {
        while (made < delivery.paths_end)
            make_path(server, made++);
        CMPIObjectPath* const path = _made[delivery.path];
        if (!delivery.is_instance) {
            CMReturnObjectPath(server.result(), path);
            continue;
        }
        CMPIInstance* const instance = CMNewInstance(server.broker(), path, nullptr);
        for (const Datum& property : delivery.properties) {
            const CMPIValue value = make(server, property);
            CMSetProperty(instance, property.name, &value, property.type);
        }
        CMReturnInstance(server.result(), instance);
    }
}

void Ready_Objects::make_with_ends(Lean_Broker& server, size_t place) const
{
    for (const Datum& key : _paths[place].keys) {
        if (key.type == CMPI_ref)
            make_with_ends(server, key.path);
    }
    make_path(server, place);
}

CMPIObjectPath* Ready_Objects::path(Lean_Broker& server, size_t place) const
{
    make_with_ends(server, _deliveries[place].path);
    return _made[_deliveries[place].path];
}

} // namespace KPRV::bench
