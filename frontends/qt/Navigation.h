#pragma once

#include "frontends/qt/Button.h"
#include "frontends/qt/Jump.h"
#include "frontends/qt/MomentBar.h"
#include "frontends/qt/Motion.h"
#include "frontends/qt/SaveSheet.h"
#include "frontends/qt/Screen.h"
#include "frontends/qt/SheetView.h"
#include "platform/NavigationView.h"

#include <QPointer>

namespace kestrum::qt {

/// The title of the current pane and the back button.
class TitleBar final : public QWidget {
public:
    explicit TitleBar(QWidget* parent);
    void setTitles(const std::vector<std::string>& titles);
    Button& back() { return _back; }
    QString title() const { return _title.accessibleName(); }
    const LineLabel& label() const { return _title; }

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;

private:
    void arrange();

    Button _back;
    LineLabel _title;
};

/// A short report of a finished action, over the lower end of the panes. It handles no input.
class Notice final : public QLabel {
public:
    explicit Notice(QWidget* parent);
    void arrange(const QRect& over);

protected:
    void paintEvent(QPaintEvent* event) override;
};

/// Title bar, the top pane's table, and its toolbar. The save sheet covers them while it is presented.
class Navigation final : public QWidget, public NavigationView {
public:
    explicit Navigation(NavigationViewDelegate& delegate);
    ~Navigation() override;

    using QWidget::show;
    void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) override;
    void setTitles(std::vector<std::string> titles) override;
    void setToolbarHidden(bool hidden) override;
    void setNotice(std::string_view text) override;
    void setFrozen(std::optional<FrozenMoment> moment) override;
    void present(SaveInterface& screen, bool animated) override;
    void dismiss(bool animated) override;
    std::unique_ptr<Sheet> openSheet(SheetOwner& owner) override;

    TitleBar& titleBar() { return _bar; }
    Table* table() const { return _table; }
    const Notice& notice() const { return _notice; }
    Toolbar* toolbar() const { return _toolbar; }
    SaveSheet* sheet() const { return _sheet; }
    SheetView* insight() const { return _insight; } ///< the open sheet of `openSheet`, null for none
    Jump& jump() { return _jump; }
    MomentBar& momentBar() { return _moments; }
    bool isMoving() const { return _slide.isRunning() || _rise.isRunning(); }
    /// Gives the keyboard focus to the topmost part: the sheet, or the pane.
    void takeFocus();

protected:
    void resizeEvent(QResizeEvent*) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;

private:
    void arrange();
    void goBack();
    void pressSave();
    void look(Look look);
    void keep();
    std::vector<Table::MenuEntry> menuOf(std::optional<std::size_t> row);
    void requestSheet(const SheetCommand& command);
    void closeInsight();

    NavigationViewDelegate& _delegate;
    QWidget _panes; ///< the bars and the stage: everything that a modal screen covers
    TitleBar _bar;
    QWidget _stage; ///< contains everything that slides
    Notice _notice; ///< over the stage's lower end
    MomentBar _moments;
    Jump _jump;
    QPointer<Table> _table;
    QPointer<Toolbar> _toolbar;
    QPointer<SaveSheet> _sheet;
    QPointer<SheetView> _insight;
    std::size_t _depth = 0;
    bool _toolbarHidden = true;
    Movement _slide, _rise;
};

} // namespace kestrum::qt
