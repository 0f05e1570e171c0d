#pragma once

#include "core/KestrumModelNode.h"
#include "insight/Moments.h"
#include "platform/Sheet.h"

#include <cstddef>
#include <optional>
#include <string_view>

namespace kestrum {

/// What the panes show.
struct Shown {
    std::string_view technology = {};
    KestrumModelNodeRef root = {};     ///< null: nothing
    std::optional<Moment> moment = {}; ///< of `root`; nothing when it is not known
};

/// What a sheet shows, all but the status.
class SheetSource {
public:
    SheetSource() = default;
    virtual ~SheetSource() = default;
    SheetSource(const SheetSource&) = delete;
    SheetSource& operator=(const SheetSource&) = delete;

    /// The panes show something newer. False when it has nothing left to show: its sheet is closed.
    virtual bool update(const Shown& shown) = 0;
    /// Valid until the next call.
    const SheetContents& contents() const { return _contents; }

    // What the user does; see SheetOwner. The contents follow at once.
    virtual void columnChosen(std::size_t) {}
    virtual void cursorMoved(std::optional<std::size_t>) {}
    virtual void rangeChosen(std::size_t) {}

protected:
    SheetContents _contents;
};

} // namespace kestrum
