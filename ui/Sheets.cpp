#include "ui/Sheets.h"

#include "core/KestrumModelNode.h"
#include "insight/CellSheet.h"
#include "insight/EventSheet.h"
#include "insight/Glance.h"
#include "insight/History.h"
#include "insight/MeaningSheet.h"
#include "insight/Overview.h"
#include "insight/TrendSheet.h"
#include "ui/KestrumPaneController.h"

#include <utility>

namespace kestrum {
namespace {

class GlanceSheet final : public SheetSource {
public:
    GlanceSheet(std::string_view technology, std::string path, const Thresholds& thresholds)
        : _glance(std::string(technology), std::move(path), thresholds)
    {
        _contents.canSort = true;
    }

    bool update(const Shown& shown) override
    {
        if (!shown.root || !_glance.update(*shown.root))
            return false;
        take();
        return true;
    }
    void columnChosen(std::size_t column) override
    {
        _glance.sortBy(column);
        take();
    }

private:
    void take()
    {
        _contents.title = _glance.title();
        _contents.parts = {_glance.part()};
    }

    Glance _glance;
};

class OverviewSheet final : public SheetSource {
public:
    OverviewSheet(std::string_view technology, const Thresholds& thresholds)
        : _overview(std::string(technology), thresholds)
    {
        _contents.title = "Overview";
        _contents.hint = "The display has no cell that the overview knows.";
    }

    bool update(const Shown& shown) override
    {
        _contents.parts = shown.root ? _overview.update(*shown.root) : std::vector<SheetPart>();
        return true;
    }

private:
    Overview _overview;
};

} // namespace

bool Sheets::offers(SheetKind kind, std::string_view technology, const KestrumPaneController& pane,
                    std::optional<std::size_t> row) const
{
    if (_sheet || technology.empty())
        return false;
    const auto child = row ? pane.childAt(*row) : nullptr;
    switch (kind) {
    case SheetKind::Glance:
        return pane.node() && isGlanceable(technology, pane.path(), *pane.node());
    case SheetKind::Overview:
        return pane.node() && pane.path() == kRootPath;
    case SheetKind::Trend:
        return child && child->value() != nullptr;
    case SheetKind::Meaning:
        return child != nullptr;
    case SheetKind::Events:
    case SheetKind::Cells:
        return true;
    }
    return false;
}

void Sheets::open(SheetKind kind, const Shown& shown, const KestrumPaneController& pane, std::optional<std::size_t> row)
{
    _technology = shown.technology;
    _source = makeSource(kind, shown, pane.path(), row.value_or(0));
    _sheet = _view.openSheet(*this);
    refresh(shown);
}

std::unique_ptr<SheetSource> Sheets::makeSource(SheetKind kind, const Shown& shown, const std::string& path,
                                                std::size_t row)
{
    switch (kind) {
    case SheetKind::Glance:
        return std::make_unique<GlanceSheet>(shown.technology, path, _thresholds);
    case SheetKind::Overview:
        return std::make_unique<OverviewSheet>(shown.technology, _thresholds);
    case SheetKind::Trend:
        return std::make_unique<TrendSheet>(shown, RowOfPane{path, row}, _history, _thresholds, _clock);
    case SheetKind::Meaning:
        return std::make_unique<MeaningSheet>(shown, RowOfPane{path, row}, _thresholds);
    case SheetKind::Events:
        return std::make_unique<EventSheet>(_history.events(), _clock);
    case SheetKind::Cells:
        break;
    }
    return std::make_unique<CellSheet>(_history, _clock);
}

void Sheets::refresh(const Shown& shown)
{
    if (_sheet && (shown.technology != _technology || !_source->update(shown)))
        close();
}

void Sheets::show(std::string_view status)
{
    _status = status;
    if (!_sheet)
        return;
    auto contents = _source->contents();
    contents.status = status;
    _sheet->setContents(std::move(contents));
}

void Sheets::close()
{
    _sheet.reset();
    _source.reset();
}

void Sheets::columnChosen(std::size_t column)
{
    _source->columnChosen(column);
    showAgain();
}

void Sheets::cursorMoved(std::optional<std::size_t> to)
{
    _source->cursorMoved(to);
    showAgain();
}

void Sheets::rangeChosen(std::size_t range)
{
    _source->rangeChosen(range);
    showAgain();
}

} // namespace kestrum
