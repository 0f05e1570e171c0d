#include "frontends/qt/Navigation.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Measures.h"
#include "frontends/qt/Paint.h"
#include "frontends/qt/Type.h"

#include <QAccessible>
#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>

namespace kestrum::qt {

namespace {

constexpr double kLeastTitleSize = 13;
constexpr int kLeastBackWidth = 72; // points; enough for a few letters of the previous title

void bring(QWidget& widget, QWidget& onto)
{
    widget.setParent(&onto);
    widget.setEnabled(true);
}

/// Disables all input to a widget that has left the screen: assistive technology may still refer to it.
void takeAway(QWidget& widget)
{
    widget.setParent(nullptr);
    widget.setEnabled(false);
}

/// The row that a sheet is about.
std::optional<std::size_t> rowFor(const SheetCommand& command, std::optional<std::size_t> row)
{
    return command.isOfRow ? row : std::nullopt;
}

/// The sheet as its owner has it. The widget outlives it where its own input ends it.
class OpenSheet final : public Sheet {
public:
    OpenSheet(SheetView& view, std::function<void()> closed) : _view(&view), _closed(std::move(closed)) {}
    ~OpenSheet() override
    {
        if (_view)
            _closed();
    }
    OpenSheet(const OpenSheet&) = delete;
    OpenSheet& operator=(const OpenSheet&) = delete;

    void setContents(SheetContents contents) override
    {
        if (_view)
            _view->setContents(contents);
    }

private:
    QPointer<SheetView> _view;
    std::function<void()> _closed;
};

} // namespace

TitleBar::TitleBar(QWidget* parent) : QWidget(parent), _back(Button::Kind::Back, {}, this), _title(this)
{
    setAutoFillBackground(true);
    _title.setFont(semiboldFont(kTitleSize));
    _title.setTextFormat(Qt::PlainText);
    _title.setAlignment(Qt::AlignCenter);
    _back.hide();
}

void TitleBar::setTitles(const std::vector<std::string>& titles)
{
    _title.setLine(lineOf(titles.empty() ? "" : titles.back()));
    _back.setVisible(titles.size() > 1);
    if (titles.size() > 1) {
        const QString to = lineOf(titles[titles.size() - 2]);
        _back.setText(to);
        _back.setAccessibleName(QStringLiteral("Back to %1").arg(to));
    }
    arrange();
}

void TitleBar::arrange()
{
    const int column = std::min(width(), kColumn), left = (width() - column) / 2, to = column - kInset;
    const bool hasBack = !_back.isHidden();
    const int whole = std::min(_back.sizeHint().width(), column * 2 / 5);
    const int least = std::min(whole, kLeastBackWidth);

    // The order in which space is saved: the back button keeps a few letters only, the title shrinks a little, the
    // button keeps only its chevron, the title shrinks further. A title that is still too long is set in two lines.
    int back = 0, from = kInset;
    const auto fits = [&](int backWidth) {
        back = hasBack ? backWidth : 0;
        from = hasBack ? back + kGap : kInset;
        return _title.wanted() <= to - from;
    };
    bool fitted = false;
    const std::pair<int, double> ways[] = {{least, kTextSize}, {kRowHeight, kLeastTitleSize}};
    for (const auto& [backWidth, leastSize] : ways)
        for (double size = kTitleSize; !fitted && size >= leastSize; --size) {
            _title.setFont(semiboldFont(size));
            fitted = fits(backWidth);
        }
    if (fitted && back > kRowHeight)
        fits(std::clamp(to - kGap - static_cast<int>(_title.wanted()), back, whole));
    _title.setLines(fitted ? 1 : 2);
    _back.setGeometry(left, 2, back, kRowHeight);
    // Centred in the bar if it fits there, else beside the button.
    const int wanted = fitted ? static_cast<int>(_title.wanted()) : to - from;
    const int x = std::clamp((column - wanted) / 2, from, to - wanted);
    _title.setGeometry(left + x, 2, wanted, kRowHeight);
    _title.setToolTip(_title.isCut() ? title() : QString());
}

void TitleBar::resizeEvent(QResizeEvent*)
{
    arrange();
}

void TitleBar::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    fillHairline(painter, *this, height(), 0, width(), coloursOf(*this).line);
}

Notice::Notice(QWidget* parent) : QLabel(parent)
{
    setFont(fontOf(systemFont(kStatusSize)));
    setTextFormat(Qt::PlainText);
    setWordWrap(true);
    setMargin(kInset);
    setAttribute(Qt::WA_TransparentForMouseEvents);
    hide();
}

void Notice::arrange(const QRect& over)
{
    const int high = std::min(heightForWidth(std::min(over.width(), kColumn)), over.height());
    setGeometry(over.x(), over.bottom() + 1 - high, over.width(), high);
}

void Notice::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.fillRect(rect(), coloursOf(*this).ground);
    fillHairline(painter, *this, 1 / devicePixelRatioF(), 0, width(), coloursOf(*this).line);
    painter.setPen(coloursOf(*this).ink);
    const int column = std::min(width(), kColumn), beside = (width() - column) / 2 + margin();
    painter.drawText(rect().adjusted(beside, margin(), -beside, -margin()), Qt::TextWordWrap, text());
}

Navigation::Navigation(NavigationViewDelegate& delegate)
    : _delegate(delegate),
      _panes(this),
      _bar(&_panes),
      _stage(&_panes),
      _notice(&_stage),
      _moments([this](Look asked) { look(asked); }, &_panes),
      _jump(&_panes)
{
    setAutoFillBackground(true);
    _stage.setBackgroundRole(QPalette::Base);
    _stage.setAutoFillBackground(true);
    connect(&_bar.back(), &QAbstractButton::clicked, this, [this] { goBack(); });
    connect(&_jump, &Jump::ended, this, [this] { takeFocus(); });
}

Navigation::~Navigation()
{
    _slide.finish();
    _rise.finish();
    // The controllers own the panes and the sheet.
    for (QWidget* each : std::initializer_list<QWidget*>{_table, _toolbar, _sheet})
        if (each)
            each->setParent(nullptr);
}

void Navigation::goBack()
{
    if (_depth > 1 && !_sheet && !_insight)
        _delegate.backRequested();
}

void Navigation::look(Look look)
{
    if (!_sheet)
        _delegate.lookRequested(look);
}

void Navigation::show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated)
{
    // This front end creates every screen, so the cast is safe.
    auto& screen = static_cast<Screen&>(pane);
    _slide.finish();
    Table* const old = _table;
    Toolbar* const oldBar = _toolbar;
    Table* const fresh = &screen.table();
    if (old == fresh)
        return setTitles(std::move(titles));
    _jump.end();

    const bool slides = animated && transition != Transition::None && old && old->isVisible() && motionWanted();
    QPointer<Still> still = slides ? new Still(*old, &_stage) : nullptr;
    _table = fresh;
    _toolbar = &screen.toolbar();
    bring(*fresh, _stage);
    bring(screen.toolbar(), _panes);
    fresh->clearSelection();
    fresh->onSwipeBack([this] { goBack(); });
    fresh->onMenu([this](std::optional<std::size_t> row) { return menuOf(row); });
    setTitles(std::move(titles));
    arrange();
    fresh->show();
    takeFocus();
    // The old pane refuses input at once. Only its picture stays until it has moved out of sight.
    if (old) {
        takeAway(*old);
        old->onSwipeBack(nullptr);
        old->onMenu(nullptr);
    }
    if (oldBar)
        takeAway(*oldBar);
    if (!still)
        return;
    still->show();
    fresh->raise();
    _notice.raise();
    // The old pane moves a little slower than the new one, which covers it.
    const int way = transition == Transition::Push ? _stage.width() : -_stage.width();
    _slide.start(
        kSlide,
        [this, still, way](double done) {
            if (_table)
                _table->move(qRound(way * (1 - done)), 0);
            if (still)
                still->move(qRound(-0.8 * way * done), 0);
        },
        [still] { delete still; });
}

std::vector<Table::MenuEntry> Navigation::menuOf(std::optional<std::size_t> row)
{
    std::vector<Table::MenuEntry> entries{
        {_moments.isHidden() ? QStringLiteral("Freeze") : QStringLiteral("Live"), [this] { look(Look::Freeze); }}};
    for (const auto& command : kSheetCommands)
        if (_delegate.offers(command.kind, rowFor(command, row)))
            entries.push_back({lineOf(command.name), [this, command] { requestSheet(command); }});
    entries.push_back({QStringLiteral("Keep the last 15 minutes"), [this] { keep(); }});
    return entries;
}

void Navigation::setTitles(std::vector<std::string> titles)
{
    _depth = titles.size();
    _bar.setTitles(titles);
    window()->setWindowTitle(_bar.title()); // the desktop appends the program's name
}

void Navigation::setToolbarHidden(bool hidden)
{
    _toolbarHidden = hidden;
    arrange();
}

void Navigation::setNotice(std::string_view text)
{
    const QString line = lineOf(text);
    _notice.setText(line);
    _notice.setAccessibleName(line);
    _notice.setVisible(!line.isEmpty());
    arrange();
    if (line.isEmpty())
        return;
    QAccessibleEvent alert(&_notice, QAccessible::Alert);
    QAccessible::updateAccessibility(&alert);
}

void Navigation::setFrozen(std::optional<FrozenMoment> moment)
{
    const QPointer<QWidget> focused = QApplication::focusWidget();
    _moments.setMoment(moment);
    arrange();
    // A button that is hidden must not pass the focus on to the next: another press would mean something else.
    if (focused && _moments.isAncestorOf(focused) && !focused->isVisible())
        takeFocus();
}

void Navigation::present(SaveInterface& screen, bool animated)
{
    _jump.end();
    // This front end creates every save interface, so the cast is safe.
    _sheet = static_cast<SaveSheet*>(&screen);
    bring(*_sheet, *this);
    _sheet->setGeometry(rect());
    _sheet->show();
    _sheet->raise();
    takeFocus();
    if (animated && motionWanted())
        _rise.start(kSheet, [this](double done) {
            if (_sheet)
                _sheet->setRisen(done);
        });
}

void Navigation::dismiss(bool animated)
{
    _rise.finish();
    if (!_sheet)
        return;
    SaveSheet* const sheet = std::exchange(_sheet, nullptr);
    const QPointer<Still> still = animated && motionWanted() ? new Still(sheet->card(), this) : nullptr;
    takeAway(*sheet);
    takeFocus();
    if (!still)
        return;
    still->show();
    const int from = still->y();
    _rise.start(
        kSheet,
        [this, still, from](double done) {
            if (still)
                still->move(still->x(), from + qRound((height() - from) * done));
        },
        [still] { delete still; });
}

std::unique_ptr<Sheet> Navigation::openSheet(SheetOwner& owner)
{
    _jump.end();
    _insight = new SheetView(owner, this);
    _insight->setGeometry(rect());
    _insight->show();
    takeFocus();
    return std::make_unique<OpenSheet>(*_insight, [this] { closeInsight(); });
}

void Navigation::closeInsight()
{
    SheetView* const view = std::exchange(_insight, nullptr);
    view->end();
    view->hide();
    takeFocus();
    view->deleteLater(); // its own input may have closed it
}

void Navigation::requestSheet(const SheetCommand& command)
{
    // The row of an open menu is the current one, and stays it when rows are added above it.
    const auto row = rowFor(command, _table ? _table->current() : std::nullopt);
    if (!_sheet && !_insight && _delegate.offers(command.kind, row))
        _delegate.sheetRequested(command.kind, row);
}

void Navigation::keep()
{
    if (!_sheet)
        _delegate.keepRequested();
}

void Navigation::takeFocus()
{
    // Widgets under a modal screen are disabled for Tab and for screen readers too.
    _panes.setEnabled(!_sheet && !_insight);
    if (_sheet)
        _sheet->takeFocus();
    else if (_insight)
        _insight->setFocus(Qt::OtherFocusReason);
    else if (_table)
        _table->setFocus(Qt::OtherFocusReason);
}

void Navigation::arrange()
{
    _panes.setGeometry(rect());
    const int bottom = _toolbarHidden || !_toolbar ? 0 : kBarHeight;
    const int moments = _moments.isHidden() ? 0 : kBarHeight;
    _bar.setGeometry(0, 0, width(), kBarHeight);
    _stage.setGeometry(0, kBarHeight, width(), std::max(0, height() - kBarHeight - moments - bottom));
    _moments.setGeometry(0, height() - bottom - kBarHeight, width(), kBarHeight);
    if (_table)
        _table->setGeometry(_stage.rect());
    _notice.arrange(_stage.rect());
    _notice.raise();
    _jump.setGeometry(0, height() - kBarHeight, width(), kBarHeight);
    if (_toolbar) {
        _toolbar->setGeometry(0, height() - bottom, width(), kBarHeight);
        _toolbar->setVisible(bottom > 0);
    }
}

void Navigation::resizeEvent(QResizeEvent*)
{
    _slide.finish();
    _rise.finish();
    arrange();
    if (_sheet)
        _sheet->setGeometry(rect());
    if (_insight)
        _insight->setGeometry(rect());
}

void Navigation::keyPressEvent(QKeyEvent* event)
{
    const int key = event->key();
    const bool control = event->modifiers() == Qt::ControlModifier, alt = event->modifiers() == Qt::AltModifier;
    const bool back = key == Qt::Key_Escape || key == Qt::Key_Backspace || key == Qt::Key_Back;
    const bool once = !event->isAutoRepeat();
    if (once && (back || (alt && key == Qt::Key_Left)))
        goBack();
    else if (once && key == Qt::Key_Space && !event->modifiers())
        look(Look::Freeze);
    else if (event->text() == u"," || event->text() == u".")
        look(event->text() == u"," ? Look::Earlier : Look::Later);
    else if (once && event->text() == QLatin1Char(kKeepKey))
        keep();
    else if (const auto* command = sheetCommandOf(*event); once && command)
        requestSheet(*command);
    else if (once && control && key == Qt::Key_S)
        pressSave();
    else if (once && _table && ((control && key == Qt::Key_F) || event->text() == u"/"))
        _jump.start(*_table);
    else if (once && _table && (key == Qt::Key_F3 || event->text() == u"n"))
        _jump.again(*_table);
    else
        event->ignore();
}

void Navigation::pressSave()
{
    if (Button* save = _toolbar ? _toolbar->save() : nullptr)
        save->click();
}

void Navigation::mousePressEvent(QMouseEvent* event)
{
    if (event->button() == Qt::BackButton)
        goBack();
    else
        event->ignore();
}

} // namespace kestrum::qt
