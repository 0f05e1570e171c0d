#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A list that stays empty: it is not known which cells of its record belong to it. Each record empties it.
class PlaceholderList : public Base {
public:
    using Base::Base;

private:
    void decode(Record, const Layout&) final { clearElementsInArray(sectionRef); }
};

} // namespace kestrum
