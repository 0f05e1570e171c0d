#pragma once

#include <QAbstractButton>

namespace kestrum::qt {

/// A text button: plain, filled with the accent colour, or the back button.
class Button final : public QAbstractButton {
public:
    enum class Kind { Plain, Filled, Back };

    explicit Button(Kind kind, const QString& text = {}, QWidget* parent = nullptr);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override { return sizeHint(); }

protected:
    void paintEvent(QPaintEvent*) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    Kind _kind;
};

} // namespace kestrum::qt
