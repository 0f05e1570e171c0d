#include "insight/keys/KeyTables.h"
#include "insight/keys/SubscriptionKeys.h"

// UTRA TDD with 1.28 Mchip/s: one frequency for both directions, time slots, and codes of 16 chips.
namespace kestrum::keys {
namespace {

// clang-format off
constexpr KeyEntry kRrcInfo[] = {
    {"State", "RRC", State, kPlain, "3GPP TS 25.331, 7",
     "The state of the radio connection. In CELL_DCH the phone has a dedicated channel, in CELL_FACH it shares one, in "
     "CELL_PCH and URA_PCH it only listens to paging. \"Disconnected\" is idle mode."},
};

constexpr KeyEntry kServingCellInfo[] = {
    {"Cell Scrambling Code", "Code", Identity, kPlain, "3GPP TS 25.223",
     "The cell parameter of the serving cell, 0 to 127. It selects the cell's scrambling code and its basic midamble.",
     fromCellParameter, kIdentity},
    {"Downlink UARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.102, 5.4",
     "The channel number of the cell: five times its frequency in MHz. In TDD both directions use it.",
     fromTddUarfcn, kIdentity},
    {"Uplink UARFCN", "UL UARFCN", Identity, kPlain, "3GPP TS 25.102, 5.4",
     "The channel number of the uplink. In TDD it is that of the downlink.",
     fromTddUarfcn},
    {"Cell ID", "Cell", Identity, kPlain, "3GPP TS 25.331, 10.3.2.2; TS 25.401, 6.1",
     "The 28-bit identity of the cell, unique in its network: 12 bits of the RNC and 16 of its cell. With an extended "
     "RNC identity it is 16 and 12 bits.",
     fromUtranCellIdentity},
    {"Local Area Code", "LAC", Identity, kPlain, "3GPP TS 23.003, 4.1",
     "The location area of the cell. The phone registers again when it enters another one.",
     inHexadecimal},
    {"URA ID", "URA", Identity, kPlain, "3GPP TS 25.331, 10.3.2.6",
     "The UTRAN registration area. In URA_PCH the network pages the phone in all cells of this area."},
    {"Freq Band Indicator", "Band", Number, kPlain, "",
     "The frequency band of the cell, as the telephony service numbers it."},
    {"Cell Access Restrictions", "Restrictions", Number, kPlain, "3GPP TS 25.331, 10.3.2.1",
     "The cell's restriction of access, as a number of the modem. 0: no restriction."},
    {"Allowed Access", "Access", State, kPlain, "3GPP TS 25.304, 4.3",
     "Whether the cell allows all calls, or emergency calls only."},
};

constexpr KeyEntry kNeighborCellList[] = {
    {"Cell ID", "Code", Identity, kPlain, "3GPP TS 25.223",
     "The cell parameter of the neighbour, 0 to 127, which selects its scrambling code. It is not a cell identity of the "
     "network.",
     fromCellParameter, kIdentity},
    {"UARFCN", "UARFCN", Identity, kPlain, "3GPP TS 25.102, 5.4",
     "The channel number of the neighbour: five times its frequency in MHz.",
     fromTddUarfcn, kIdentity},
    {"Filter RSCP", "RSCP", Number, {.scale = Scale{0, 1}}, "3GPP TS 25.225, 5.1.1",
     "The filtered received power of the neighbour's primary common channel (P-CCPCH), as the modem's number divided by "
     "256. It has no offset and no unit, so it serves only to compare cells.",
     nullptr, kSortsRows},
    {"Status", "Set", State, kPlain, "3GPP TS 25.331, 8.4",
     "ASET: active set, the cell in use. MSET: monitored set, the neighbours that the network named. DSET: detected set, cells that the "
     "modem found by itself."},
    {"inJDCS", "Joint det.", State, kPlain, "",
     "Whether the modem includes the cell in joint detection, which removes its interference."},
};

constexpr KeyEntry kTrchBler[] = {
    {"TRCH ID", "Channel", Identity, kPlain, "3GPP TS 25.331, 10.3.5.18",
     "The identity of the transport channel.",
     nullptr, kIdentity},
    {"TRCH BLER Measurement", "BLER", Number, kPlain, "3GPP TS 25.225, 5.1",
     "The block error rate of the transport channel, as a number of the modem without a unit. Less is better."},
};

constexpr KeyEntry kCctrchSir[] = {
    {"CCTRCH ID", "Channel", Identity, kPlain, "3GPP TS 25.221",
     "The identity of the coded composite transport channel.",
     nullptr, kIdentity},
    {"TSNUM", "Slots", Number, kPlain, "3GPP TS 25.221",
     "The time slots of the channel, as the modem logs them."},
    {"SIR", "SIR", Number, kPlain, "3GPP TS 25.225, 5.1",
     "The ratio of signal to interference, six numbers of the modem without a unit. More is better."},
};

constexpr SectionEntry kSections[] = {
    {"RRC Info", "The state of radio resource control.", kRrcInfo},
    {"Serving Cell Info", "The cell on which the phone camps, or to which it is connected.", kServingCellInfo},
    {"Neighbor Cell List", "The cells that the modem measured last, the serving cell among them.", kNeighborCellList},
    {"GSM Neighbor Cell List", "Stays empty: the decoder does not read the modem's list of GSM neighbours.", {}},
    {"TRCH BLER", "The block error rate of each transport channel.", kTrchBler},
    {"CCTRCH SIR", "The signal-to-interference ratio of each coded composite transport channel.", kCctrchSir},
    kSimInfo,
    kPdpContexts,
};
// clang-format on

} // namespace

constinit const std::span<const SectionEntry> kUtran = kSections;

} // namespace kestrum::keys
