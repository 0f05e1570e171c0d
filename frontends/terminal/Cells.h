#pragma once

#include "frontends/terminal/Screen.h"
#include "platform/ScrollView.h"
#include "platform/TableCell.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

/// The views of a table's row. A row takes one line whatever its height in points, so only the x of a frame matters.
/// A column is 10 points wide: the inset of a cell is one column, the gap between key and value five.
namespace kestrum::terminal {

inline constexpr double kPointsPerColumn = 10, kPointsPerLine = 20;

/// A view that can draw itself on a line.
class Drawn {
public:
    virtual ~Drawn() = default;
    virtual void draw(const Line& line) const = 0;
    virtual int end() const = 0;                 ///< the column after its content
    virtual const std::string* name() const = 0; ///< the first text in it
    virtual int sideways() const = 0;            ///< the columns by which it is scrolled to the left
    virtual void setSideways(int columns) = 0;
};

class TerminalLabel final : public Label, public Drawn {
public:
    void setFrame(Rect frame) override { _frame = frame; }
    Rect frame() const override { return _frame; }
    void setText(std::optional<std::string_view> text) override;
    std::optional<std::string> text() const override { return _text; }
    void setFont(Font font) override { _font = font; }
    Font font() const override { return _font; }

    void draw(const Line& line) const override;
    int end() const override;
    const std::string* name() const override { return _text ? &*_text : nullptr; }
    int sideways() const override { return 0; }
    void setSideways(int) override {}

private:
    Rect _frame;
    std::optional<std::string> _text; // its beginning, where it is longer than users scroll
    int _columns = 0;                 // of the text
    Font _font = systemFont(15);
};

/// The views in a strip or in a cell.
class Subviews {
public:
    void add(std::shared_ptr<View> view);
    void draw(const Line& line) const;
    int end() const;
    const std::string* name() const;
    int sideways() const;
    void setSideways(int columns);

private:
    std::vector<std::shared_ptr<View>> _views;
    std::vector<Drawn*> _drawn; // the same views, as Drawn
};

class TerminalScrollView final : public ScrollView, public Drawn {
public:
    void setFrame(Rect frame) override { _frame = frame; }
    Rect frame() const override { return _frame; }
    void addSubview(std::shared_ptr<View> view) override { _content.add(std::move(view)); }
    void setContentSize(Size size) override { _contentSize = size; }

    void draw(const Line& line) const override;
    int end() const override;
    const std::string* name() const override { return _content.name(); }
    int sideways() const override;
    void setSideways(int columns) override { _scrolled = columns; }

private:
    int furthest() const;

    Rect _frame;
    Size _contentSize;
    Subviews _content;
    int _scrolled = 0; // columns; limited to the content's width when it is used
};

class TerminalCell final : public TableCell {
public:
    TerminalCell(CellStyle style, int columns) : _style(style), _columns(columns) {}

    Rect contentBounds() const override;
    void layoutSubviews() override {} // contentBounds is always up to date
    void setAccessory(Accessory accessory) override { _accessory = accessory; }
    void addSubview(std::shared_ptr<View> view) override { _content.add(std::move(view)); }
    Label& textLabel() override { return _textLabel; }

    Accessory accessory() const { return _accessory; }
    void setColumns(int columns) { _columns = columns; }
    std::string name() const;
    int sideways() const { return _content.sideways(); }
    void setSideways(int columns) { _content.setSideways(columns); }
    void draw(const Line& line) const;

private:
    int contentColumns() const;

    CellStyle _style;
    int _columns;
    Accessory _accessory = Accessory::None;
    TerminalLabel _textLabel;
    Subviews _content;
};

} // namespace kestrum::terminal
