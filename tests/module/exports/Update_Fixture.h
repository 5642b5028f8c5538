#pragma once

#include "module/runtime/ground/Types.h"
#include "tests/module/exports/Module_Fixture.h"
#include "tests/support/Working_Folder.h"

namespace KPRV {

/// Asks the service of the module for updates, from a working folder of the test's own.
class Update_Fixture : public Module_Fixture
{
protected:
    static constexpr const char* ADAPTER = "2000024b4c100000";
    static constexpr const char* INDEX = "20:00:02:4b:4c:10:00:00";

    void SetUp() override
    {
        Module_Fixture::SetUp();
        open();
        service = server->enumerate_instance_names("KALDERA_HBASoftwareInstallationService").paths.at(0);
        target = controller(ADAPTER);
        mark();
    }

    broker::Path_Value controller(const std::string& device_id)
    {
        const broker::Result all = server->enumerate_instance_names("KALDERA_PortController");
        for (const broker::Path_Value& path : all.paths) {
            if (path.key("DeviceID")->as_text() == device_id)
                return path;
        }
        throw std::invalid_argument("no controller " + device_id);
    }

    static broker::Plain_Value options(std::initializer_list<uint16> list)
    {
        std::vector<broker::Plain_Value> elements;
        for (const uint16 each : list)
            elements.push_back(broker::Plain_Value::unsigned_number(CMPI_uint16, each));
        return broker::Plain_Value::array(CMPI_uint16, elements);
    }
    std::vector<broker::Named_Value> arguments(const std::string& uri,
                                               const broker::Plain_Value& install_options)
    {
        return {{"URI", broker::Plain_Value::text(uri)},
                {"Target", broker::Plain_Value::path(target)},
                {"InstallOptions", install_options}};
    }

    /// The method's return value, from a call that must succeed and give nothing else.
    uint32 call(const std::vector<broker::Named_Value>& in)
    {
        mark();
        const broker::Result result = server->invoke_method(service, "InstallFromURI", in);
        EXPECT_EQ(CMPI_RC_OK, result.rc) << result.message;
        EXPECT_EQ(CMPI_uint32, result.return_value.type);
        EXPECT_FALSE(result.return_value.null);
        for (const broker::Named_Value& out : result.out)
            EXPECT_TRUE(out.value.null) << out.name;
        return static_cast<uint32>(result.return_value.as_uint());
    }
    uint32 install(const std::string& uri) { return call(arguments(uri, options({5}))); }

    /// What the sources of an update have said since the mark, in order.
    Lines told_of_update() const
    {
        return told(log_lines(), [](const Log_Line& line) {
            return line.file == "KALDERA_HBASoftwareInstallationService_Provider.cpp" ||
                   line.file == "Firmware_Uri.cpp" || line.file == "SoftwareUpdateHelper.cpp";
        });
    }
    /// The lines of a call that failed.
    static Lines failing(Lines said, const char* text)
    {
        said.insert(said.begin(), "DBG Entering: InstallFromURI");
        said.push_back(std::string("DBG InstallFromURI : ERROR - ") + text);
        said.push_back("DBG return value = 2");
        said.push_back("DBG Returning: InstallFromURI");
        return said;
    }
    void expect_failure(const std::vector<broker::Named_Value>& in, const Lines& said, const char* text)
    {
        EXPECT_EQ(2u, call(in));
        EXPECT_EQ(failing(said, text), told_of_update());
    }
    /// A refusal for which neither the library nor anything else is asked.
    void expect_refusal(const std::vector<broker::Named_Value>& in, const Lines& said, const char* text)
    {
        expect_failure(in, said, text);
        EXPECT_TRUE(simulator.call_names().empty());
    }

    /// The library's calls that any search for a controller makes.
    Lines calls_of_a_search()
    {
        mark();
        enumerate("KALDERA_PortController");
        return simulator.call_names();
    }
    Lines calls_of_an_update()
    {
        Lines calls = calls_of_a_search();
        calls.push_back("adapterUpdateFlash");
        return calls;
    }
    /// What the helper says of an update and of its outcome.
    static Lines of_helper(const std::string& file, const char* outcome)
    {
        return {"DBG Entering: UpdatePortControllerSoftware",
                "DBG UpdatePortControllerSoftware portType=4 deviceid=" + std::string(ADAPTER) +
                    " file=" + file,
                outcome, "DBG Returning: UpdatePortControllerSoftware"};
    }

    Json::Value request(const std::string& file) const
    {
        Json::Value value;
        value["indexStr"] = INDEX;
        value["file"] = file;
        return value;
    }
    /// Firmware that a client sees at the adapter.
    std::string firmware()
    {
        for (const broker::Instance_Value& each : enumerate("KALDERA_AdapterSoftwareIdentity").instances) {
            const std::string id = text_of(each, "InstanceID");
            const broker::Plain_Value* kinds = each.property("Classifications");
            if (id.find(ADAPTER) != std::string::npos && kinds && kinds->elements().size() == 1 &&
                kinds->elements()[0].as_uint() == 10)
                return text_of(each, "VersionString");
        }
        return "(none)";
    }

    Working_Folder folder;
    broker::Path_Value service;
    broker::Path_Value target;
};

} // namespace KPRV
