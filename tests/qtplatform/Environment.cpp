#include "qtplatform/EventLoop.h"

namespace {

[[maybe_unused]] const auto* const environment = testing::AddGlobalTestEnvironment(new kestrum::EventLoopEnvironment);

} // namespace
