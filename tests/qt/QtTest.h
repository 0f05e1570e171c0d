#pragma once

#include "frontends/qt/FocusRing.h"
#include "frontends/qt/MainWindow.h"
#include "harness/QtTestToolkit.h"
#include "platform/NavigationView.h"
#include "platform/TableScreen.h"
#include "platform/Toolkit.h"
#include "platform/Window.h"
#include "ui/KestrumCell.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QAccessible>
#include <QApplication>
#include <QTest>
#include <QWindow>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace kestrum {

/// The data source and delegate of a table, over rows that the test can change.
class Rows final : public TableDataSource {
public:
    struct Row {
        std::string key;
        std::optional<std::string> value; ///< empty: the row opens a pane
    };

    std::vector<Row> rows;
    std::vector<std::size_t> selected;
    std::size_t asked = 0; ///< the number of requests for a cell
    std::function<void(std::size_t)> onSelect = [](std::size_t) {};

    static Rows leaves(std::size_t count)
    {
        Rows result;
        for (std::size_t i = 0; i < count; ++i)
            result.rows.push_back({"Key " + std::to_string(i), "Value " + std::to_string(i)});
        return result;
    }

    std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return rows.size(); }

    std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) override
    {
        ++asked;
        const Row& row = rows.at(indexPath.row);
        auto cell = std::static_pointer_cast<KestrumCell>(table.dequeueReusableCell("row"));
        if (!cell)
            cell = row.value ? KestrumCell::initWithStyle(toolkit(), table, CellStyle::KeyAndDetail, "row")
                             : KestrumCell::initWithStyleKey(toolkit(), table, CellStyle::KeyAndDetail, "row");
        cell->setTexts(row.key, row.value);
        cell->cell().setAccessory(row.value ? Accessory::None : Accessory::DisclosureIndicator);
        if (row.value)
            cell->setLayout();
        else
            cell->setLayoutKey();
        return cell;
    }

    void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) override
    {
        const std::size_t row = indexPath.value().row;
        selected.push_back(row);
        if (row < rows.size() && rows[row].value)
            table.deselectRow(*indexPath, false);
        onSelect(row);
    }
};

/// A window with a navigation view, of a handset's size.
class InAWindow : public testing::Test, public NavigationViewDelegate {
protected:
    InAWindow() : _navigation(toolkit().makeNavigationView(*this)), _window(toolkit().makeWindow({0, 0, 390, 844}))
    {
        qt::FocusRing::instance().setShown(false); // reset after the previous test
        navigation().setToolbarHidden(false);
        window().setRoot(navigation());
    }

    void backRequested() override { ++backs; }
    void lookRequested(Look look) override { looks.push_back(look); }
    bool offers(SheetKind, std::optional<std::size_t>) const override { return false; }
    void sheetRequested(SheetKind, std::optional<std::size_t>) override {}
    void keepRequested() override { ++keeps; }

    qt::Navigation& navigation() { return static_cast<qt::Navigation&>(*_navigation); }
    qt::MainWindow& window() { return static_cast<qt::MainWindow&>(*_window); }
    qt::Table& table() { return *navigation().table(); }

    void makeVisible()
    {
        window().makeKeyAndVisible();
        ASSERT_TRUE(QTest::qWaitForWindowActive(&window()));
    }

    static std::unique_ptr<TableScreen> screenOf(TableDataSource& source) { return toolkit().makeTableScreen(source); }

    static qt::Screen& screen(TableScreen& screen) { return static_cast<qt::Screen&>(screen); }

    static QPoint middleOf(const qt::Table& table, std::size_t row) { return table.cellAt(row)->geometry().center(); }

    // A finger on the window. It reaches the widget below it, as a real one does.
    void press(const QWidget& on, QPoint at) { finger(QTest::mousePress, on, at); }
    void release(const QWidget& on, QPoint at) { finger(QTest::mouseRelease, on, at); }
    void click(const QWidget& on, QPoint at, Qt::MouseButton button = Qt::LeftButton)
    {
        finger(QTest::mousePress, on, at, button);
        finger(QTest::mouseRelease, on, at, button);
    }
    void click(const QWidget& on) { click(on, on.rect().center()); }
    void tap(const qt::Table& table, std::size_t row) { click(*table.viewport(), middleOf(table, row)); }
    void drag(const QWidget& on, QPoint from, QPoint to)
    {
        pressAndMove(on, from, to);
        release(on, to);
    }
    void pressAndMove(const QWidget& on, QPoint from, QPoint to)
    {
        constexpr int kSteps = 8;
        press(on, from);
        for (int i = 1; i <= kSteps; ++i)
            QTest::mouseMove(window().windowHandle(), on.mapTo(&window(), from + (to - from) * i / kSteps));
    }

    int backs = 0, keeps = 0;
    std::vector<Look> looks;

private:
    using Act = void (*)(QWindow*, Qt::MouseButton, Qt::KeyboardModifiers, QPoint, int);
    void finger(Act act, const QWidget& on, QPoint at, Qt::MouseButton button = Qt::LeftButton)
    {
        constexpr int kPause = 10; // ms in the events' time stamps, without a real wait
        act(window().windowHandle(), button, {}, on.mapTo(&window(), at), kPause);
    }

    std::unique_ptr<NavigationView> _navigation;
    std::unique_ptr<Window> _window; // borrows the navigation view, so it is destroyed first
};

} // namespace kestrum
