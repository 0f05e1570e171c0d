#pragma once

#include "frontends/qt/Drawn.h"
#include "platform/TableCell.h"

#include <QWidget>
#include <vector>

namespace kestrum::qt {

/// One row. Its table sets its position and its look. It handles no input.
class Cell final : public QWidget, public TableCell {
public:
    explicit Cell(CellStyle style);

    Rect contentBounds() const override;
    void layoutSubviews() override;
    void setAccessory(Accessory accessory) override;
    void addSubview(std::shared_ptr<View> view) override;
    Label& textLabel() override { return *_textLabel; }

    /// The row that it shows, or showed last. A strip that still scrolls stays with the row that the cell leaves.
    std::size_t row() const { return _row; }
    void setRow(std::size_t row);

    struct Look {
        bool pressed = false, selected = false, ringed = false;
        friend bool operator==(const Look&, const Look&) = default;
    };
    void setLook(Look look);
    Look look() const { return _look; }

    Accessory accessory() const { return _accessory; }
    /// The strip that can be scrolled sideways; null when all of its content is in view.
    Strip* strip() const;
    double sideways() const; ///< the strip's offset; 0 without a strip
    void setSideways(double offset);
    /// Whether part of its text is out of sight.
    bool isCut() const;
    /// The texts of its labels in order: the key, then the value.
    QStringList texts() const;
    QString name() const { return texts().value(0); }
    /// The text for screen readers: "key, value".
    QString spoken() const;

protected:
    void paintEvent(QPaintEvent*) override;

private:
    Accessory _accessory = Accessory::None;
    Look _look;
    std::size_t _row = 0;
    std::shared_ptr<TextLabel> _textLabel; ///< the label of the default style
    std::vector<std::shared_ptr<View>> _views;
};

} // namespace kestrum::qt
