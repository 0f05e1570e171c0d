#include "frontends/qt/Cell.h"

#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QPainter>
#include <QScroller>
#include <algorithm>

namespace kestrum::qt {

namespace {

constexpr double kMark = 12; // width reserved for a chevron or check mark

} // namespace

Cell::Cell(CellStyle style) : _textLabel(std::make_shared<TextLabel>())
{
    setAttribute(Qt::WA_TransparentForMouseEvents);
    setAttribute(Qt::WA_OpaquePaintEvent);
    resize(kPhoneWidth, kRowHeight);
    _textLabel->setFont(systemFont(kTextSize));
    if (style == CellStyle::Default)
        Cell::addSubview(_textLabel);
    else
        _textLabel->setHolder(this);
    hide();
}

Rect Cell::contentBounds() const
{
    const double trailing = _accessory == Accessory::None ? kInset : 2 * kInset + kMark;
    return {0, 0, std::max(0.0, width() - trailing), static_cast<double>(height())};
}

void Cell::layoutSubviews()
{
    const Rect bounds = contentBounds();
    _textLabel->setFrame({kInset, 0, std::max(0.0, bounds.width - kInset), bounds.height});
}

void Cell::setAccessory(Accessory accessory)
{
    if (accessory == _accessory)
        return;
    _accessory = accessory;
    update();
}

void Cell::addSubview(std::shared_ptr<View> view)
{
    if (auto* drawn = dynamic_cast<Drawn*>(view.get()))
        drawn->setHolder(this);
    _views.push_back(std::move(view));
    update();
}

void Cell::setRow(std::size_t row)
{
    if (Strip* scrollable = strip(); scrollable && row != _row && QScroller::hasScroller(scrollable))
        QScroller::scroller(scrollable)->stop();
    _row = row;
}

void Cell::setLook(Look look)
{
    if (look == _look)
        return;
    _look = look;
    update();
}

Strip* Cell::strip() const
{
    for (const auto& view : _views)
        if (auto* strip = dynamic_cast<Strip*>(view.get()); strip && strip->reach() > 0)
            return strip;
    return nullptr;
}

double Cell::sideways() const
{
    const Strip* scrollable = strip();
    return scrollable ? scrollable->offset() : 0;
}

void Cell::setSideways(double offset)
{
    if (Strip* scrollable = strip())
        scrollable->setOffset(offset);
}

QStringList Cell::texts() const
{
    QStringList texts;
    for (const auto& view : _views)
        if (const auto* drawn = dynamic_cast<const Drawn*>(view.get()))
            texts += drawn->texts();
    return texts;
}

QString Cell::spoken() const
{
    QStringList spoken = texts();
    spoken.removeAll(QString());
    return spoken.join(QStringLiteral(", "));
}

bool Cell::isCut() const
{
    const double width = contentBounds().width;
    return std::any_of(_views.begin(), _views.end(), [&](const auto& view) {
        const auto* drawn = dynamic_cast<const Drawn*>(view.get());
        return drawn && drawn->isCut(width);
    });
}

void Cell::paintEvent(QPaintEvent*)
{
    const Colours& colours = coloursOf(*this);
    const QColor background = _look.pressed ? colours.pressed() : _look.selected ? colours.selected() : colours.surface;
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.fillRect(rect(), background);

    const Rect content = contentBounds();
    painter.save();
    painter.setClipRect(rectOf(content));
    for (const auto& view : _views)
        if (const auto* drawn = dynamic_cast<const Drawn*>(view.get()))
            drawn->paint(painter, {colours, background, content.width});
    painter.restore();
    // drawn last, so that no fade covers it
    fillHairline(painter, *this, height(), kInset, width() - kInset, colours.line);

    const QPointF middle(width() - kInset - kMark / 2, height() / 2.0);
    if (_accessory == Accessory::DisclosureIndicator)
        strokeChevron(painter, middle + QPointF(2, 0), Qt::RightArrow, colours.muted);
    else if (_accessory == Accessory::CheckMark)
        strokeCheckMark(painter, middle, colours.accent);
    if (_look.ringed)
        strokeRing(painter, QRectF(rect()).adjusted(3, 1, -4, -2), colours.accent);
}

} // namespace kestrum::qt
