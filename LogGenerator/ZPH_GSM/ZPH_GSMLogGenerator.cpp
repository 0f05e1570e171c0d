#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"

#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

namespace kestrum {
namespace {

DecodingRoles& announced(DecodingRoles& roles)
{
    roles.log.write(Priority::Error, "Creating ZPH_GSMLogGenerator object");
    return roles;
}

} // namespace

ZPH_GSMLogGenerator::ZPH_GSMLogGenerator(DecodingRoles& roles)
    // Braces evaluate the arguments in order: this object logs its creation before the index does.
    : ZPHLogGenerator2{announced(roles), "ZPH_GSM", std::make_unique<ZPH_GSMClassIndex>(roles)}
{}

ZPH_GSMLogGenerator::~ZPH_GSMLogGenerator()
{
    _roles.log.write(Priority::Warning, "ZPH_GSMLogGenerator is destructed %p", _roles.log.shownAddress(this));
}

std::unique_ptr<ZPH_GSMLogGenerator> ZPH_GSMLogGenerator::generator(DecodingRoles& roles)
{
    return std::unique_ptr<ZPH_GSMLogGenerator>(new ZPH_GSMLogGenerator(roles));
}

std::string_view ZPH_GSMLogGenerator::technology() const
{
    return kVoxLogChannelTechnology_Zephra_GSM;
}

} // namespace kestrum
