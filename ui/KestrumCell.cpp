#include "ui/KestrumCell.h"

namespace kestrum {
namespace {

constexpr double kTextSize = 15, kInset = 10, kGap = 50, kStripHeight = 50;

std::shared_ptr<Label> makeLabel(Toolkit& toolkit, Font font)
{
    auto label = toolkit.makeLabel();
    label->setFont(font);
    return label;
}

double centred(double height, Rect bounds)
{
    return (bounds.height - height) * 0.5;
}

} // namespace

KestrumCell::KestrumCell(Toolkit& toolkit, TableView& table, CellStyle style, std::string_view reuseIdentifier)
    : ReusableCell(table.makeCell(style), reuseIdentifier),
      _toolkit(toolkit),
      _key(makeLabel(toolkit, boldSystemFont(kTextSize)))
{}

std::shared_ptr<KestrumCell> KestrumCell::initWithStyleKey(Toolkit& toolkit, TableView& table, CellStyle style,
                                                           std::string_view reuseIdentifier)
{
    std::shared_ptr<KestrumCell> made(new KestrumCell(toolkit, table, style, reuseIdentifier));
    made->cell().addSubview(made->_key);
    return made;
}

std::shared_ptr<KestrumCell> KestrumCell::initWithStyle(Toolkit& toolkit, TableView& table, CellStyle style,
                                                        std::string_view reuseIdentifier)
{
    std::shared_ptr<KestrumCell> made(new KestrumCell(toolkit, table, style, reuseIdentifier));
    made->_value = makeLabel(toolkit, systemFont(kTextSize));
    made->_view = toolkit.makeScrollView();
    made->_view->addSubview(made->_key);
    made->_view->addSubview(made->_value);
    made->cell().addSubview(made->_view);
    return made;
}

void KestrumCell::setTexts(std::string_view key, std::optional<std::string_view> value)
{
    _key->setText(key);
    if (_value)
        _value->setText(value);
}

void KestrumCell::setLayoutKey()
{
    cell().layoutSubviews();
    placeKey(cell().contentBounds());
}

void KestrumCell::setLayout()
{
    cell().layoutSubviews();
    const Rect b = cell().contentBounds();
    const Size key = placeKey(b);
    if (!_view)
        return;

    // Kept: the value is measured in bold but drawn in the regular font, so that values stand where testers know them.
    const Size value = measured(_value.get());
    const double needed = key.width + kInset + kGap + value.width;
    const double x = needed < b.width ? b.width - value.width : b.x + kInset + key.width + kGap;
    _value->setFrame({x, centred(value.height, b), value.width, value.height});

    // Kept: wider than the texts need, so a row scrolls beyond the end of its value.
    const double content = needed > b.width ? b.width + key.width + value.width : b.width;
    _view->setContentSize({content, kStripHeight});
    _view->setFrame({b.x, b.y, b.width, kStripHeight});
}

Size KestrumCell::measured(const Label* label) const
{
    const auto text = label ? label->text() : std::nullopt;
    return text ? _toolkit.measure(*text, boldSystemFont(kTextSize)) : Size{};
}

Size KestrumCell::placeKey(Rect bounds)
{
    const Size size = measured(_key.get());
    _key->setFrame({bounds.x + kInset, centred(size.height, bounds), size.width, size.height});
    return size;
}

} // namespace kestrum
