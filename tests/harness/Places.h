#pragma once

#include <string>
#include <string_view>

namespace kestrum {

/// The path of a file in the checkout: inCheckout("captures/lte.kcap").
std::string inCheckout(std::string_view path);

/// The path of a built program: builtProgram("voxd"). It may contain blanks.
std::string builtProgram(std::string_view name);

} // namespace kestrum
