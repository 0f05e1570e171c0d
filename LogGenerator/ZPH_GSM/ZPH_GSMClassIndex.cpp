#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"

#include "platform/Console.h"

namespace kestrum {

ZPH_GSMClassIndex::ZPH_GSMClassIndex(DecodingRoles& decodingRoles)
    : ClassIndex(decodingRoles),
      objActiveSet(create<ActiveSet>()),
      objCodingScheme(create<CodingScheme>()),
      objGPRSInformation(create<GPRSInformation>()),
      objGSMServingCell(create<GSMServingCell>()),
      objMobileAllocation(create<MobileAllocation>()),
      objNeighboringCells(create<NeighboringCells>()),
      objPDPContextList(create<PDPContextList>()),
      objProcessPS(create<ProcessPS>()),
      objUMTSRRMeasurement(create<UMTSRRMeasurement>()),
      objCellChangeCounter(create<CellChangeCounters>()),
      objDetectedSet(create<DetectedSet>()),
      objGSMSet(create<GSMSet>()),
      objNonRankedGSMSet(create<NonRankedGSMSet>()),
      objProcessCO(create<ProcessCO>()),
      objServingPLMN(create<ServingPLMN>()),
      objUMTSSet(create<UMTSSet>()),
      objEquivalentPLMNList(create<EquivalentPLMNList>()),
      objGSMRRInfo(create<GSMRRInfo>()),
      objMonitoredSet(create<MonitoredSet>()),
      objNonRankedUMTSSet(create<NonRankedUMTSSet>()),
      objProcessCS(create<ProcessCS>()),
      objUMTSRRInfo(create<UMTSRRInfo>()),
      objBLER(create<BLER>()),
      objVirtualActiveSet(create<VirtualActiveSet>()),
      objSimInfo(create<SimInfo>()),
      objHSDPAInformation(create<HSDPAInformation>())
{}

ZPH_GSMClassIndex::~ZPH_GSMClassIndex()
{
    roles.console.printLine("Deallocing ZPH_GSMClassIndex");
}

} // namespace kestrum
