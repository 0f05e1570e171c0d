#include "ui/NewFile.h"

#include "platform/Clock.h"
#include "platform/FileSystem.h"
#include "platform/SystemLog.h"
#include "platform/Toolkit.h"
#include "support/Format.h"

#include <chrono>

namespace kestrum {

Stored storeInNewFile(std::string_view name, ApplicationRoles& roles,
                      const std::function<Stored(const std::string& path)>& store)
{
    constexpr std::chrono::seconds kMostNames{60};
    auto moment = std::chrono::floor<std::chrono::seconds>(roles.clock.now()).time_since_epoch();
    const auto last = moment + kMostNames;
    Stored stored;
    do
        stored = store(formatted("%@/%@-%ld", roles.files.diagnosticLogDirectory(), name, moment.count()));
    while (stored == Stored::NameTaken && ++moment != last);
    return stored;
}

void tellOfFailedFile(std::string_view what, std::string_view path, ApplicationRoles& roles)
{
    roles.log.write(Priority::Error, "Unable to write %@ to %@", what, path);
    roles.toolkit.showAlert("File Error", "Unable to write file to disk", "Close");
}

} // namespace kestrum
