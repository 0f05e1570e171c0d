#include "sections/Measured.h"

namespace kestrum {
namespace {

TEST(Quantities, OfLte)
{
    EXPECT_EQ(measuredBy<LTELogGenerator>("LTE", candidates()).lines(), R"(
Connected mode LTE Intra-frequency Measurement/E-ARFCN: a number
Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRP: dBm
Connected mode LTE Intra-frequency Measurement/Serving Filtered RSRQ: dB
Connected mode LTE Intra-frequency Measurement/Serving Physical Cell ID: a number
Connected mode LTE Intra-frequency Measurement/Subframe Number: a number
Detected Cells/Physical Cell ID: a number
Measured Neighbor Cells/Filtered RSRP: dBm
Measured Neighbor Cells/Filtered RSRQ: dB
Measured Neighbor Cells/Physical Cell ID: a number
Neighbor Cells List/Ant 0 Frame Offset: a number
Neighbor Cells List/Ant 0 Sample Offset: a number
Neighbor Cells List/Ant 1 Frame Offset: a number
Neighbor Cells List/Ant 1 Sample Offset: a number
Neighbor Cells List/Average RSRP: dBm
Neighbor Cells List/Average RSRQ: dB
Neighbor Cells List/Frequency Offset: a number
Neighbor Cells List/Measured RSRP: dBm
Neighbor Cells List/Measured RSRQ: dB
Neighbor Cells List/Measured RSSI: dBm
Neighbor Cells List/Physical Cell ID: a number
Neighbor Cells List/Srxlev: dBm
Neighbor Measurements/E-ARFCN: a number
Neighbor Measurements/Qrxlevmin: dBm
Neighbor Measurements/Version: a number
Reselection Candidates List/ARFCN: a number
Reselection Candidates List/BSIC ID: a number
Reselection Candidates List/Band: a number
Reselection Candidates List/Candidate Priority: a number
Reselection Candidates List/Candidate RAT Type: a text
Reselection Candidates List/Cell ID: a number
Reselection Candidates List/Channel: a number
Reselection Candidates List/E ARFCN: a number
Reselection Candidates List/PSC: a number
Reselection Candidates List/Pilot: a number
Reselection Candidates List/U ARFCN: a number
Reselection Candidates/Serving Cell ID: a number
Reselection Candidates/Serving EARFCN: a number
Reselection Candidates/Version: a number
Serving Cell Info/Cell Identity: a number
Serving Cell Info/Download Bandwidth: MHz
Serving Cell Info/Download Frequency: a number
Serving Cell Info/Freq Band Indicator: a number
Serving Cell Info/Num Tx Antennas: a number
Serving Cell Info/Physical Cell ID: a number
Serving Cell Info/Tracking Area Code: a number
Serving Cell Info/UARFCN: a number
Serving Cell Info/Upload Bandwidth: MHz
Serving Cell Info/Upload Frequency: a number
Serving Cell Measurements/Average RSRP: dBm
Serving Cell Measurements/Average RSRQ: dB
Serving Cell Measurements/E-ARFCN: a number
Serving Cell Measurements/Max UE Tx Power: dBm
Serving Cell Measurements/Measured RSRP: dBm
Serving Cell Measurements/Measured RSRQ: dB
Serving Cell Measurements/Measured RSSI: dBm
Serving Cell Measurements/Measurement Rules: a number
Serving Cell Measurements/Measurement Rules Updated: a text
Serving Cell Measurements/Num of Consecutive DRX Cycles of S < 0: a number
Serving Cell Measurements/P_Max: dBm
Serving Cell Measurements/Physical Cell ID: a number
Serving Cell Measurements/Qrxlevmin: dBm
Serving Cell Measurements/S Intra Search: dB
Serving Cell Measurements/S Non Intra Search: dBm
Serving Cell Measurements/Serving Layer Priority: a number
Serving Cell Measurements/Srxlev: dBm
Serving Cell Measurements/Version: a number
)");
}

TEST(Quantities, OfUtran)
{
    EXPECT_EQ(measuredBy<UTRANLogGenerator>("UTRAN").lines(), R"(
CCTRCH SIR/CCTRCH ID: a number
CCTRCH SIR/SIR: a number
CCTRCH SIR/TSNUM: a number
Neighbor Cell List/Cell ID: a number
Neighbor Cell List/Filter RSCP: a number
Neighbor Cell List/Status: a text
Neighbor Cell List/UARFCN: a number
Neighbor Cell List/inJDCS: a text
RRC Info/State: a text
Serving Cell Info/Allowed Access: a text
Serving Cell Info/Cell Access Restrictions: a number
Serving Cell Info/Cell ID: a number
Serving Cell Info/Cell Scrambling Code: a number
Serving Cell Info/Downlink UARFCN: a number
Serving Cell Info/Freq Band Indicator: a number
Serving Cell Info/Local Area Code: a number
Serving Cell Info/URA ID: a number
Serving Cell Info/Uplink UARFCN: a number
TRCH BLER/TRCH BLER Measurement: a number
TRCH BLER/TRCH ID: a number
)");
}

TEST(Quantities, OfGsmAndUmts)
{
    EXPECT_EQ(measuredBy<ZPH_GSMLogGenerator>("ZPH_GSM").lines(), R"(
Active Set/Energy Per Chip: dB
Active Set/RSCP: dB
Active Set/Scrambling Code: a number
BLER/Window Size: a number
Equivalent PLMN List/Mobile Country Code: a number
Equivalent PLMN List/Mobile Network Code: a number
GPRS Information/Access Burst Type: a text
GPRS Information/Cell Reselect Hysteresis: a text
GPRS Information/Count HR: a number
GPRS Information/Count LR: a number
GPRS Information/DRX Timer Max: a number
GPRS Information/Ext Measurement Order: a number
GPRS Information/Network Control Order: a text
GPRS Information/Network Operating Mode: a text
GPRS Information/PBCCH Present: a number
GPRS Information/PFC Supported: a text
GPRS Information/Packet PSI Status: a number
GPRS Information/Packet SI Status: a text
GPRS Information/Priority Access Threshold: a text
GPRS Information/SI13 Position: a text
GPRS Information/T3192: ms
GSM RR Info/DRX Used: sec
GSM RR Info/DTX Used: a text
GSM RR Info/RR Mode: a text
GSM RR Info/RR State: a text
GSM RR Info/RR Status: a number
GSM RR Info/RR Sub State: a number
GSM RR Info/Rx Quality Full: a number
GSM RR Info/Rx Quality Sub: a number
GSM RR Info/Serving Rx Level: a number
GSM Serving Cell/ARFCN: a number
GSM Serving Cell/BSIC: a number
GSM Serving Cell/C1 Value: a number
GSM Serving Cell/C2 Value: a number
GSM Serving Cell/Cell ID: a number
GSM Serving Cell/MA Dedicated ARFCN: a number
GSM Serving Cell/RSSI: dBm
GSM Set/ARFCN: a number
GSM Set/BSIC: a number
GSM Set/RSSI: dBm
GSM Set/Ranking Value: a number
HSDPA Info/Carrier Info: a text
HSDPA Info/Sub Frames: a number
HSDPA Info/Version: a number
Mobile Allocation/ARFCNs: a number
Mobile Allocation/HSN: a number
Neighboring Cells/ARFCN: a number
Neighboring Cells/C1 Value: a number
Neighboring Cells/RSSI: a number, dBm
Primary HARQ Process/Block Errors: a number
Primary HARQ Process/New Tx: a number
Primary HARQ Process/No Rx Bits: a number
Primary HARQ Process/Process ID: a number
Process CO/MM Service State: a text
Process CO/MM State: a text
Process CS/LU Reject Cause: a text
Process CS/MM Service State: a text
Process CS/MM State: a text
Process CS/MM Sub State: a text
Process PS/Attach Reject Cause: a text
Process PS/MM Service State: a text
Process PS/MM State: a text
Process PS/MM Sub State: a text
Secondary HARQ Process/Block Errors: a number
Secondary HARQ Process/New Tx: a number
Secondary HARQ Process/No Rx Bits: a number
Secondary HARQ Process/Process ID: a number
Serving PLMN/Location Area Code: a number
Serving PLMN/Mobile Country Code: a number
Serving PLMN/Mobile Network Code: a number
Serving PLMN/PLMN Sel Mod: a text
Serving PLMN/Routing Area Code: a number
Serving PLMN/Service Type: a text
Transport Channels/CRC Received: a number
Transport Channels/CRC Received in Error: a number
Transport Channels/Transport Channel ID: a number
UMTS RR Info/Cell ID: a number
UMTS RR Info/Ciphering: a text
UMTS RR Info/Downlink Frequency: a number
UMTS RR Info/RRC State: a text
UMTS RR Info/Scrambling Code: a number
UMTS RR Info/Transmit Power: dBm
UMTS RR Info/UARFCN: a number
UMTS RR Info/URA ID: a number
UMTS RR Info/Uplink Frequency: a number
UMTS Set/Downlink Frequency: a number
UMTS Set/Energy Per Chip: dB
UMTS Set/RSCP: dB, dBm
UMTS Set/Rank Cell RSCP: dB
UMTS Set/Ranking Value: a number
UMTS Set/Scrambling Code: a number
UMTS Set/UARFCN: a number
)");
}

TEST(Quantities, OfCdma)
{
    EXPECT_EQ(measuredInTheCdmaCapture().lines(), R"(
0;EV-DO/4;Forward Link Rate: kbps
0;EV-DO/5;Reverse Link Rate: kbps
0;State/0;Device State: a text
0;State/1;Session State: a text
0;State/2;UATI 24: a text
0;State/3;Color Code: a number
1;1x/0;Device State: a text
1;1x/3;Traffic FER: %
1;Radio/0;Band Class: a text
1;Radio/0;Rx0 Band Class: a text
1;Radio/1;Channel: a number
1;Radio/1;Rx0 Channel: a number
1;Radio/2;Rx0 AGC: dBm
1;Radio/2;Serving PN Offset: × 64chips
1;Radio/3;Rx0 AGC: dBm
1;Radio/4;Rx1 AGC: dBm
1;Radio/5;Tx AGC: dBm
2;Active Set Pilots/0;316: dB
2;Active Set Pilots/0;328: dB
2;Active Set Pilots/0;424: dB
2;Active Set/0;328: dB
2;Active Set/0;412: dB
2;System/0;Roaming: a text
2;System/1;System ID: a number
2;System/2;Network ID: a number
2;System/3;Packet Zone ID: a number
2;System/4;Base Station ID: a number
2;System/5;Protocol Revision: a number
3;Finger C/I/0;316: dB
3;Finger C/I/0;328: dB
3;Finger C/I/0;424: dB
3;Finger C/I/1;316: dB
3;Finger C/I/1;328: dB
3;Finger C/I/1;424: dB
)");
}

} // namespace
} // namespace kestrum
