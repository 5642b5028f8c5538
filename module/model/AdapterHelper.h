#pragma once

#include "module/adapter/Host_Name.h"
#include "module/adapter/classId_t.h"
#include "module/model/Adapter_Data.h"
#include "module/model/Logged_Life.h"
#include "module/runtime/ground/Array.h"
#include "module/runtime/objects/Instance.h"
#include "module/runtime/objects/Wanted.h"
#include "module/schema/KALDERA_AdapterSoftwareIdentity.h"
#include "module/schema/KALDERA_PhysicalPackage.h"
#include "module/schema/KALDERA_PortController.h"
#include "module/schema/KALDERA_Product.h"

#include <json/value.h>

namespace KPRV {

/// Kinds of software, with the numbers that CIM's `Classifications` has for them.
enum softwareType_t : uint32
{
    SOFTWARE_DRIVER = 2,
    SOFTWARE_FIRMWARE = 10,
    SOFTWARE_BIOS = 32770,
};

/// Publishes each adapter as its controller, its card, its product record and the software that runs it.
/// Nothing is kept between calls. Instances belong to the caller; what the tables of the builders do not name
/// is null.
class AdapterHelper
{
public:
    static AdapterHelper* getAdapterHelperInstance();

    /// Walks all adapters for one of the four classes (ids 2, 6, 7 and 8). An adapter that cannot be read, or
    /// has no port, is left out. Exceptions of `libGetAllAdaptersIndexString` and `libGetFlashInfo` pass.
    Array<Instance*> getInstancesByClass(classId_t id, const Wanted& wanted = {}) const;

    // Null for one that is not wanted.

    KALDERA_PortController* getPortControllerInstance(const _adapterData& adapter,
                                                      const Wanted& wanted = {}) const;
    KALDERA_PhysicalPackage* getPhysicalPackageInstance(const _adapterData& adapter,
                                                        const Wanted& wanted = {}) const;
    KALDERA_Product* getProductInstance(const _adapterData& adapter, const Wanted& wanted = {}) const;
    /// `network` matters for a driver only: the network driver or the storage driver.
    KALDERA_AdapterSoftwareIdentity* getAdapterSoftwareIdentityInstance(const _adapterData& adapter,
                                                                        softwareType_t type, bool network,
                                                                        const Wanted& wanted = {}) const;

    /// Vital product data of a card, from `hbaData`: serial, part and FRU number, UUID. Throws
    /// `Not_Convertible`.
    void fillVPDInfo(const Json::Value& hba_data, _adapterData* adapter) const;

private:
    AdapterHelper();

    /// False if the adapter has no port; `number` and `index` name it in the log. Throws `Not_Convertible`.
    bool fill(const Json::Value& answer, int number, const char* index, Host_Name& host,
              _adapterData& adapter) const;
    struct Hba_Members;
    void fill_common(const Json::Value& answer, const Hba_Members& hba, _adapterData& adapter) const;
    void fill_vpd(const Hba_Members& hba, _adapterData& adapter) const;
    void fill_bios(const Json::Value& answer, _adapterData& adapter) const;

    struct Walk;
    void publish(Walk& walk, const String& index, int number) const;
    void publish_software(Walk& walk, const Json::Value& answer, const String& index,
                          _adapterData& adapter) const;

    const Logged_Life _life;
};

} // namespace KPRV
