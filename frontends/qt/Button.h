#pragma once

#include <QAbstractButton>

namespace kestrum::qt {

/// A button of text: on nothing, on accent, or the one that goes back.
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
