#include "ui/Keep.h"

#include "insight/EventsCsv.h"
#include "insight/History.h"
#include "platform/FileSystem.h"
#include "platform/SystemLog.h"
#include "platform/Toolkit.h"
#include "support/Format.h"
#include "ui/NewFile.h"
#include "ui/SharedApplication.h"

#include <string>

namespace kestrum {

void keepHistory(const History& history, ApplicationRoles& roles, SharedApplication& application)
{
    if (history.recent().isEmpty()) {
        application.showNotice("There is nothing to keep yet");
        return;
    }
    const auto writeMessages = [&](const FileSystem::Write& write) { history.recent().writeTo(write); };
    const auto writeEvents = [&](const FileSystem::Write& write) {
        write(bytesOf(kEventsCsvHead));
        std::string line;
        for (const auto& each : history.events()) {
            line.clear();
            appendCsv(line, each);
            write(bytesOf(line));
        }
    };
    std::string stem;
    auto stored = storeInNewFile("KestrumKept", roles, [&](const std::string& path) {
        stem = path;
        return roles.files.create(path + ".kcap", writeMessages);
    });
    if (stored != Stored::Written)
        return tellOfFailedFile("capture", stem + ".kcap", roles);
    stored = roles.files.create(stem + ".csv", writeEvents);
    application.showNotice(formatted("Kept in %@.kcap%s", stem, stored == Stored::Written ? " and .csv" : ""));
    if (stored != Stored::Written)
        tellOfFailedFile("events", stem + ".csv", roles);
}

} // namespace kestrum
