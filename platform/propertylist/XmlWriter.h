#pragma once

#include "support/Value.h"

#include <string>

namespace kestrum::propertylist {

/// The value, which is not null, as a property list in XML; throws `Refusal` when it has no such form.
std::string writeXml(const Value& value);

} // namespace kestrum::propertylist
