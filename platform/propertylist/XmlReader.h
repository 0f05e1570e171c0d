#pragma once

#include "support/Value.h"

namespace kestrum::propertylist {

/// Reads a property list in XML; throws `Refusal` for anything else. Reuses the containers and texts of `spent`.
Value readXml(Bytes bytes, Value spent = {});

} // namespace kestrum::propertylist
