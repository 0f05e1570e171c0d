#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/ZPH_GSM/ActiveSet.h"
#include "LogGenerator/ZPH_GSM/BLER.h"
#include "LogGenerator/ZPH_GSM/CellChangeCounters.h"
#include "LogGenerator/ZPH_GSM/CodingScheme.h"
#include "LogGenerator/ZPH_GSM/DetectedSet.h"
#include "LogGenerator/ZPH_GSM/EquivalentPLMNList.h"
#include "LogGenerator/ZPH_GSM/GPRSInformation.h"
#include "LogGenerator/ZPH_GSM/GSMRRInfo.h"
#include "LogGenerator/ZPH_GSM/GSMServingCell.h"
#include "LogGenerator/ZPH_GSM/GSMSet.h"
#include "LogGenerator/ZPH_GSM/HSDPAInformation.h"
#include "LogGenerator/ZPH_GSM/MobileAllocation.h"
#include "LogGenerator/ZPH_GSM/MonitoredSet.h"
#include "LogGenerator/ZPH_GSM/NeighboringCells.h"
#include "LogGenerator/ZPH_GSM/NonRankedGSMSet.h"
#include "LogGenerator/ZPH_GSM/NonRankedUMTSSet.h"
#include "LogGenerator/ZPH_GSM/PDPContextList.h"
#include "LogGenerator/ZPH_GSM/ProcessCO.h"
#include "LogGenerator/ZPH_GSM/ProcessCS.h"
#include "LogGenerator/ZPH_GSM/ProcessPS.h"
#include "LogGenerator/ZPH_GSM/ServingPLMN.h"
#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "LogGenerator/ZPH_GSM/UMTSRRInfo.h"
#include "LogGenerator/ZPH_GSM/UMTSRRMeasurement.h"
#include "LogGenerator/ZPH_GSM/UMTSSet.h"
#include "LogGenerator/ZPH_GSM/VirtualActiveSet.h"

namespace kestrum {

/// The sections of GSM and UMTS. Sections with the same log code are called in the order of the fields.
class ZPH_GSMClassIndex final : public ClassIndex {
public:
    explicit ZPH_GSMClassIndex(DecodingRoles& decodingRoles);
    ~ZPH_GSMClassIndex() override;

private:
    std::unique_ptr<ActiveSet> objActiveSet;
    std::unique_ptr<CodingScheme> objCodingScheme;
    std::unique_ptr<GPRSInformation> objGPRSInformation;
    std::unique_ptr<GSMServingCell> objGSMServingCell;
    std::unique_ptr<MobileAllocation> objMobileAllocation;
    std::unique_ptr<NeighboringCells> objNeighboringCells;
    std::unique_ptr<PDPContextList> objPDPContextList;
    std::unique_ptr<ProcessPS> objProcessPS;
    std::unique_ptr<UMTSRRMeasurement> objUMTSRRMeasurement;
    std::unique_ptr<CellChangeCounters> objCellChangeCounter; // the singular is its name
    std::unique_ptr<DetectedSet> objDetectedSet;
    std::unique_ptr<GSMSet> objGSMSet;
    std::unique_ptr<NonRankedGSMSet> objNonRankedGSMSet;
    std::unique_ptr<ProcessCO> objProcessCO;
    std::unique_ptr<ServingPLMN> objServingPLMN;
    std::unique_ptr<UMTSSet> objUMTSSet;
    std::unique_ptr<EquivalentPLMNList> objEquivalentPLMNList;
    std::unique_ptr<GSMRRInfo> objGSMRRInfo;
    std::unique_ptr<MonitoredSet> objMonitoredSet;
    std::unique_ptr<NonRankedUMTSSet> objNonRankedUMTSSet;
    std::unique_ptr<ProcessCS> objProcessCS;
    std::unique_ptr<UMTSRRInfo> objUMTSRRInfo;
    std::unique_ptr<BLER> objBLER;
    std::unique_ptr<VirtualActiveSet> objVirtualActiveSet;
    std::unique_ptr<SimInfo> objSimInfo;
    std::unique_ptr<HSDPAInformation> objHSDPAInformation;
};

} // namespace kestrum
