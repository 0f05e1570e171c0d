#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A list that stays empty: which cells of its record belong to it is not known. The record empties it, nothing fills
/// it.
class PlaceholderList : public Base {
public:
    using Base::Base;

private:
    void decode(Record, const Layout&) final { clearElementsInArray(sectionRef); }
};

} // namespace kestrum
