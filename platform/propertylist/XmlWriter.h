#pragma once

#include "support/Value.h"

#include <string>

namespace kestrum::propertylist {

/// Writes a value, which is not null, as a property list in XML. Throws `Refusal` when it has no XML form.
std::string writeXml(const Value& value);

} // namespace kestrum::propertylist
