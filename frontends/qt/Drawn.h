#pragma once

#include "frontends/qt/Colours.h"
#include "platform/Label.h"
#include "platform/ScrollView.h"

#include <QFont>
#include <QObject>
#include <QPointer>
#include <QRectF>
#include <QString>
#include <QStringList>
#include <QWidget>
#include <memory>
#include <vector>

class QPainter;

/// The views inside a cell. The cell draws them; they are not widgets. So a frame may lie between pixels, and each
/// row is one widget, however many views it holds.
namespace kestrum::qt {

/// The drawing target of a view.
struct Paper {
    const Colours& colours;
    QColor background;
    double width; ///< of the holding view; a longer text is cut short there
};

class Drawn {
public:
    virtual ~Drawn() = default;
    virtual void paint(QPainter& painter, const Paper& paper) const = 0;
    virtual QStringList texts() const = 0; ///< one per label, empty ones included
    /// Whether part of it is out of sight in a holder of that width.
    virtual bool isCut(double width) const = 0;
    virtual void setHolder(QWidget* holder) { _holder = holder; }

protected:
    void changed() const
    {
        if (_holder)
            _holder->update();
    }

private:
    QPointer<QWidget> _holder; ///< repainted when this view changes
};

class TextLabel final : public Label, public Drawn {
public:
    void setFrame(Rect frame) override;
    Rect frame() const override { return _frame; }
    void setText(std::optional<std::string_view> text) override;
    std::optional<std::string> text() const override { return _text; }
    void setFont(Font font) override;
    Font font() const override { return {_family, _size, _bold}; }

    void paint(QPainter& painter, const Paper& paper) const override;
    QStringList texts() const override { return QStringList(_line); }

    bool isCut(double width) const override;

private:
    double room(double width) const;

    Rect _frame;
    std::optional<std::string> _text;
    QString _line; ///< `_text` in the form that is drawn
    std::string _family;
    double _size = 17;
    bool _bold = false;
    QFont _font;
};

/// The strip that scrolls sideways. QScroller events move it.
class Strip final : public QObject, public ScrollView, public Drawn {
public:
    void setFrame(Rect frame) override;
    Rect frame() const override { return _frame; }
    void addSubview(std::shared_ptr<View> view) override;
    void setContentSize(Size size) override;

    void paint(QPainter& painter, const Paper& paper) const override;
    QStringList texts() const override;
    bool isCut(double) const override { return isCutLeft() || isCutRight(); }
    void setHolder(QWidget* holder) override;

    // The content is wider than its texts. Only hidden text counts as cut.
    bool isCutLeft() const;
    bool isCutRight() const;

    double reach() const { return std::max(0.0, _content.width - _frame.width); } ///< the largest offset
    double offset() const { return std::min(_offset, reach()); }
    void setOffset(double offset);

protected:
    bool event(QEvent* event) override;

private:
    Rect _frame;
    Size _content;
    double _offset = 0;
    std::vector<std::shared_ptr<View>> _views;
};

} // namespace kestrum::qt
