#pragma once

#include "platform/ToolbarItem.h"

#include <QLabel>
#include <QVariantAnimation>
#include <QWidget>
#include <vector>

namespace kestrum::qt {

class Button;

/// A small grey circle that turns during a wait.
class Spinner final : public QWidget {
public:
    explicit Spinner(QWidget* parent = nullptr);
    void setRunning(bool running);
    bool isRunning() const { return _running; }
    bool isTurning() const { return _turning.state() == QAbstractAnimation::Running; }

protected:
    void paintEvent(QPaintEvent*) override;
    void showEvent(QShowEvent*) override;
    void hideEvent(QHideEvent*) override;

private:
    /// Turns while it is visible, unless the desktop is set to reduced motion.
    void turn();

    bool _running = false;
    QVariantAnimation _turning;
};

/// A text of one or more lines, cut short where it does not fit. A screen reader gets the whole text.
class LineLabel final : public QLabel {
public:
    using QLabel::QLabel;
    void setLine(const QString& line);
    double wanted() const; ///< the width of the whole text in one line
    /// Sets the maximum number of lines.
    void setLines(int lines);
    bool isCut() const;

protected:
    void resizeEvent(QResizeEvent* event) override;

private:
    QString _line;
    int _lines = 1;
};

/// The bar under a pane. An item that keeps its position keeps its widget, even when its text changes.
class Toolbar final : public QWidget {
public:
    Toolbar();
    void setItems(std::vector<ToolbarItem> items);
    /// The widget of an item; null for a space.
    QWidget* widgetAt(std::size_t item) const { return item < _items.size() ? _items[item].widget : nullptr; }

    /// Null where Save is not available.
    Button* save() const;

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;

private:
    struct Item {
        ToolbarItem item;
        QWidget* widget; ///< a child of this
    };
    QWidget* makeWidget(const ToolbarItem& item);
    void arrange();

    std::vector<Item> _items;
    std::function<void()> _saveAction;
};

} // namespace kestrum::qt
