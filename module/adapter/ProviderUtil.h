#pragma once

#include "module/adapter/classId_t.h"
#include "module/runtime/ground/String.h"

#include <json/value.h>

#include <string>
#include <string_view>

namespace KPRV {

/// Diagnostic tests, 0 to 7, and the messages of diagnostic records, 0 to 35; both go by number.
enum diag_test_id_t : uint32
{
    DIAG_NAME_INVALID = 8
};
enum diag_record_msg_t : uint32
{
    REC_MAX_ID = 36
};

/// The toolbox under the device model: names, address forms, adapter queries, host queries, and the bridge
/// that carries the library's log lines into the module's log.
///
/// An address is a MAC (6 bytes) or a WWN (8 bytes). Its index form, colon-separated pairs, is what the
/// library reads and writes (17 or 23 characters); its flat form, the same digits without colons, is what CIM
/// keys hold.
///
/// There is no state and nothing is cached: each query asks the library anew, from any thread. Failure is -1
/// for an integer, the empty text, or false, with the reason in the log at ERR. The library's exceptions pass
/// through where an operation does not say otherwise. Queries are traced in the log; what only handles text
/// is not.
class ProviderUtil
{
public:
    static ProviderUtil* getProviderUtil();

    // Names. An id beyond the table is told in the log.

    /// "KALDERA_..." of an id; "--" for 0, "INVALID CLASS" from 39 on.
    static const char* getClassName(classId_t id);
    /// "INVALID RECORD ID" from 36 on.
    static const char* getRecordData(diag_record_msg_t id);
    /// "Kaldera:" and the test's name; "INVALID DIAGNOSTIC ID" from 8 on.
    static const char* getDiagTestName(diag_test_id_t id);

    // Address and other text.

    static String eraseColonsFromIndex(const String& text);
    /// Index form of a flat address. What holds a colon comes back as it is, and so do two or three
    /// characters. Throws `No_Address` for less.
    static String getIndexInColonFormat(const String& address);
    /// Six bytes of a flat MAC. Digits that do not parse leave 0.
    static void getRawMacFromStr(const char* text, unsigned char* mac);
    /// Eight bytes of a flat WWN. Digits that do not parse leave 0.
    static void getRawWWNFromStr(const char* text, unsigned char* wwn);
    /// The flat address in the `Tag` of a card: twelve digits if its fourth group is "0000", sixteen
    /// otherwise. The second argument says nothing and is ignored.
    static String getNodeMACOrWWNFromTag(const String& tag, const String& ignored);
    /// Copies without leading and trailing blanks, the character ' ' only. `out` has room for `in`.
    static void trimString(const char* in, char* out);
    static std::string_view trimmed(std::string_view text);
    /// Looks at the first byte alone: true below 0x80 and from 0xC2 to 0xF4.
    static bool valid_UTF_string(const char* text);

    // Adapters. Addresses come in either form unless one is named.

    /// A good answer of the library is neither null nor an object with a member "error".
    static bool isValidJsonResponse(const Json::Value& response);
    /// The guard of the managers: false if the driver is missing or does not match.
    static bool getDriverStatus();
    /// Number of adapters, and the library's answer in `out`, whose `indexStrings` lists their addresses. -1.
    static int getNumberOfAdapters(Json::Value& out);
    /// Address in index form of an adapter; ids start at 1.
    static String getAddrByAdapterId(int id);
    /// 0, and in `out` the answer of `getHbaByWwn`, with its members `hbaData` and `driver`; or -1. Throws
    /// nothing.
    static int getAdapterDetails(const String& address, Json::Value& out);
    /// The maker's own number of an OEM card, without the part number glued to its front; else
    /// `serialNumber`.
    static String getAdapterSerialNumber(const String& address);
    /// `hbaData`.`isCNA`.
    static bool isCNA(const String& address);
    /// `hbaData`.`hasEthPort`.
    static bool hasEthernetPort(const String& address);
    /// Driver version of the first adapter, which stands for the whole host: storage driver before network
    /// driver.
    static String getDriverVersion();
    /// 1 if the model of any adapter is a prefix, in any case, of the text; else 0.
    static int checkIfThisAdapterModelPresent(const char* model);
    /// `adapterId` of the library, or -1.
    static int getAdapterIdByIndexStr(const String& address);
    static int getAdapterIdByMacAddr(const String& mac) { return getAdapterIdByIndexStr(mac); }
    static int getAdapterIdByNWWN(const String& wwn) { return getAdapterIdByIndexStr(wwn); }
    /// Flat form only: 12 or 16 characters.
    static int getAdapterId(const String& address);
    /// The operating system's name of the interface with that MAC: `ethData`.`ethDev`.
    static String getEthDeviceNameByMAC(const String& mac);

    // Host and processes.

    /// Writes the host's first IPv4 address that is no loopback address: 0. Otherwise its name: 2, or 3 for
    /// "localhost" when the host does not know its name, or 4 when it has no domain. `length` counts the
    /// final zero.
    static int getHostInfo(char* buffer, int length);
    /// Node name, "localhost" if there is none.
    static String getHostName();
    /// An object path as a client of this host sees it.
    static String updateNamespacePath(const String& path);
    /// Port of the management agent, 34568, while a process runs whose name ends in its; 0 otherwise.
    static int getAgentPort();
    /// Removes the file from the working folder, then fetches it from the host with the tftp client. Waits;
    /// the result is the client's wait status, or -1.
    static int TftpGetFile(const char* host, const char* file);
    static bool IsFileExist(const char* path);
    /// Callback for the library's log lines.
    static void logMsg(int level, const char* file, int line, const char* text);
};

} // namespace KPRV
