#include "ui/Sheets.h"

#include "core/KestrumModelNode.h"

#include <utility>

namespace kestrum {

bool Sheets::offers(SheetKind kind, std::string_view technology, std::string_view path,
                    const KestrumModelNodeRef& node) const
{
    if (_sheet || !node)
        return false;
    if (kind == SheetKind::Overview)
        return path == kRootPath;
    return kind == SheetKind::Glance && isGlanceable(technology, path, *node);
}

void Sheets::open(SheetKind kind, std::string_view technology, std::string_view path)
{
    _technology = technology;
    _contents = {};
    if (kind == SheetKind::Overview)
        _source = Overview(_technology, _thresholds);
    else
        _source = Glance(_technology, std::string(path), _thresholds);
    _sheet = _view.openSheet(*this);
}

void Sheets::refresh(std::string_view technology, const KestrumModelNodeRef& root)
{
    if (!_sheet)
        return;
    if (technology != _technology)
        return close();
    if (auto* glance = std::get_if<Glance>(&_source)) {
        if (!root || !glance->update(*root))
            return close();
        takeGlance(*glance);
    } else if (auto* overview = std::get_if<Overview>(&_source)) {
        _contents.title = "Overview";
        _contents.parts = root ? overview->update(*root) : std::vector<SheetPart>();
        _contents.hint = "The display has no cell that the overview knows.";
    }
}

void Sheets::takeGlance(const Glance& glance)
{
    _contents.title = glance.title();
    _contents.parts = {glance.part()};
    _contents.canSort = true;
}

void Sheets::show(std::string_view status)
{
    if (!_sheet)
        return;
    _contents.status = status;
    _sheet->setContents(_contents);
}

void Sheets::close()
{
    _sheet.reset();
    _source = std::monostate();
    _contents = {};
}

void Sheets::columnChosen(std::size_t column)
{
    auto* glance = std::get_if<Glance>(&_source);
    if (!glance)
        return;
    glance->sortBy(column);
    takeGlance(*glance);
    _sheet->setContents(_contents);
}

} // namespace kestrum
