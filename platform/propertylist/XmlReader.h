#pragma once

#include "support/Value.h"

namespace kestrum::propertylist {

/// The value of a property list in XML; throws `Refusal` for anything else.
Value readXml(Bytes bytes);

} // namespace kestrum::propertylist
