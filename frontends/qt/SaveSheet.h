#pragma once

#include "frontends/qt/Button.h"
#include "frontends/qt/Table.h"
#include "frontends/qt/Toolbar.h"
#include "platform/SaveInterface.h"

#include <QLineEdit>

namespace kestrum::qt {

/// A rounded surface that covers part of the window.
class Card final : public QWidget {
public:
    using QWidget::QWidget;
    void setBottomSquare(bool square) { _bottomSquare = square; }

    static constexpr int kRadius = 12;

protected:
    void paintEvent(QPaintEvent*) override;

private:
    bool _bottomSquare = false; ///< for a card at the screen's lower edge
};

class DescriptionField final : public QLineEdit, public TextField {
public:
    explicit DescriptionField(QWidget* parent);
    std::optional<std::string> text() const override { return QLineEdit::text().toStdString(); }
    void resignFirstResponder() override;

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QString _kept;
};

/// The save screen: a sheet over the panes.
class SaveSheet final : public QWidget, public SaveInterface {
public:
    explicit SaveSheet(SaveInterfaceOwner& owner);

    TableView& saveContentTable() override { return _table; }
    TextField& saveDescription() override { return _description; }
    void setFrame(Rect frame) override;

    Table& table() { return _table; }
    QLineEdit& description() { return _description; }
    Button& save() { return _save; }
    Button& cancel() { return _cancel; }
    Card& card() { return _card; }
    /// How far the sheet has moved up, 0 to 1.
    void setRisen(double risen);
    void takeFocus();

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    bool focusNextPrevChild(bool next) override;

private:
    void arrange();

    SaveInterfaceOwner& _owner;
    double _risen = 1;
    Card _card;
    Button _cancel, _save;
    LineLabel _title;
    DescriptionField _description;
    Table _table;
};

} // namespace kestrum::qt
