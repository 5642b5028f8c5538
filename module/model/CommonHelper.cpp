#include "module/model/CommonHelper.h"

#include "module/adapter/ProviderUtil.h"
#include "module/model/Fresh_Instances.h"
#include "module/model/Instance_Building.h"
#include "module/runtime/objects/Ref.h"
#include "module/runtime/system/log.h"

#include <algorithm>
#include <iterator>

namespace KPRV {

namespace {

/// What is said of the host's name, by what its look-up came to.
struct Host_Row
{
    int result;
    const char* name_format; ///< Null: not known.
    const char* description;
    const char* warning; ///< Null: nothing to tell.
};

// clang-format off
constexpr Host_Row rows[] = {
//   result  NameFormat  IdentifyingDescriptions        warning
    {0,      "IP",       "Ipv4 Address",                nullptr},
    {1,      nullptr,    "",                            "IPV6 functionality is yet to be implemented"},
    {2,      "Other",    "Fully Qualified Domain Name", nullptr},
    {3,      "Other",    "Fully Qualified Domain Name", "No host IP / Name  retrived in the function, So function "
                                                        "fills localhost for host info."},
    {4,      "Other",    "Fully Qualified Domain Name", nullptr},
};
// clang-format on
constexpr Host_Row any_other = {-1, nullptr, "", "Entered Default case "};

const Host_Row& row_of(int result)
{
    const auto row = std::ranges::find(rows, result, &Host_Row::result);
    return row == std::end(rows) ? any_other : *row;
}

} // namespace

CommonHelper::CommonHelper() : _life("CommonHelper", LOG_HERE) {}

CommonHelper* CommonHelper::getCommonHelperObject()
{
    static CommonHelper helper;
    return &helper;
}

Array<Instance*> CommonHelper::getComputerSystemInstances(classId_t id, const Wanted& wanted) const
{
    LOG_SCOPE("getComputerSystemInstances");
    char host[255] = {};
    const int result = ProviderUtil::getHostInfo(host, sizeof host);
    Fresh_Instances instances;
    instances.append(getComputerSystemInstance(id, result, host, wanted));
    return instances.release();
}

KALDERA_ComputerSystem* CommonHelper::getComputerSystemInstance(classId_t id, int result, const char* host,
                                                                const Wanted& wanted) const
{
    const Host_Row& row = row_of(result);
    if (row.warning)
        LOG(WARN, "%s", row.warning);
    auto computer = create_wanted(wanted, &KALDERA_ComputerSystem::Name, host);
    if (!computer)
        return nullptr;
    computer->CreationClassName.set(ProviderUtil::getClassName(id));
    computer->Name.set(host);
    if (!wanted.whole())
        return computer.steal();
    const String description = "The host with Kaldera's adapters installed.";
    if (row.name_format)
        computer->NameFormat.set(row.name_format);
    computer->OtherIdentifyingInfo.set(array_of<String>({host}));
    computer->IdentifyingDescriptions.set(array_of<String>({row.description}));
    computer->ElementName.set(description);
    computer->Description.set(description);
    computer->Caption.set(description);
    computer->Dedicated.set(array_of<uint16>({0, 14}));
    computer->OperationalStatus.set(array_of<uint16>({2}));
    computer->StatusDescriptions.set(array_of<String>({"The System is in service"}));
    return computer.steal();
}

} // namespace KPRV
