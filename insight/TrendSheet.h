#pragma once

#include "insight/RowOfPane.h"
#include "insight/SheetSource.h"
#include "support/Date.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class Clock;
class History;
class Thresholds;
struct KeyEntry;

/// How the value of a row has been. It follows the row by its identity: neighbours change places.
class TrendSheet final : public SheetSource {
public:
    static constexpr std::size_t kMostPoints = 1440;

    /// The history, the thresholds and the clock outlive it.
    TrendSheet(const Shown& shown, const RowOfPane& row, const History& history, const Thresholds& thresholds,
               const Clock& clock);

    /// The right end is the moment that is shown: the newest, or the one at which the panes stand still.
    bool update(const Shown& shown) override;
    void cursorMoved(std::optional<std::size_t> to) override;
    void rangeChosen(std::size_t range) override;

private:
    /// Numbers from a moment on: one of a refresh, or those of a minute. Not numbers: a gap.
    struct Sample {
        Date time;
        double least, mean, greatest;
    };

    void fill();
    void fillNumbers(SheetPart& part);
    void fillWords(SheetPart& part);
    void fillAxis(SheetPlot& plot, const std::vector<Sample>& samples) const;
    void fillBands(SheetPlot& plot) const;
    void fillTimes(SheetPlot& plot) const;
    void markCellChanges(SheetPlot& plot) const;

    std::vector<Sample> samples() const;
    Date begin() const;
    double placeOf(Date time) const;
    std::optional<double> shownNumber(double number) const;
    SheetCell cellOf(double number) const;
    std::string timeText(Date time) const;
    std::optional<std::size_t> cursorIndex() const;
    std::string readingOf(const Sample& sample) const;

    const History& _history;
    const Thresholds& _thresholds;
    const Clock& _clock;
    std::string _path; ///< as Trends has it
    const KeyEntry* _entry = nullptr;
    std::optional<std::string> _technology; ///< that the row has beside the value
    std::string _unit;                      ///< of the numbers that are shown
    std::optional<Date> _end;               ///< the right end; nothing: nothing has been shown yet
    std::size_t _range = 0;
    std::optional<Date> _cursor;
    std::vector<Date> _times; ///< of the points, or the beginnings of the spans
};

} // namespace kestrum
