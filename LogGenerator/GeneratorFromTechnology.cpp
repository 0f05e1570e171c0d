#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/LTE/LTELogGenerator.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"
#include "platform/TelephonyService.h"

namespace kestrum {

std::unique_ptr<LogGenerator> LogGenerator::generatorFromTechnology(const Value& technology, DecodingRoles& roles)
{
    if (technology == Value(kVoxLogChannelTechnology_IFX))
        return GSMLogGenerator::generator(roles);
    if (technology == Value(kVoxLogChannelTechnology_Zephra_GSM))
        return ZPH_GSMLogGenerator::generator(roles);
    if (technology == Value(kVoxLogChannelTechnology_Zephra_CDMA))
        return C2KLogGenerator::generator(roles);
    if (technology == Value(kVoxLogChannelTechnology_Zephra_LTE))
        return LTELogGenerator::generator(roles);
    if (technology == Value(kVoxLogChannelTechnology_Zephra_UTRAN2))
        return UTRANLogGenerator::generator(roles);
    return nullptr;
}

} // namespace kestrum
