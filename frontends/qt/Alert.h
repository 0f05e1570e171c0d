#pragma once

#include "frontends/qt/Button.h"
#include "frontends/qt/SaveSheet.h"

#include <functional>

namespace kestrum::qt {

/// A message on a card over the dimmed window, with the button that closes it.
class Alert final : public QWidget {
public:
    Alert(const QString& title, const QString& message, const QString& button, std::function<void()> closed,
          QWidget* parent);

    Button& button() { return _button; }
    QString title() const { return _title.text(); }
    QString message() const { return _message.text(); }

protected:
    void paintEvent(QPaintEvent*) override;
    void resizeEvent(QResizeEvent*) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent*) override {} // widgets below get no input
    void changeEvent(QEvent* event) override;
    bool focusNextPrevChild(bool) override { return true; }

private:
    void colour();
    void close();

    std::function<void()> _closed;
    Card _card;
    QLabel _title, _message;
    Button _button;
};

} // namespace kestrum::qt
