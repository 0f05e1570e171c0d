#pragma once

#include <cstddef>
#include <string>

namespace kestrum {

/// A row of the pane at a path.
struct RowOfPane {
    std::string path;
    std::size_t row;
};

} // namespace kestrum
