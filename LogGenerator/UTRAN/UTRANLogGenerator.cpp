#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "platform/Bundle.h"
#include "platform/SystemLog.h"
#include "platform/TelephonyService.h"

#include <algorithm>

namespace kestrum {
namespace {

std::string upperCase(std::string text)
{
    std::ranges::transform(text, text.begin(), [](char c) { return c >= 'a' && c <= 'z' ? char(c - 'a' + 'A') : c; });
    return text;
}

/// "/a/Name.plist" gives "Name".
std::string lastComponentWithoutExtension(const std::string& path)
{
    const std::string name = path.substr(path.rfind('/') + 1);
    return name.substr(0, name.rfind('.'));
}

} // namespace

UTRANLogGenerator::UTRANLogGenerator(DecodingRoles& roles, std::string templateName)
    : ZPHLogGenerator2(roles, std::move(templateName), std::make_unique<UTRANClassIndex>(roles))
{
    _roles.log.write(Priority::Error, "Created UTRANLogGenerator object");
}

UTRANLogGenerator::UTRANLogGenerator(DecodingRoles& roles, Uninitialized uninitialized)
    : ZPHLogGenerator2(roles, uninitialized)
{}

std::unique_ptr<UTRANLogGenerator> UTRANLogGenerator::generator(DecodingRoles& roles)
{
    const auto paths = roles.bundle.pathsForResourcesOfType("plist");
    const auto found = std::ranges::find_if(paths, [](const auto& path) {
        return upperCase(path.substr(path.rfind('/') + 1)).find("UTRAN") != std::string::npos;
    });
    if (found == paths.end())
        return std::unique_ptr<UTRANLogGenerator>(new UTRANLogGenerator(roles, Uninitialized{}));
    return std::unique_ptr<UTRANLogGenerator>(new UTRANLogGenerator(roles, lastComponentWithoutExtension(*found)));
}

std::string_view UTRANLogGenerator::technology() const
{
    return kVoxLogChannelTechnology_Zephra_UTRAN2;
}

} // namespace kestrum
