#pragma once

#include "LogGenerator/ClassIndex.h"
#include "LogGenerator/LTE/ConnectedModeMeasurementMisc.h"
#include "LogGenerator/LTE/DetectedCells.h"
#include "LogGenerator/LTE/LTEServingCellInfo.h"
#include "LogGenerator/LTE/MeasuredNeighborCells.h"
#include "LogGenerator/LTE/NeighborCellsList.h"
#include "LogGenerator/LTE/NeighborMeasurementMisc.h"
#include "LogGenerator/LTE/ReselectionCandidatesList.h"
#include "LogGenerator/LTE/ReselectionCandidatesMisc.h"
#include "LogGenerator/LTE/ServingCellMeasurement.h"
#include "LogGenerator/ZPH_GSM/PDPContextList.h"
#include "LogGenerator/ZPH_GSM/SimInfo.h"

namespace kestrum {

/// The sections of LTE. Sections with the same log code are called in the order of the fields.
class LTEClassIndex final : public ClassIndex {
public:
    explicit LTEClassIndex(DecodingRoles& decodingRoles);
    ~LTEClassIndex() override;

private:
    std::unique_ptr<LTEServingCellInfo> objLTEServingCellInfo;
    std::unique_ptr<ConnectedModeMeasurementMisc> objConnectedModeMeasurementMisc;
    std::unique_ptr<MeasuredNeighborCells> objMeasuredNeighborCells;
    std::unique_ptr<DetectedCells> objDetectedCells;
    std::unique_ptr<ServingCellMeasurement> objServingCellMeasurement;
    std::unique_ptr<NeighborMeasurementMisc> objNeighborMeasurementMisc;
    std::unique_ptr<NeighborCellsList> objNeighborCellsList;
    std::unique_ptr<ReselectionCandidatesMisc> objReselectionCandidatesMisc;
    std::unique_ptr<ReselectionCandidatesList> objReselectionCandidatesList;
    std::unique_ptr<SimInfo> objSimInfo;
    std::unique_ptr<PDPContextList> objPDPContextList;
};

} // namespace kestrum
