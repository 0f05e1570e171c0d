#include "LogGenerator/LTE/LTELogGenerator.h"

#include "LogGenerator/LTE/LTEClassIndex.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

namespace kestrum {
namespace {

DecodingRoles& announced(DecodingRoles& roles)
{
    roles.log.write(Priority::Error, "Creating LTELogGenerator object");
    return roles;
}

} // namespace

LTELogGenerator::LTELogGenerator(DecodingRoles& roles)
    // Braces evaluate the arguments in order: this object logs its creation before the index does.
    : ZPHLogGenerator2{announced(roles), "LTE", std::make_unique<LTEClassIndex>(roles)}
{}

LTELogGenerator::~LTELogGenerator()
{
    _roles.log.write(Priority::Warning, "LTELogGenerator is destructed %p", _roles.log.shownAddress(this));
}

std::unique_ptr<LTELogGenerator> LTELogGenerator::generator(DecodingRoles& roles)
{
    return std::unique_ptr<LTELogGenerator>(new LTELogGenerator(roles));
}

std::string_view LTELogGenerator::technology() const
{
    return kVoxLogChannelTechnology_Zephra_LTE;
}

} // namespace kestrum
