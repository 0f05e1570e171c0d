#pragma once

#include "platform/ChannelMessage.h"
#include "platform/Roles.h"
#include "support/Record.h"
#include "support/Value.h"

#include <optional>
#include <string_view>

namespace kestrum {

/// The property list after an extra-code record's header; null when it is malformed.
Value propertyListIn(Record record, DecodingRoles& roles);

/// The telephony service's cell-monitor record: an array of cell dictionaries. Logs "Cell Info Array data could not
/// be constructed" when the record holds no such array.
class CellInfoArray {
public:
    CellInfoArray(Record record, DecodingRoles& roles);

    /// The cells; null when the record holds no array of cells.
    const ArrayRef& cells() const { return _cells; }

private:
    ArrayRef _cells;
};

/// Whether a cell has the technology and the type. False for a value that is no dictionary.
bool isCell(const Value& cell, std::string_view technology, std::string_view type);

/// A number of a cell as 32 bits; nothing when it is absent or not such a number.
std::optional<std::int32_t> cellNumber(const Value& cell, std::string_view key);

/// The telephony service's PDP-context record: an array of rows. `contexts` is null, without a log line, when the
/// record holds no array.
class PDPContextArray {
public:
    PDPContextArray(Record record, DecodingRoles& roles) : _contexts(propertyListIn(record, roles).array()) {}

    const ArrayRef& contexts() const { return _contexts; }

private:
    ArrayRef _contexts;
};

} // namespace kestrum
