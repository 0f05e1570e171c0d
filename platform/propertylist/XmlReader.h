#pragma once

#include "support/Value.h"

namespace kestrum::propertylist {

/// The value of a property list in XML; throws `Refusal` for anything else. Made of the containers and texts of the
/// `spent` one where it can.
Value readXml(Bytes bytes, Value spent = {});

} // namespace kestrum::propertylist
