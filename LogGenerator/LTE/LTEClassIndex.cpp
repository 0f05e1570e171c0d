#include "LogGenerator/LTE/LTEClassIndex.h"

#include "platform/Console.h"

namespace kestrum {

LTEClassIndex::LTEClassIndex(DecodingRoles& decodingRoles)
    : ClassIndex(decodingRoles),
      objLTEServingCellInfo(create<LTEServingCellInfo>()),
      objConnectedModeMeasurementMisc(create<ConnectedModeMeasurementMisc>()),
      objMeasuredNeighborCells(create<MeasuredNeighborCells>()),
      objDetectedCells(create<DetectedCells>()),
      objServingCellMeasurement(create<ServingCellMeasurement>()),
      objNeighborMeasurementMisc(create<NeighborMeasurementMisc>()),
      objNeighborCellsList(create<NeighborCellsList>()),
      objReselectionCandidatesMisc(create<ReselectionCandidatesMisc>()),
      objReselectionCandidatesList(create<ReselectionCandidatesList>()),
      objSimInfo(create<SimInfo>()),
      objPDPContextList(create<PDPContextList>())
{}

LTEClassIndex::~LTEClassIndex()
{
    roles.console.printLine("Deallocing LTEClassIndex");
}

} // namespace kestrum
