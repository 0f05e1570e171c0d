#pragma once

#include "insight/Glance.h"

#include <map>
#include <string>
#include <vector>

namespace kestrum {

/// The whole display in one look: the serving cell with its levels, the states, and the best neighbours.
class Overview {
public:
    /// The thresholds outlive it.
    Overview(std::string technology, const Thresholds& thresholds)
        : _technology(std::move(technology)), _thresholds(&thresholds)
    {}

    /// The parts that have contents, for a newer tree.
    std::vector<SheetPart> update(const KestrumModelNode& root);

private:
    std::string _technology;
    const Thresholds* _thresholds;
    std::map<std::string, Glance, std::less<>> _lists; ///< by path; they keep the order of their rows
};

} // namespace kestrum
