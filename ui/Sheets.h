#pragma once

#include "insight/SheetSource.h"
#include "insight/Thresholds.h"
#include "platform/NavigationView.h"
#include "platform/Sheet.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace kestrum {

class Clock;
class History;
class KestrumPaneController;

/// The sheets over the panes: at most one is open.
class Sheets final : private SheetOwner {
public:
    /// All but the thresholds are borrowed.
    Sheets(NavigationView& view, History& history, Thresholds thresholds, const Clock& clock)
        : _view(view), _history(history), _clock(clock), _thresholds(std::move(thresholds))
    {}

    /// Whether the pane, or the row of it, has the sheet.
    bool offers(SheetKind kind, std::string_view technology, const KestrumPaneController& pane,
                std::optional<std::size_t> row) const;
    /// Opens a sheet that is offered. Empty until `show`.
    void open(SheetKind kind, const Shown& shown, const KestrumPaneController& pane, std::optional<std::size_t> row);
    /// The panes show something newer. Closes a sheet of another technology, or of a list that is gone.
    void refresh(const Shown& shown);
    void show(std::string_view status);
    void close();

private:
    void sheetLeft() override { close(); }
    void columnChosen(std::size_t column) override;
    void cursorMoved(std::optional<std::size_t> to) override;
    void rangeChosen(std::size_t range) override;

    std::unique_ptr<SheetSource> makeSource(SheetKind kind, const Shown& shown, const std::string& path,
                                            std::size_t row);
    void showAgain() { show(std::string(_status)); }

    NavigationView& _view;
    History& _history;
    const Clock& _clock;
    const Thresholds _thresholds;
    std::unique_ptr<Sheet> _sheet;
    std::unique_ptr<SheetSource> _source; ///< not null while the sheet is open
    std::string _technology, _status;
};

} // namespace kestrum
