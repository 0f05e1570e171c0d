#include "LogGenerator/UTRAN/UTRANClassIndex.h"

namespace kestrum {

UTRANClassIndex::UTRANClassIndex(DecodingRoles& decodingRoles)
    : ClassIndex(decodingRoles),
      rrc_state(create<RRC_State>()),
      servingCellInfo(create<UTRANServingCellInfo>()),
      tdMeasurements(create<UTRANNeighbhorMeasurements>()),
      gsmMeasurements(create<GSMNeighbhorMeasurements>()),
      trchMeasurements(create<TRCHBLERMeasurement>()),
      cctrchMeasurements(create<CCTRCHSIRMeasurement>()),
      pdpList(create<PDPContextList>()),
      simInfo(create<SimInfo>())
{}

} // namespace kestrum
