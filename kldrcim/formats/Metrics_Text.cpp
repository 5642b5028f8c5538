#include "kldrcim/formats/Metrics_Text.h"

#include "kldrcim/formats/Node_Label.h"
#include "kldrcim/walks/Health_Plan.h"
#include "kldrcim/walks/Property_Values.h"

namespace KPRV::kldrcim {

namespace {

/// A family with how its samples are made: for each of one kind of thing.
struct Row
{
    Metric_Family family;
    void (*of_adapter)(Exposition& text, const Adapter_Facts& adapter) = nullptr;
    void (*of_port)(Exposition& text, const Port_Facts& port) = nullptr;
    void (*of_target)(Exposition& text, const Port_Facts& port, const Target_Facts& target) = nullptr;
    /// Property of the port's statistics that is the sample.
    const char* statistic = nullptr;
    /// What the transceiver measures that is the sample.
    std::optional<double> Optics_Readings::*reading = nullptr;
};

std::string address_of(const Instance_Value& device)
{
    return colon_form(text_of(device, "DeviceID"));
}

Labels labels_of(const Adapter_Facts& adapter)
{
    return {{"adapter", address_of(adapter.controller)}};
}

Labels labels_of(const Port_Facts& port)
{
    return {{"port", address_of(port.port)}};
}

Labels labels_of(const Port_Facts& port, const Target_Facts& target)
{
    return {{"port", address_of(port.port)}, {"target", colon_form(target.address)}};
}

void add_status(Exposition& text, const Labels& labels, const Instance_Value& element)
{
    if (const auto status = number_of(element, "OperationalStatus"))
        text.add(labels, *status);
}

void add_service(Exposition& text, const Labels& labels, const Instance_Value& element)
{
    if (const auto status = number_of(element, "OperationalStatus"))
        text.add(labels, std::uint64_t(is_in_service(*status)));
}

/// Bits a second as bytes a second; unknown ones are left out.
void add_speed(Exposition& text, const Port_Facts& port, const char* property)
{
    if (const auto bits = number_of(port.port, property); bits && *bits != 0)
        text.add(labels_of(port), *bits / 8);
}

void add_adapter_info(Exposition& text, const Adapter_Facts& adapter)
{
    Labels labels = labels_of(adapter);
    labels.insert(labels.end(), {{"serial", text_of(adapter.controller, "Name")},
                                 {"model", adapter.model()},
                                 {"description", text_of(adapter.controller, "Description")},
                                 {"firmware", adapter.firmware()}});
    text.add(labels, std::uint64_t(1));
}

void add_software_info(Exposition& text, const Adapter_Facts& adapter)
{
    for (const Instance_Value& software : adapter.software) {
        Labels labels = labels_of(adapter);
        labels.insert(labels.end(), {{"name", text_of(software, "InstanceID")},
                                     {"kind", node_label({Node_Kind::SOFTWARE, software}).what},
                                     {"version", text_of(software, "VersionString")}});
        text.add(labels, std::uint64_t(1));
    }
}

void add_port_info(Exposition& text, const Adapter_Facts& adapter)
{
    for (const Port_Facts& port : adapter.ports) {
        Labels labels = labels_of(port);
        labels.insert(labels.end(),
                      {{"adapter", address_of(adapter.controller)},
                       {"kind", port.is_ethernet ? "ethernet" : "fc"},
                       {"number", std::to_string(number_of(port.port, "PortNumber").value_or(0))},
                       {"name", text_of(port.port, port.is_ethernet ? "ElementName" : "Caption")}});
        text.add(labels, std::uint64_t(1));
    }
}

void add_adapter_service(Exposition& text, const Adapter_Facts& adapter)
{
    add_service(text, labels_of(adapter), adapter.controller);
}

void add_adapter_status(Exposition& text, const Adapter_Facts& adapter)
{
    add_status(text, labels_of(adapter), adapter.controller);
}

void add_port_service(Exposition& text, const Port_Facts& port)
{
    add_service(text, labels_of(port), port.port);
}

void add_port_status(Exposition& text, const Port_Facts& port)
{
    add_status(text, labels_of(port), port.port);
}

void add_port_speed(Exposition& text, const Port_Facts& port)
{
    add_speed(text, port, "Speed");
}

void add_port_max_speed(Exposition& text, const Port_Facts& port)
{
    add_speed(text, port, "MaxSpeed");
}

void add_port_targets(Exposition& text, const Port_Facts& port)
{
    if (!port.is_ethernet)
        text.add(labels_of(port), std::uint64_t(port.targets.size()));
}

void add_port_units(Exposition& text, const Port_Facts& port)
{
    std::uint64_t units = 0;
    for (const Target_Facts& target : port.targets)
        units += target.units;
    if (!port.is_ethernet)
        text.add(labels_of(port), units);
}

void add_target_service(Exposition& text, const Port_Facts& port, const Target_Facts& target)
{
    add_service(text, labels_of(port, target), target.endpoint);
}

void add_target_status(Exposition& text, const Port_Facts& port, const Target_Facts& target)
{
    add_status(text, labels_of(port, target), target.endpoint);
}

void add_target_units(Exposition& text, const Port_Facts& port, const Target_Facts& target)
{
    text.add(labels_of(port, target), std::uint64_t(target.units));
}

constexpr Row info(const char* name, const char* help, decltype(Row::of_adapter) add)
{
    return {.family = {name, Metric_Type::INFO, help}, .of_adapter = add};
}

constexpr Row adapter_gauge(const char* name, const char* help, decltype(Row::of_adapter) add)
{
    return {.family = {name, Metric_Type::GAUGE, help}, .of_adapter = add};
}

constexpr Row port_gauge(const char* name, const char* help, decltype(Row::of_port) add)
{
    return {.family = {name, Metric_Type::GAUGE, help}, .of_port = add};
}

constexpr Row port_counter(const char* name, const char* help, const char* statistic)
{
    return {.family = {name, Metric_Type::COUNTER, help}, .statistic = statistic};
}

constexpr Row port_reading(const char* name, const char* help, decltype(Row::reading) reading)
{
    return {.family = {name, Metric_Type::GAUGE, help}, .reading = reading};
}

constexpr Row target_gauge(const char* name, const char* help, decltype(Row::of_target) add)
{
    return {.family = {name, Metric_Type::GAUGE, help}, .of_target = add};
}

using Readings = Optics_Readings;

// clang-format off
constexpr Row metric_rows[] = {
    info("kldr_adapter_info", "An adapter: its card, and the version of its firmware.", add_adapter_info),
    info("kldr_software_info", "Driver, firmware or BIOS of an adapter.", add_software_info),
    adapter_gauge("kldr_adapter_in_service", "1 if the adapter is in service, otherwise 0.", add_adapter_service),
    adapter_gauge("kldr_adapter_operational_status", "OperationalStatus of the adapter, as the CIM Schema numbers it.", add_adapter_status),
    info("kldr_port_info", "A port: its adapter, its kind, its number there and its name.", add_port_info),
    port_gauge("kldr_port_in_service", "1 if the port is in service, otherwise 0.", add_port_service),
    port_gauge("kldr_port_operational_status", "OperationalStatus of the port, as the CIM Schema numbers it.", add_port_status),
    port_gauge("kldr_port_speed_bytes", "Speed of the link of an FC port, in bytes per second.", add_port_speed),
    port_gauge("kldr_port_max_speed_bytes", "The most that the FC port can do, in bytes per second.", add_port_max_speed),
    port_gauge("kldr_port_targets", "Targets that the FC port sees.", add_port_targets),
    port_gauge("kldr_port_logical_units", "Logical units that the FC port sees, behind all targets.", add_port_units),
    port_counter("kldr_port_transmit_bytes_total", "Bytes sent.", "BytesTransmitted"),
    port_counter("kldr_port_receive_bytes_total", "Bytes received.", "BytesReceived"),
    port_counter("kldr_port_transmit_frames_total", "Frames sent.", "PacketsTransmitted"),
    port_counter("kldr_port_receive_frames_total", "Frames received.", "PacketsReceived"),
    port_counter("kldr_port_lips_total", "Loop initialization primitives.", "LIPCount"),
    port_counter("kldr_port_nos_total", "Not operational sequences.", "NOSCount"),
    port_counter("kldr_port_error_frames_total", "Frames in error.", "ErrorFrames"),
    port_counter("kldr_port_dumped_frames_total", "Frames that were dropped.", "DumpedFrames"),
    port_counter("kldr_port_link_failures_total", "Failures of the link.", "LinkFailures"),
    port_counter("kldr_port_signal_losses_total", "Losses of the signal.", "LossOfSignalCounter"),
    port_counter("kldr_port_sync_losses_total", "Losses of synchronization.", "LossOfSyncCounter"),
    port_counter("kldr_port_primitive_sequence_errors_total", "Errors in the protocol of primitive sequences.", "PrimitiveSeqProtocolErrCount"),
    port_counter("kldr_port_crc_errors_total", "Frames with a wrong checksum.", "CRCErrors"),
    port_counter("kldr_port_invalid_words_total", "Invalid transmission words.", "InvalidTransmissionWords"),
    port_reading("kldr_port_temperature_celsius", "Temperature of the transceiver.", &Readings::celsius),
    port_reading("kldr_port_supply_volts", "Supply voltage of the transceiver.", &Readings::volts),
    port_reading("kldr_port_laser_bias_amperes", "Bias current of the laser.", &Readings::amperes),
    port_reading("kldr_port_transmit_power_watts", "Optical power sent.", &Readings::transmit_watts),
    port_reading("kldr_port_receive_power_watts", "Optical power received.", &Readings::receive_watts),
    target_gauge("kldr_target_in_service", "1 if the target is in service as the port sees it, otherwise 0.", add_target_service),
    target_gauge("kldr_target_operational_status", "OperationalStatus of the target's endpoint, as the CIM Schema numbers it.", add_target_status),
    target_gauge("kldr_target_logical_units", "Logical units of the target that the port sees.", add_target_units),
};
// clang-format on

// Of the reading itself; they come last.
constexpr Metric_Family module_family = {"kldr_module_info", Metric_Type::INFO,
                                         "The version of the provider module."};
constexpr Metric_Family failures_family = {"kldr_collect_failures", Metric_Type::GAUGE,
                                           "Classes that did not answer when this was read."};
constexpr Metric_Family seconds_family = {"kldr_collect_seconds", Metric_Type::GAUGE,
                                          "How long it took to read this."};

void add_samples(Exposition& text, const Row& row, const Port_Facts& port)
{
    if (row.of_port)
        row.of_port(text, port);
    if (row.of_target)
        for (const Target_Facts& target : port.targets)
            row.of_target(text, port, target);
    if (row.statistic)
        if (const auto count = number_of(port.statistics, row.statistic))
            text.add(labels_of(port), *count);
    if (row.reading)
        if (const auto value = port.optics.*row.reading)
            text.add(labels_of(port), *value);
}

void add_samples(Exposition& text, const Row& row, const Host_Facts& host)
{
    text.begin(row.family);
    for (const Adapter_Facts& adapter : host.adapters) {
        if (row.of_adapter)
            row.of_adapter(text, adapter);
        for (const Port_Facts& port : adapter.ports)
            add_samples(text, row, port);
    }
}

} // namespace

std::vector<Metric_Family> metric_families()
{
    std::vector<Metric_Family> families;
    for (const Row& row : metric_rows)
        families.push_back(row.family);
    families.insert(families.end(), {module_family, failures_family, seconds_family});
    return families;
}

std::string metrics_text(const Host_Readings& readings, Metrics_Notation notation)
{
    Exposition text(notation);
    for (const Row& row : metric_rows)
        add_samples(text, row, readings.host);
    text.begin(module_family);
    for (const std::string& version : readings.module_versions)
        text.add({{"version", version}}, std::uint64_t(1));
    text.begin(failures_family);
    text.add({}, std::uint64_t(readings.failures.size()));
    text.begin(seconds_family);
    text.add({}, readings.seconds);
    return text.text();
}

} // namespace KPRV::kldrcim
