#include "contracts/Worlds.h"
#include "doubles/RecordingLog.h"
#include "platform/posix/LinuxSystemLog.h"

#include <gmock/gmock.h>

#include <mutex>

namespace kestrum {
namespace {

using testing::ElementsAre;

struct RecordingWorld {
    std::unique_ptr<RecordingLog> log = std::make_unique<RecordingLog>();

    std::vector<std::string> texts()
    {
        std::vector<std::string> found;
        for (const auto& line : log->lines)
            found.push_back(line.second);
        return found;
    }
};

struct LinuxWorld {
    std::mutex mutex;
    std::vector<std::string> written;
    std::unique_ptr<LinuxSystemLog> log = std::make_unique<LinuxSystemLog>([this](int, const std::string& text) {
        const std::lock_guard lock(mutex);
        written.push_back(text);
        return true;
    });

    std::vector<std::string> texts()
    {
        log.reset(); // its thread writes the queued lines first
        return written;
    }
};

template <typename World>
class SystemLogContract : public testing::Test {
protected:
    World world;
};
using Worlds = testing::Types<RecordingWorld, LinuxWorld>;
TYPED_TEST_SUITE(SystemLogContract, Worlds, DoubleOrAdapter);

TYPED_TEST(SystemLogContract, KeepsTheLinesOfAllPrioritiesInTheirOrder)
{
    SystemLog& log = *this->world.log;
    log.write(Priority::Error, "one");
    log.write(Priority::Warning, "two %s");
    log.write(Priority::Raw16, "");
    log.write(Priority::Notice, "four");
    EXPECT_THAT(this->world.texts(), ElementsAre("one", "two %s", "", "four"));
}

TYPED_TEST(SystemLogContract, FillsTheArgumentsInAndBorrowsTheTextForTheCall)
{
    SystemLog& log = *this->world.log;
    {
        std::string text = "port";
        log.write(Priority::Error, "%s: %d", text, -3);
        log.write(Priority::Error, text);
        text = "over";
    }
    EXPECT_THAT(this->world.texts(), ElementsAre("port: -3", "port"));
}

} // namespace
} // namespace kestrum
