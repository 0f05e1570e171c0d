#include "insight/Thresholds.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

TEST(Grade, IsAWordFirst)
{
    EXPECT_EQ(word(Grade::Excellent), "excellent");
    EXPECT_EQ(word(Grade::NoService), "no service");
}

} // namespace
} // namespace kestrum
