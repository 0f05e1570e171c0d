#include "Pseudoterminal.h"
#include "harness/FileContents.h"
#include "harness/Places.h"
#include "harness/Scratch.h"

#include <gmock/gmock.h>

#include <algorithm>
#include <fcntl.h>
#include <stdexcept>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace kestrum {
namespace {

using testing::HasSubstr;
using testing::Not;

/// A capture that arrives in pieces.
class SlowCapture {
public:
    SlowCapture()
    {
        if (_rest.empty() || ::mkfifo(path().c_str(), 0600) != 0)
            throw std::runtime_error("no slow capture");
        _pipe = ::open(path().c_str(), O_RDWR | O_CLOEXEC); // for reading too, so that it does not wait for a reader
    }
    ~SlowCapture() { ::close(_pipe); }
    SlowCapture(const SlowCapture&) = delete;
    SlowCapture& operator=(const SlowCapture&) = delete;

    std::string path() const { return _scratch / "slow.kcap"; }
    void send(std::size_t bytes)
    {
        bytes = std::min(bytes, _rest.size());
        ASSERT_EQ(::write(_pipe, _rest.data(), bytes), static_cast<ssize_t>(bytes));
        _rest.erase(0, bytes);
    }
    void sendAllAndEnd()
    {
        send(_rest.size());
        ::close(std::exchange(_pipe, -1));
    }

private:
    ScratchDirectory _scratch;
    std::string _rest = contentsOf(inCheckout("captures/lte.kcap"));
    int _pipe = -1;
};

TEST(Progress, IsShownOfALongRunAndGivesWayToTheDisplay)
{
    SlowCapture capture;
    Pseudoterminal screen(300, 100);
    screen.start("kestrum-decode", {capture.path()}, {});
    EXPECT_TRUE(screen.waitUntil([&] {
        capture.send(40);
        return screen.shows(capture.path() + ": 0 MB");
    })) << screen.text();

    capture.sendAllAndEnd();
    ASSERT_TRUE(screen.waitForEnd());
    EXPECT_EQ(screen.exitStatus(), 0);
    EXPECT_THAT(screen.text(), Not(HasSubstr(" MB")));
    EXPECT_EQ(screen.row(0), "Serving Cell");
}

TEST(Progress, IsNotShownOfAShortRun)
{
    Pseudoterminal screen(300, 100);
    screen.start("kestrum-decode", {inCheckout("captures/lte.kcap")}, {});
    ASSERT_TRUE(screen.waitForEnd());
    EXPECT_EQ(screen.exitStatus(), 0);
    EXPECT_EQ(screen.written().find(" MB"), std::string::npos);
    EXPECT_EQ(screen.row(0), "Serving Cell");
}

} // namespace
} // namespace kestrum
