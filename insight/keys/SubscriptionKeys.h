#pragma once

#include "insight/keys/KeyTables.h"

/// Inside insight/keys: the sections of the subscription, which LTE, UTRAN and GSM have.
namespace kestrum::keys {

// clang-format off
inline constexpr KeyEntry kSimInfoKeys[] = {
    {"EF-ICCID", "ICCID", Identity, kPlain, "ETSI TS 102 221, 13.2",
     "The serial number of the SIM card. It identifies the subscriber's card: think before you pass it on."},
    {"EF-MSISDN", "Number", Identity, kPlain, "3GPP TS 31.102, EF MSISDN",
     "The telephone number that is stored on the card. It need not be the current one."},
    {"EF-LOCI", "LOCI", Text, kPlain, "3GPP TS 31.102, EF LOCI",
     "The location information of the circuit-switched domain: TMSI, location area and update status, as stored bytes."},
    {"EF-GPRS/PS-LOCI", "PSLOCI", Text, kPlain, "3GPP TS 31.102, EF PSLOCI",
     "The location information of the packet-switched domain: P-TMSI, its signature, routing area and update status, as "
     "stored bytes."},
    {"EF-FPLMN", "FPLMN", Text, kPlain, "3GPP TS 31.102, EF FPLMN",
     "The forbidden networks, three bytes each. The phone does not try to register there by itself."},
    {"EF-ACTING HPLMN", "Acting HPLMN", Text, kPlain, "",
     "The network that acts as the home network. It is a file of the operator and not of the standard."},
    {"EF-PLMN NETWORK NAME", "Network name", Text, kPlain, "3GPP TS 31.102, EF PNN",
     "Names of networks, to which EF-OPERATOR PLMN LIST refers."},
    {"EF-OPERATOR PLMN LIST", "OPL", Text, kPlain, "3GPP TS 31.102, EF OPL",
     "Which name is shown in which network and area, eight bytes an entry."},
    {"EF-OPLMNAcT", "OPLMNwAcT", Text, kPlain, "3GPP TS 31.102, EF OPLMNwACT",
     "The networks that the operator prefers, in order, each with its access technologies."},
    {"EF-HPPLMN SEARCH PERIOD", "HPPLMN", Text, kPlain, "3GPP TS 31.102, EF HPPLMN; TS 23.122, 4.4.3.3",
     "How often the phone searches for a network of higher priority while it roams. In most cases the unit is 6 minutes; "
     "0 means never."},
    {"EF-ACCESS CONTROL CLASS", "ACC", Text, kPlain, "3GPP TS 31.102, EF ACC; TS 22.011",
     "The access classes of the subscriber, one bit each. Classes 0 to 9 are those of ordinary subscribers, and a cell "
     "can bar some of them when it is overloaded."},
    {"EF-ADMINISTRATIVE DATA", "AD", Text, kPlain, "3GPP TS 31.102, EF AD",
     "The mode of operation (normal, test) and the number of digits of the network code in the IMSI."},
    {"EF-RAT MODE", "RAT mode", Text, kPlain, "",
     "Which access technologies the operator allows. It is a file of the operator and not of the standard."},
    {"EF-3GPP MAIL BOX DIALING NUMBER", "Mailbox", Text, kPlain, "3GPP TS 31.102, EF MBDN",
     "The number of the voice mailbox."},
};

inline constexpr KeyEntry kPdpContextKeys[] = {
    {"Context ID", "Context", Identity, kPlain, "3GPP TS 24.008, 10.5.6.2",
     "The number of the context, or of the bearer in LTE.",
     nullptr, kIdentity},
    {"Access Point Name", "APN", Text, kPlain, "3GPP TS 23.003, 9",
     "The packet network to which the context leads."},
    {"State", "State", State, kPlain, "3GPP TS 24.008, 6.1.1",
     "Whether the context is active."},
    {"IP Address", "Address", Text, kPlain, "3GPP TS 24.008, 10.5.6.4",
     "The phone's address in the packet network."},
    {"Traffic Class", "Class", Text, kPlain, "3GPP TS 23.107, 6.3",
     "The quality that the context asks for: conversational, streaming, interactive or background."},
    {"Radio Access", "Technology", Text, kPlain, "",
     "The radio access technology that carries the context."},
};
// clang-format on

inline constexpr SectionEntry kSimInfo{"SIM Info", "Files of the SIM card, as the telephony service sends them.",
                                       kSimInfoKeys};
inline constexpr SectionEntry kPdpContexts{"PDP Context Info", "The connections to packet networks.", kPdpContextKeys};

} // namespace kestrum::keys
