// What a key asks for, without a screen.
#include "frontends/terminal/Navigation.h"
#include "platform/ReusableCell.h"

#include <gmock/gmock.h>

#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace kestrum::terminal {
namespace {

using testing::ElementsAre, testing::IsEmpty;

struct NoRepaint final : Repaint {
    void repaintLater() override {}
};

/// Two rows.
class Rows final : public TableDataSource {
public:
    std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 2; }
    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath at) override
    {
        auto cell = std::make_shared<ReusableCell>(table.makeCell(CellStyle::Default), "row");
        cell->cell().textLabel().setText("Row " + std::to_string(at.row));
        return cell;
    }
    void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
};

using Request = std::pair<SheetKind, std::optional<std::size_t>>;

class Keys : public testing::Test, protected NavigationViewDelegate, protected SheetOwner {
protected:
    Keys() { view.show(pane, {"Kestrum"}, Transition::None, false); }

    void type(wchar_t key) { view.handle({Key::Character, key}); }
    void chooseSecondRow()
    {
        view.handle({Key::Enter}); // the table asks for its rows
        view.handle({Key::Down});
    }

    void backRequested() override {}
    bool offers(SheetKind, std::optional<std::size_t>) const override { return true; }
    void sheetRequested(SheetKind kind, std::optional<std::size_t> row) override
    {
        requested.emplace_back(kind, row);
        if (opensSheets)
            sheet = view.openSheet(*this);
    }
    void lookRequested(Look) override {}
    void keepRequested() override { ++kept; }
    void sheetLeft() override { sheet.reset(); }
    void columnChosen(std::size_t) override {}
    void cursorMoved(std::optional<std::size_t>) override {}
    void rangeChosen(std::size_t) override {}

    NoRepaint repaint;
    Rows rows;
    TerminalTableScreen pane{rows, repaint};
    TerminalNavigationView view{*this, repaint, [] {}};
    std::unique_ptr<Sheet> sheet;
    std::vector<Request> requested;
    bool opensSheets = false;
    int kept = 0;
};

TEST_F(Keys, EachLetterAsksForItsSheetOfTheChosenRowOrOfThePane)
{
    chooseSecondRow();
    for (const auto& each : kSheetCommands)
        type(static_cast<wchar_t>(each.key));
    std::vector<Request> wanted;
    for (const auto& each : kSheetCommands)
        wanted.emplace_back(each.kind, each.isOfRow ? std::optional<std::size_t>(1) : std::nullopt);
    EXPECT_EQ(requested, wanted);
}

TEST_F(Keys, ASheetOfARowHasNoRowInAnEmptyPane)
{
    type(L't');
    EXPECT_THAT(requested, ElementsAre(Request{SheetKind::Trend, std::nullopt}));
}

TEST_F(Keys, KeepIsAskedForWithACapitalLetter)
{
    type(L'k');
    EXPECT_EQ(kept, 0);
    type(L'K');
    EXPECT_EQ(kept, 1);
    EXPECT_THAT(requested, IsEmpty());
}

TEST_F(Keys, ASheetIsClosedByItsOwnLetterAndByEscapeOnly)
{
    opensSheets = true;
    for (const auto& each : kSheetCommands) {
        type(static_cast<wchar_t>(each.key));
        ASSERT_TRUE(sheet) << each.key;
        for (const auto& other : kSheetCommands)
            if (other.key != each.key)
                type(static_cast<wchar_t>(other.key));
        EXPECT_TRUE(sheet) << each.key;
        type(static_cast<wchar_t>(each.key));
        EXPECT_FALSE(sheet) << each.key;
    }
    type(L'e');
    view.handle({Key::Escape});
    EXPECT_FALSE(sheet);
    EXPECT_EQ(requested.size(), kSheetCommands.size() + 1);
}

} // namespace
} // namespace kestrum::terminal
