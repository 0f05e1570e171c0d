#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/UTRAN/CCTRCHSIRMeasurement.h"
#include "LogGenerator/UTRAN/GSMNeighbhorMeasurements.h"
#include "LogGenerator/UTRAN/RRC_State.h"
#include "LogGenerator/UTRAN/TRCHBLERMeasurement.h"
#include "LogGenerator/UTRAN/UTRANNeighbhorMeasurements.h"
#include "LogGenerator/UTRAN/UTRANServingCellInfo.h"
#include "LogGenerator/ZPH_GSM/PDPContextList.h"
#include "LogGenerator/ZPH_GSM/SimInfo.h"

namespace kestrum {

/// The sections of UTRAN. Sections with the same log code are called in the order of the fields.
class UTRANClassIndex final : public ClassIndex {
public:
    explicit UTRANClassIndex(DecodingRoles& decodingRoles);

private:
    std::unique_ptr<RRC_State> rrc_state;
    std::unique_ptr<UTRANServingCellInfo> servingCellInfo;
    std::unique_ptr<UTRANNeighbhorMeasurements> tdMeasurements;
    std::unique_ptr<GSMNeighbhorMeasurements> gsmMeasurements;
    std::unique_ptr<TRCHBLERMeasurement> trchMeasurements;
    std::unique_ptr<CCTRCHSIRMeasurement> cctrchMeasurements;
    std::unique_ptr<PDPContextList> pdpList;
    std::unique_ptr<SimInfo> simInfo;
};

} // namespace kestrum
