#pragma once

#include "platform/propertylist/PropertyListCodec.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <utility>

/// What the readers and the writer share: not for other folders.
namespace kestrum::propertylist {

/// Thrown by whatever finds a property list to be none; never leaves this folder.
struct Refusal {
    std::string reason;
    std::size_t offset = 0;
};

/// How much may still be made of a list. What is shared counts each time it is met: that is what it costs.
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

/// Throws where one container more would nest too deeply inside the `open` ones.
inline void checkDepth(std::size_t open)
{
    if (open >= PropertyListCodec::kMaxDepth)
        throw Refusal{"nested too deeply"};
}

} // namespace kestrum::propertylist
