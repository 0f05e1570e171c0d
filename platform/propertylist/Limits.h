#pragma once

#include "platform/propertylist/PropertyListCodec.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <utility>

/// Shared by the readers and the writer; not for other folders.
namespace kestrum::propertylist {

/// Thrown by a reader or the writer that refuses a property list. Caught inside this folder.
struct Refusal {
    std::string reason;
    std::size_t offset = 0;
};

/// The values and bytes that reading or writing a list may still use. A shared object counts each time it occurs.
class Budget {
public:
    Budget(std::size_t nodes, std::size_t bytes) : _nodes(nodes), _bytes(bytes) {}

    void takeNode()
    {
        if (_nodes == 0)
            throw Refusal{"too many values"};
        --_nodes;
    }
    void takeBytes(std::size_t count)
    {
        if (count > _bytes)
            throw Refusal{"too many bytes"};
        _bytes -= count;
    }

private:
    std::size_t _nodes, _bytes;
};

/// Throws `Refusal` when one more container inside `open` containers would exceed the depth limit.
inline void checkDepth(std::size_t open)
{
    if (open >= PropertyListCodec::kMaxDepth)
        throw Refusal{"nested too deeply"};
}

} // namespace kestrum::propertylist
