#include "LogGenerator/ZPH_GSM/GPRSInformation.h"
#include "LogGenerator/ZPH_GSM/GSMRRInfo.h"
#include "LogGenerator/ZPH_GSM/HSDPAInformation.h"
#include "LogGenerator/ZPH_GSM/ProcessCO.h"
#include "LogGenerator/ZPH_GSM/ProcessCS.h"
#include "LogGenerator/ZPH_GSM/ProcessPS.h"
#include "LogGenerator/ZPH_GSM/ServingPLMN.h"
#include "LogGenerator/ZPH_GSM/UMTSRRInfo.h"
#include "sections/DecodedSection.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

template <typename Section, LogCode code, std::size_t length, std::size_t offset>
Value shownFor(const char* key, unsigned raw)
{
    return decoded<Section>(record(code, length).u8(offset, raw)).at(key);
}

/// The name of a raw value on the display.
struct Name {
    unsigned value;
    const char* text;
};

/// A byte of a record, the key that shows it, and all of its names. Values that are not listed have the name
/// `others`.
struct Names {
    const char* of;
    Value (*shown)(const char* key, unsigned raw);
    const char* key;
    std::vector<Name> listed;
    const char* others = "Unknown";

    friend void PrintTo(const Names& names, std::ostream* out) { *out << names.of; }
};

class StateNames : public testing::TestWithParam<Names> {};

TEST_P(StateNames, AreShownForEachOfThe256Values)
{
    const auto& names = GetParam();
    std::vector<std::string> expected(256, names.others);
    for (const auto& [value, text] : names.listed)
        expected[value] = text;
    for (unsigned value = 0; value < 256; ++value)
        EXPECT_EQ(names.shown(names.key, value), Value(expected[value])) << "value " << value;
}

const std::vector<Name> kMm = {
    {0, "MM_NULL"},
    {1, "Unknown"},
    {2, "Unknown"},
    {3, "MM_LOCATION_UPDATE_INITIATED"},
    {4, "Unknown"},
    {5, "MM_WAIT_FOR_OUTGOING_MM_CONNECTION"},
    {6, "MM_CONNECTION_ACTIVE"},
    {7, "MM_IMSI_DETACH_INITIATED"},
    {8, "MM_PROCESS_CM_SERVICE_PROMPT"},
    {9, "MM_WAIT_FOR_NETWORK_COMMAND"},
    {10, "MM_LOCATION_UPDATE_REJECTED"},
    {11, "Unknown"},
    {12, "Unknown"},
    {13, "MM_WAIT_FOR_RR_CONNECTION_LU"},
    {14, "MM_WAIT_FOR_RR_CONNECTION_MM"},
    {15, "MM_WAIT_FOR_RR_CONNECTION_IMSI_DETACH"},
    {16, "Unknown"},
    {17, "MM_REESTABLISHMENT_INITIATED"},
    {18, "MM_WAIT_FOR_RR_ACTIVE"},
    {19, "MM_IDLE"},
    {20, "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION"},
    {21, "MM_WAIT_FOR_RR_CONNECTION_ REESTABLISHMENT"},
    {22, "MM_WAIT_FOR_REESTABLISH_DECISION"},
    {23, "MM_LOCATION_UPDATING_PENDING"},
    {24, "Unknown"},
    {25, "MM_RR_CONNECTION_RELEASE_NOT_ALLOWED"},
};
const std::vector<Name> kMmSub = {
    {0, "MM_NULL_SUBSTATE"},        {1, "MM_NO_IMSI"},
    {2, "MM_PLMN_SEARCH"},          {3, "MM_LIMITED_SERVICE"},
    {4, "MM_ATTEMPTING_TO_UPDATE"}, {5, "MM_LOCATION_UPDATE_NEEDED"},
    {6, "MM_NO_CELL_AVAILABLE"},    {7, "MM_PLMN_SEARCH_NORMAL_SERVICE"},
    {8, "MM_NORMAL_SERVICE"},
};
const std::vector<Name> kLu = {
    {0, "UPDATED"}, {1, "NOT_UPDATED"}, {2, "ROAMING_NOT_ALLOWED"}, {3, "LOCATION_AREA_NOT_ALLOWED"}};
const std::vector<Name> kGmm = {
    {0, "GMM_NULL"},
    {1, "GMM_DEREGISTERED"},
    {2, "GMM_REGISTERED_INITIATED"},
    {3, "GMM_REGISTERED"},
    {4, "GMM_DEREGISTERED_INITIATED"},
    {5, "GMM_ROUTING_AREA_UPDATE_INITIATED"},
    {6, "GMM_SERVICE_REQUEST_INITIATED"},
};
const std::vector<Name> kGmmSub = {
    {0, "GMM_NORMAL_SERVICE"},
    {1, "GMM_LIMITED_SERVICE"},
    {2, "GMM_ATTACH_NEEDED"},
    {3, "GMM_ATTEMPTING_TO_ATTACH"},
    {4, "GMM_NO_IMSI"},
    {5, "GMM_NO_CELL_AVAILABLE"},
    {6, "GMM_PLMN_SEARCH"},
    {7, "GMM_SUSPENDED"},
    {8, "GMM_UPDATE_NEEDED"},
    {9, "GMM_ATTEMPING_TO_UPDATE"},
    {10, "GMM_ATTEMPTING_TO_UPDATE_MM"},
    {11, "GMM_IMSI_DETACH_INITIATED"},
    {12, "GMM_NULL_SUBSTATE"},
};
const std::vector<Name> kGmmUpdate = {{0, "GMM_GU1_UPDATED"},
                                      {1, "GMM_GU2_NOT_UPDATED"},
                                      {2, "GMM_GU3_PLMN_NOT_ALLOWED"},
                                      {3, "GMM_GU3_ROUTING_AREA_NOT_ALLOWED"}};
const std::vector<Name> kRegistration = {
    {0, "REG_STATE_INACTIVE"},      {1, "REG_STATE_IDLE"},          {2, "REG_STATE_REGISTERING"},
    {3, "REG_STATE_DEREGISTERING"}, {4, "REG_STATE_MANUAL_SEARCH"}, {5, "REG_STATE_AUTOMATIC_SEARCH"},
    {6, "REG_STATE_OFFLINE"},
};

INSTANTIATE_TEST_SUITE_P(
    NonAccessStratum, StateNames,
    testing::Values(
        Names{"MmState", shownFor<ProcessCS, 0x7131, 16, 13>, "MM State", kMm},
        Names{"MmStateInBrief", shownFor<ProcessCO, 0x7131, 16, 13>, "MM State", kMm},
        Names{"MmSubstate", shownFor<ProcessCS, 0x7131, 16, 14>, "MM Sub State", kMmSub},
        Names{"LocationUpdateStatus", shownFor<ProcessCS, 0x7131, 16, 15>, "LU Reject Cause", kLu},
        Names{"GmmState", shownFor<ProcessPS, 0x7130, 16, 13>, "MM State", kGmm},
        Names{"GmmSubstate", shownFor<ProcessPS, 0x7130, 16, 14>, "MM Sub State", kGmmSub},
        Names{"GmmUpdateStatus", shownFor<ProcessPS, 0x7130, 16, 15>, "Attach Reject Cause", kGmmUpdate},
        Names{"RegistrationOfCs", shownFor<ProcessCS, 0x7132, 16, 13>, "MM Service State", kRegistration},
        Names{"RegistrationOfCo", shownFor<ProcessCO, 0x7132, 16, 13>, "MM Service State", kRegistration},
        Names{"RegistrationOfPs", shownFor<ProcessPS, 0x7132, 16, 13>, "MM Service State", kRegistration},
        Names{"PlmnSelection",
              shownFor<ServingPLMN, 0x7132, 16, 14>,
              "PLMN Sel Mod",
              {{0, "Automatic"}, {1, "Manual"}, {2, "Limited"}, {3, "LIMITED_ROUTINE_ACQ"}, {4, "LIMITED_MANUAL_ACQ"}}},
        Names{"ServiceType",
              shownFor<ServingPLMN, 0x7135, 32, 14>,
              "Service Type",
              {{0, "NO_SERVICE"}, {1, "CS_ONLY"}, {2, "PS_ONLY"}, {3, "CS_PS_SERVICE"}, {4, "LIMITED_SERVICE"}}}),
    [](const auto& each) { return std::string(each.param.of); });

INSTANTIATE_TEST_SUITE_P(
    Gsm, StateNames,
    testing::Values(Names{"RrState",
                          shownFor<GSMRRInfo, 0x512C, 17, 13>,
                          "RR State",
                          {{0, "RR_INACTIVE"},
                           {1, "RR_GOING_ACTIVE"},
                           {2, "RR_GOING_INACTIVE"},
                           {3, "RR_CELL_SELECTION"},
                           {4, "RR_PLMN_LIST_CONSTRUCTION"},
                           {5, "RR_IDLE"},
                           {6, "RR_CELL_RESELECTION"},
                           {7, "RR_CONNECTION_PENDING"},
                           {8, "RR_CHOOSE_CELL"},
                           {9, "RR_DATA_TRANSFER"},
                           {10, "RR_NO_CHANNELS"},
                           {11, "RR_CONNECTION_RELEASE"},
                           {12, "RR_EARLY_CAMPED_WAIT_FOR_SI"},
                           {13, "RR_W2G_INTERRAT_HANDOVER_ PROGRESS"},
                           {14, "RR_W2G_INTERRAT_RESELECTION_PROGRESS"},
                           {15, "RR_WAIT_FOR_EARLY_PSCAN"},
                           {16, "GRR51"},
                           {17, "GRR52"},
                           {18, "RR_G2W_INTERRAT_RESELECTION_PROGRESS"},
                           {19, "RR_G2W_INTERRAT_HANDOVER_ PROGRESS"},
                           {20, "RR_CELL_REEST"},
                           {21, "RR_W2G_INTERRAT_CC_ORDER_ PROGRESS"}}},
                    Names{"RrMode", shownFor<GSMRRInfo, 0x512C, 17, 16>, "RR Mode", {{0, "Voice"}}, "Data"},
                    Names{"Dtx", shownFor<GSMRRInfo, 0x5072, 20, 19>, "DTX Used", {{0, "OFF"}}, "ON"},
                    Names{"Si13Position",
                          shownFor<GPRSInformation, 0x51F4, 15, 14>,
                          "SI13 Position",
                          {{0, "Located on BCCH"}, {1, "Located on Extended BCCH"}, {255, "Not Available"}}},
                    Names{"NetworkControlOrder",
                          shownFor<GPRSInformation, 0x51F5, 18, 15>,
                          "Network Control Order",
                          {{0, "NC0"}, {1, "NC1"}, {2, "NC2"}, {255, "Not Available"}}},
                    Names{"PacketFlowContext",
                          shownFor<GPRSInformation, 0x51F5, 18, 13>,
                          "PFC Supported",
                          {{0, "Not Supported"}, {1, "Supported"}, {255, "Available"}}},
                    Names{"PriorityAccess",
                          shownFor<GPRSInformation, 0x51F5, 18, 14>,
                          "Priority Access Threshold",
                          {{0, "Barred (PKT access not allowed in the Cell)"},
                           {1, "Barred"},
                           {2, "Barred"},
                           {3, "1 Only"},
                           {4, "1 to 2"},
                           {5, "1 to 3"},
                           {6, "1 to 4"},
                           {7, "Allowed"},
                           {255, "Not Available"}}},
                    Names{"T3192",
                          shownFor<GPRSInformation, 0x51F6, 24, 15>,
                          "T3192",
                          {{0, "500 ms"},
                           {1, "1000 ms"},
                           {2, "1500 ms"},
                           {3, "0 ms"},
                           {4, "80 ms"},
                           {5, "120 ms"},
                           {6, "160 ms"},
                           {7, "200 ms"}},
                          "?? ms"},
                    Names{"AccessBurst",
                          shownFor<GPRSInformation, 0x51F6, 24, 17>,
                          "Access Burst Type",
                          {{0, "8-bit format"}},
                          "11-bit format"},
                    Names{"PacketSi",
                          shownFor<GPRSInformation, 0x51FD, 35, 33>,
                          "Packet SI Status",
                          {{0, "Not Supported"}},
                          "Supported"},
                    Names{"OperatingMode",
                          shownFor<GPRSInformation, 0x7135, 32, 13>,
                          "Network Operating Mode",
                          {{0, "Class 1"}, {1, "Class 2"}, {2, "Class 3"}}},
                    Names{"Hysteresis",
                          shownFor<GPRSInformation, 0x5137, 29, 26>,
                          "Cell Reselect Hysteresis",
                          {{0, "Not Applied"}},
                          "Applied"}),
    [](const auto& each) { return std::string(each.param.of); });

INSTANTIATE_TEST_SUITE_P(
    Umts, StateNames,
    testing::Values(Names{"RrcState",
                          shownFor<UMTSRRInfo, 0x4125, 14, 13>,
                          "RRC State",
                          {{0, "Disconnected"},
                           {1, "Connecting"},
                           {2, "CELL_FACH"},
                           {3, "CELL_DCH"},
                           {4, "CELL_PCH"},
                           {5, "URA_PCH"}}},
                    Names{
                        "Ciphering", shownFor<UMTSRRInfo, 0x4157, 19, 13>, "Ciphering", {{0, "Disabled"}}, "Enabled"}),
    [](const auto& each) { return std::string(each.param.of); });

TEST(HsdpaCarrier, IsNamedByTwoBits)
{
    const char* const names[] = {"Single Carrier", "MIMO", "Dual Carrier", "Reserved"};
    for (unsigned raw = 0; raw < 256; ++raw)
        EXPECT_EQ((shownFor<HSDPAInformation, 0x4221, 18, 15>("Carrier Info", raw)), Value(names[raw / 4 % 4])) << raw;
}

} // namespace
} // namespace kestrum
