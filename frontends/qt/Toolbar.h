#pragma once

#include "platform/ToolbarItem.h"

#include <QLabel>
#include <QVariantAnimation>
#include <QWidget>
#include <vector>

namespace kestrum::qt {

class Button;

/// Small and grey, turning while something is awaited.
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
    /// Turns while it is seen, unless the desktop asks for reduced motion.
    void turn();

    bool _running = false;
    QVariantAnimation _turning;
};

/// One line, or a few, cut short to one where there is no room for it; a screen reader hears it whole.
class LineLabel final : public QLabel {
public:
    using QLabel::QLabel;
    void setLine(const QString& line);
    double wanted() const; ///< the width of the whole line
    /// May be broken into that many.
    void setLines(int lines);
    bool isCut() const;

protected:
    void resizeEvent(QResizeEvent* event) override;

private:
    QString _line;
    int _lines = 1;
};

/// The bar under a pane. An item that stays at its place keeps its widget, whatever it says.
class Toolbar final : public QWidget {
public:
    Toolbar();
    void setItems(std::vector<ToolbarItem> items);
    /// The widget of an item; null for a space.
    QWidget* widgetAt(std::size_t item) const { return item < _items.size() ? _items[item].widget : nullptr; }

    /// Null where Save is not offered.
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
