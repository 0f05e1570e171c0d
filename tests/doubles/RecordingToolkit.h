#pragma once

#include "frontends/ReusePool.h"
#include "platform/ApplicationDelegate.h"
#include "platform/NavigationView.h"
#include "platform/SaveInterface.h"
#include "platform/ScrollView.h"
#include "platform/Sheet.h"
#include "platform/TableScreen.h"
#include "platform/Toolkit.h"
#include "platform/Window.h"

#include <algorithm>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

namespace kestrum {

inline void PrintTo(const Size& size, std::ostream* out)
{
    *out << "{" << size.width << ", " << size.height << "}";
}
inline void PrintTo(const Rect& rect, std::ostream* out)
{
    *out << "{" << rect.x << ", " << rect.y << ", " << rect.width << ", " << rect.height << "}";
}

/// The record of everything that a `RecordingToolkit` has created.
struct ToolkitRecord {
    double tableWidth = 320;         ///< of every table that is shown from now on
    std::size_t visibleRows = 20;    ///< the number of rows that fit into a table
    int windows = 0;                 ///< existing now
    std::vector<std::string> faults; ///< violations by the controllers
};

class RecordingLabel final : public Label {
public:
    void setFrame(Rect frame) override { _frame = frame; }
    Rect frame() const override { return _frame; }
    void setText(std::optional<std::string_view> text) override { _text = text; }
    std::optional<std::string> text() const override { return _text; }
    void setFont(Font font) override { _font = font; }
    Font font() const override { return _font; }

private:
    Rect _frame;
    std::optional<std::string> _text;
    Font _font{"", 17};
};

class RecordingScrollView final : public ScrollView {
public:
    void setFrame(Rect frame) override { _frame = frame; }
    Rect frame() const override { return _frame; }
    void addSubview(std::shared_ptr<View> view) override { subviews.push_back(std::move(view)); }
    void setContentSize(Size size) override { contentSize = size; }

    std::vector<std::shared_ptr<View>> subviews;
    Size contentSize;

private:
    Rect _frame;
};

/// Rows are 44 high. An accessory takes 30 of the width after the cell's layout.
class RecordingCell final : public TableCell {
public:
    RecordingCell(CellStyle cellStyle, double width) : style(cellStyle), rowWidth(width), _bounds{0, 0, width, 44} {}

    Rect contentBounds() const override { return _bounds; }
    void layoutSubviews() override { _bounds.width = rowWidth - (accessory == Accessory::None ? 0 : 30); }
    void setAccessory(Accessory shown) override { accessory = shown; }
    void addSubview(std::shared_ptr<View> view) override { subviews.push_back(std::move(view)); }
    Label& textLabel() override { return ownLabel; }

    // The views of a pane's cell. Null where the cell has no such view.
    RecordingScrollView* strip() const { return first<RecordingScrollView>(subviews); }
    RecordingLabel* key() const
    {
        const auto* holder = strip();
        return first<RecordingLabel>(holder != nullptr ? holder->subviews : subviews);
    }
    RecordingLabel* value() const
    {
        const auto* holder = strip();
        return holder != nullptr ? dynamic_cast<RecordingLabel*>(holder->subviews.back().get()) : nullptr;
    }

    CellStyle style;
    double rowWidth;
    Accessory accessory = Accessory::None;
    std::vector<std::shared_ptr<View>> subviews;
    RecordingLabel ownLabel;

private:
    template <typename Kind>
    static Kind* first(const std::vector<std::shared_ptr<View>>& among)
    {
        return among.empty() ? nullptr : dynamic_cast<Kind*>(among.front().get());
    }

    Rect _bounds;
};

/// Requests the rows that fit, from `firstRow` on, when it is on the screen.
class RecordingTable final : public TableView {
public:
    RecordingTable(ToolkitRecord& record, TableDataSource& source) : _record(record), _source(source) {}

    void reloadData() override
    {
        ++reloads;
        _loaded = false;
        load();
    }
    std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) override
    {
        if (!_asking)
            _record.faults.push_back("a cell was dequeued while none was asked for");
        auto cell = _pool.take(_asking.value_or(0), reuseIdentifier);
        if (cell)
            dynamic_cast<RecordingCell&>(cell->cell()).rowWidth = _record.tableWidth;
        return cell;
    }
    std::unique_ptr<TableCell> makeCell(CellStyle style) override
    {
        ++cellsMade;
        return std::make_unique<RecordingCell>(style, _record.tableWidth);
    }
    void deselectRow(IndexPath indexPath, bool animated) override
    {
        if (selected == indexPath.row)
            selected.reset();
        deselectedAnimated = animated;
    }
    void sizeToFit() override { ++sizedToFit; }

    // The user's actions.
    void appear(bool onScreen)
    {
        _onScreen = onScreen;
        load();
    }
    bool isOnScreen() const { return _onScreen; }
    void scrollTo(std::size_t row)
    {
        firstRow = row;
        _loaded = false;
        load();
    }
    void setWidth(double width)
    {
        _record.tableWidth = width;
        _loaded = false;
        load();
    }
    void tap(std::size_t row)
    {
        selected = row;
        _source.didSelectRowAtIndexPath(*this, IndexPath{0, row});
    }

    std::size_t rowCount() { return _source.numberOfRowsInSection(*this, 0); }
    /// Whether the row is on the screen.
    RecordingCell& row(std::size_t row) const { return dynamic_cast<RecordingCell&>(reusable(row).cell()); }
    ReusableCell& reusable(std::size_t row) const { return *_shown.at(row); }
    /// "key" or "key: value", from the top down.
    std::vector<std::string> texts() const
    {
        std::vector<std::string> texts;
        for (const auto& each : _shown) {
            const auto& cell = row(each.first);
            const auto* key = cell.style == CellStyle::Default ? &cell.ownLabel : cell.key();
            const auto* value = cell.value();
            auto text = key != nullptr ? key->text().value_or("") : "a cell without a key";
            if (value != nullptr && value->text())
                text += ": " + *value->text();
            texts.push_back(text);
        }
        return texts;
    }
    /// The row whose key has that text.
    std::optional<std::size_t> find(std::string_view key) const
    {
        for (const auto& each : _shown)
            if (row(each.first).key()->text() == key)
                return each.first;
        return std::nullopt;
    }

    int reloads = 0, cellsMade = 0, sizedToFit = 0;
    std::size_t firstRow = 0;
    std::optional<std::size_t> selected;
    std::optional<bool> deselectedAnimated;

private:
    void load()
    {
        if (!_onScreen || std::exchange(_loaded, true))
            return;
        for (auto& [row, cell] : _shown)
            _pool.put(row, std::move(cell));
        _shown.clear();
        const std::size_t end = std::min(rowCount(), firstRow + _record.visibleRows);
        for (std::size_t row = firstRow; row < end; ++row) {
            _asking = row;
            const auto cell = _source.cellForRowAtIndexPath(*this, {0, row});
            if (!cell) {
                _record.faults.push_back("a row without a cell");
                continue;
            }
            _shown[row] = cell;
        }
        _asking.reset();
    }

    ToolkitRecord& _record;
    TableDataSource& _source;
    bool _onScreen = false, _loaded = false;
    std::optional<std::size_t> _asking;
    std::map<std::size_t, std::shared_ptr<ReusableCell>> _shown;
    ReusePool _pool{0}; // a row gets another row's cell at once
};

class RecordingScreen final : public TableScreen {
public:
    RecordingScreen(ToolkitRecord& record, TableDataSource& source) : rows(record, source), _record(record) {}
    ~RecordingScreen() override
    {
        if (rows.isOnScreen())
            _record.faults.push_back("the screen that is shown was let go: " + _title);
    }

    TableView& table() override { return rows; }
    void setTitle(std::string_view title) override { _title = title; }
    std::string title() const override { return _title; }
    void setToolbarItems(std::vector<ToolbarItem> items, bool animated) override
    {
        std::vector<std::shared_ptr<const ToolbarItem>> now;
        for (auto& item : items) {
            const bool stays = now.size() < toolbar.size() && *toolbar[now.size()] == item;
            now.push_back(stays ? toolbar[now.size()] : std::make_shared<const ToolbarItem>(std::move(item)));
        }
        toolbar = std::move(now);
        toolbarAnimated = animated;
    }
    void resignFirstResponder() override { ++resigned; }
    void setHint(std::string_view text) override { hint = text; }

    std::string status() const { return std::get<LabelItem>(*toolbar.at(1)).text; }
    bool isLoading() const { return std::get<ActivityIndicatorItem>(*toolbar.at(0)).running; }
    /// Null when Save is not available.
    std::shared_ptr<const ToolbarItem> saveButton() const
    {
        const auto found =
            std::ranges::find_if(toolbar, [](const auto& item) { return std::holds_alternative<SaveItem>(*item); });
        return found == toolbar.end() ? nullptr : *found;
    }
    void pressSave() const { std::get<SaveItem>(*saveButton()).action(); }

    RecordingTable rows;
    std::vector<std::shared_ptr<const ToolbarItem>> toolbar; ///< the same objects: an equal item stays the same object
    std::optional<bool> toolbarAnimated;
    int resigned = 0;
    std::string hint;

private:
    ToolkitRecord& _record;
    std::string _title;
};

class RecordingTextField final : public TextField {
public:
    std::optional<std::string> text() const override { return typed; }
    void resignFirstResponder() override { hasKeyboard = false; }

    std::optional<std::string> typed = "";
    bool hasKeyboard = false;
};

class RecordingSaveInterface final : public SaveInterface {
public:
    RecordingSaveInterface(ToolkitRecord& record, SaveInterfaceOwner& itsOwner)
        : owner(itsOwner), rows(record, itsOwner)
    {}

    TableView& saveContentTable() override { return rows; }
    TextField& saveDescription() override { return field; }
    void setFrame(Rect to) override { frame = to; }

    SaveInterfaceOwner& owner; ///< the buttons and the background call it
    RecordingTable rows;
    RecordingTextField field;
    Rect frame;
};

/// The sheet that is open.
struct OpenSheet {
    SheetOwner& owner; ///< the user's actions call it
    SheetContents contents = {};
    int changes = 0;
};

class RecordingSheet final : public Sheet {
public:
    RecordingSheet(std::optional<OpenSheet>& open, SheetOwner& owner) : _open(open) { _open.emplace(owner); }
    ~RecordingSheet() override { _open.reset(); }
    RecordingSheet(const RecordingSheet&) = delete;
    RecordingSheet& operator=(const RecordingSheet&) = delete;

    void setContents(SheetContents contents) override
    {
        _open->contents = std::move(contents);
        ++_open->changes;
    }

private:
    std::optional<OpenSheet>& _open;
};

class RecordingNavigationView final : public NavigationView {
public:
    explicit RecordingNavigationView(NavigationViewDelegate& delegate) : _delegate(delegate) {}
    ~RecordingNavigationView() override
    {
        if (shown)
            shown->rows.appear(false);
    }

    void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) override
    {
        if (shown)
            shown->rows.appear(false);
        shown = &dynamic_cast<RecordingScreen&>(pane);
        shown->rows.appear(true);
        path = std::move(titles);
        transitions.emplace_back(transition, animated);
    }
    void setTitles(std::vector<std::string> titles) override
    {
        path = std::move(titles);
        ++titleChanges;
    }
    void setToolbarHidden(bool hidden) override { toolbarHidden = hidden; }
    void setNotice(std::string_view text) override { notice = text; }
    void setFrozen(std::optional<FrozenMoment> moment) override { frozen = std::move(moment); }
    void present(SaveInterface& screen, bool animated) override
    {
        ++presentations;
        presented = &dynamic_cast<RecordingSaveInterface&>(screen);
        presented->rows.appear(true);
        presentedAnimated = animated;
    }
    void dismiss(bool animated) override
    {
        presented->rows.appear(false);
        presented = nullptr;
        presentedAnimated = animated;
    }
    std::unique_ptr<Sheet> openSheet(SheetOwner& owner) override
    {
        return std::make_unique<RecordingSheet>(sheet, owner);
    }

    void pressBack() { _delegate.backRequested(); }
    void look(Look look) { _delegate.lookRequested(look); }
    bool isOffered(SheetKind kind, std::optional<std::size_t> row = {}) const { return _delegate.offers(kind, row); }
    void press(SheetKind kind, std::optional<std::size_t> row = {}) { _delegate.sheetRequested(kind, row); }
    void keep() { _delegate.keepRequested(); }

    RecordingScreen* shown = nullptr;
    std::vector<std::string> path; ///< the titles, root first
    int titleChanges = 0;          ///< while the shown pane stayed
    std::vector<std::pair<Transition, bool>> transitions;
    bool toolbarHidden = true;
    std::string notice;
    std::optional<FrozenMoment> frozen;
    RecordingSaveInterface* presented = nullptr;
    int presentations = 0;
    std::optional<bool> presentedAnimated;
    std::optional<OpenSheet> sheet;

private:
    NavigationViewDelegate& _delegate;
};

class RecordingWindow final : public Window {
public:
    explicit RecordingWindow(ToolkitRecord& record) : _record(record) { ++_record.windows; }
    ~RecordingWindow() override { --_record.windows; }

    void setRoot(NavigationView& navigation) override { root = &navigation; }
    void makeKeyAndVisible() override { visible = true; }
    void orderOut() override
    {
        if (onOrderOut)
            onOrderOut();
        visible = false;
    }

    NavigationView* root = nullptr;
    bool visible = false;
    std::function<void()> onOrderOut;

private:
    ToolkitRecord& _record;
};

/// A toolkit that draws nothing; the test is the user. A character of regular text is half as wide as the font's
/// size, a bold one 0.6 times. Every line is 1.2 times as high as the size.
class RecordingToolkit final : public Toolkit {
public:
    struct Alert {
        std::string title, message, button;
        friend bool operator==(const Alert&, const Alert&) = default;
    };

    Rect mainScreenBounds() const override { return {0, 0, 320, 480}; }
    Rect mainScreenApplicationFrame() const override { return {0, 20, 320, 460}; }
    Size measure(std::string_view text, Font font) const override
    {
        const auto characters = std::ranges::count_if(text, [](char byte) { return (byte & 0xC0) != 0x80; });
        return {static_cast<double>(characters) * font.size * (font.bold ? 0.6 : 0.5), font.size * 1.2};
    }

    std::unique_ptr<Window> makeWindow(Rect frame) override
    {
        auto made = std::make_unique<RecordingWindow>(record);
        window = made.get();
        windowFrame = frame;
        return made;
    }
    std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) override
    {
        auto made = std::make_unique<RecordingNavigationView>(delegate);
        navigation = made.get();
        return made;
    }
    std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) override
    {
        return std::make_unique<RecordingScreen>(record, source);
    }
    std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) override
    {
        return std::make_unique<RecordingSaveInterface>(record, owner);
    }
    std::shared_ptr<Label> makeLabel() override { return std::make_shared<RecordingLabel>(); }
    std::shared_ptr<ScrollView> makeScrollView() override { return std::make_shared<RecordingScrollView>(); }
    void showAlert(std::string_view title, std::string_view message, std::string_view button) override
    {
        alerts.push_back({std::string(title), std::string(message), std::string(button)});
    }
    /// Launches the application, runs `mainLoop` as the user, and terminates the application.
    int run(ApplicationDelegate& application) override
    {
        application.applicationDidFinishLaunching();
        if (mainLoop)
            mainLoop();
        application.applicationWillTerminate();
        return 0;
    }

    RecordingScreen& top() const { return *navigation->shown; }

    ToolkitRecord record;
    RecordingWindow* window = nullptr;             ///< the last one created; the application owns it
    RecordingNavigationView* navigation = nullptr; ///< likewise
    Rect windowFrame;
    std::vector<Alert> alerts;
    std::function<void()> mainLoop;
};

} // namespace kestrum
