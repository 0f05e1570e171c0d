#include "platform/posix/SignalPipe.h"

#include <gmock/gmock.h>

#include <csignal>
#include <system_error>

#include <poll.h>
#include <sys/resource.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

bool isReadable(const SignalPipe& pipe)
{
    pollfd state{pipe.descriptor(), POLLIN, 0};
    return ::poll(&state, 1, 0) == 1;
}

TEST(SignalPipe, GivesEachSignalOnceInTheOrderOfTheList)
{
    SignalPipe pipe({SIGTERM, SIGCONT});
    EXPECT_FALSE(isReadable(pipe));
    for (const int each : {SIGCONT, SIGTERM, SIGTERM})
        ::raise(each);
    EXPECT_TRUE(isReadable(pipe));
    EXPECT_THAT(pipe.taken(), ElementsAre(SIGTERM, SIGCONT));
    EXPECT_FALSE(isReadable(pipe));
    EXPECT_THAT(pipe.taken(), IsEmpty());
}

TEST(SignalPipe, OutlivesMoreSignalsThanThePipeHolds)
{
    SignalPipe pipe({SIGHUP});
    for (int i = 0; i < 100'000; ++i)
        ::raise(SIGHUP);
    EXPECT_THAT(pipe.taken(), ElementsAre(SIGHUP));
    EXPECT_FALSE(isReadable(pipe));
}

volatile std::sig_atomic_t handled = 0;

TEST(SignalPipe, PutsTheOldHandlersBack)
{
    const auto before = std::signal(SIGHUP, [](int) { handled = handled + 1; });
    {
        const SignalPipe pipe({SIGHUP});
        ::raise(SIGHUP);
        EXPECT_EQ(handled, 0);
    }
    ::raise(SIGHUP);
    EXPECT_EQ(handled, 1);
    std::signal(SIGHUP, before);
}

TEST(SignalPipe, IgnoresSignalsOfAnEarlierOne)
{
    {
        const SignalPipe earlier({SIGHUP});
        ::raise(SIGHUP);
    }
    SignalPipe pipe({SIGHUP});
    EXPECT_THAT(pipe.taken(), IsEmpty());
}

// Clang's sanitizer needs a descriptor itself to check the type of the exception's category.
#if defined(__has_feature)
#if __has_feature(undefined_behavior_sanitizer)
#define KESTRUM_NEEDS_DESCRIPTORS
#endif
#endif
#ifndef KESTRUM_NEEDS_DESCRIPTORS
TEST(SignalPipe, ReportsThatNoDescriptorIsLeft)
{
    rlimit before{};
    ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
    const rlimit none{0, before.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &none), 0);
    EXPECT_THROW(SignalPipe({SIGHUP}), std::system_error);
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &before), 0);
}
#endif

} // namespace
} // namespace kestrum
