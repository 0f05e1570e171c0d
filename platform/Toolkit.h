#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

/// The UI toolkit: what the controllers of ui/ ask of a front end. All measures are in points, y grows downwards.
/// Everything runs on the main thread.
namespace kestrum {

struct Size {
    double width = 0, height = 0;
    friend bool operator==(const Size&, const Size&) = default;
};

struct Rect {
    double x = 0, y = 0, width = 0, height = 0;
    friend bool operator==(const Rect&, const Rect&) = default;
};

struct Font {
    std::string_view family; ///< empty: the system's own
    double size;
    bool bold = false;
    friend bool operator==(const Font&, const Font&) = default;
};

inline constexpr Font systemFont(double size)
{
    return {"", size};
}
inline constexpr Font boldSystemFont(double size)
{
    return {"", size, true};
}

/// Something that is drawn inside another view. Views that hold it keep it.
class View {
public:
    virtual ~View() = default;
    virtual void setFrame(Rect frame) = 0; ///< in the coordinates of the view that holds it
    virtual Rect frame() const = 0;
};

/// One line of text, left-aligned in its frame.
class Label : public View {
public:
    virtual void setText(std::optional<std::string_view> text) = 0; ///< UTF-8; nothing shows nothing
    virtual std::optional<std::string> text() const = 0;
    virtual void setFont(Font font) = 0;
    virtual Font font() const = 0;
};

/// A strip that scrolls sideways when its content is wider than its frame. A tap on it that does not scroll
/// reaches the row behind it.
class ScrollView : public View {
public:
    virtual void addSubview(std::shared_ptr<View> view) = 0;
    virtual void setContentSize(Size size) = 0;
};

/// Whether a row opens something, or is marked.
enum class Accessory { None, DisclosureIndicator, CheckMark };

/// Default: the cell draws its own text label. KeyAndDetail: title left, detail right, here drawn by labels that
/// are added to the content area.
enum class CellStyle { Default, KeyAndDetail };

/// One row as the front end draws it.
class TableCell {
public:
    virtual ~TableCell() = default;
    virtual Rect contentBounds() const = 0; ///< the content area: the row less its accessory; its origin is (0, 0)
    virtual void layoutSubviews() = 0;      ///< the cell's own layout: brings contentBounds up to date
    virtual void setAccessory(Accessory accessory) = 0;
    virtual void addSubview(std::shared_ptr<View> view) = 0; ///< to the content area
    virtual Label& textLabel() = 0;                          ///< the default style's own label
};

/// A cell as a table keeps it for reuse: controllers derive from it to hold on to what they added.
class ReusableCell {
public:
    ReusableCell(std::unique_ptr<TableCell> cell, std::string_view reuseIdentifier)
        : _cell(std::move(cell)), _reuseIdentifier(reuseIdentifier)
    {}
    virtual ~ReusableCell() = default;

    TableCell& cell() { return *_cell; }
    const std::string& reuseIdentifier() const { return _reuseIdentifier; }

private:
    std::unique_ptr<TableCell> _cell;
    std::string _reuseIdentifier;
};

struct IndexPath {
    std::size_t section = 0, row = 0;
};

/// Rows of one section, as many as fit, drawn with few cells.
class TableView {
public:
    virtual ~TableView() = default;

    /// Asks the data source for everything anew. Scroll offset, selection, focus and a row's sideways scroll stay.
    virtual void reloadData() = 0;

    /// Within `cellForRowAtIndexPath`: a cell that may be used again for that row, of whatever kind; the cell that
    /// last showed that same row comes first. Null when there is none.
    virtual std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) = 0;

    /// A new cell for this table. Its content area has the width of the table's rows from the start, so that it can
    /// be laid out before the table takes it.
    virtual std::unique_ptr<TableCell> makeCell(CellStyle style) = 0;

    virtual void deselectRow(IndexPath indexPath, bool animated) = 0;
    virtual void sizeToFit() = 0;
};

/// What a table shows, and who is told of its selection. Asked again whenever the table's width changes.
class TableDataSource {
public:
    virtual ~TableDataSource() = default;
    virtual std::size_t numberOfRowsInSection(TableView& table, std::size_t section) = 0;
    /// Never null.
    virtual std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) = 0;
    virtual void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) = 0;
};

struct ActivityIndicatorItem { ///< small and grey; hidden when stopped
    bool running;
    friend bool operator==(const ActivityIndicatorItem&, const ActivityIndicatorItem&) = default;
};
struct LabelItem { ///< sized to fit its text, clear background, dark text
    std::string text;
    Font font;
    friend bool operator==(const LabelItem&, const LabelItem&) = default;
};
struct FlexibleSpaceItem {
    friend bool operator==(const FlexibleSpaceItem&, const FlexibleSpaceItem&) = default;
};
struct SaveItem { ///< the platform's standard Save button
    std::function<void()> action;
    /// The button is the same whenever it is there: a held one is not lost when its bar is rebuilt.
    friend bool operator==(const SaveItem&, const SaveItem&) { return true; }
};
using ToolbarItem = std::variant<ActivityIndicatorItem, LabelItem, FlexibleSpaceItem, SaveItem>;

/// The front end's side of a pane: a table filling the screen under a title, over a toolbar.
class TableScreen {
public:
    virtual ~TableScreen() = default;
    virtual TableView& table() = 0;
    virtual void setTitle(std::string_view title) = 0;
    virtual std::string title() const = 0;
    /// Left to right. An item equal to the one at its place stays the same object.
    virtual void setToolbarItems(std::vector<ToolbarItem> items, bool animated) = 0;
    virtual void resignFirstResponder() = 0;
    /// Lines that stand, in muted text, where the rows would be while there are none; empty for nothing.
    virtual void setHint(std::string_view text) = 0;
};

/// A single line that the user edits.
class TextField {
public:
    virtual ~TextField() = default;
    virtual std::optional<std::string> text() const = 0;
    virtual void resignFirstResponder() = 0; ///< closes the keyboard
};

/// What the save screen's interface tells its controller.
class SaveInterfaceOwner : public TableDataSource {
public:
    virtual void savePressed() = 0;
    virtual void cancelPressed() = 0;
    virtual void backgroundTouched() = 0;     ///< anywhere outside the text field
    virtual bool textFieldShouldReturn() = 0; ///< Return was pressed in the field
};

/// What the description field shows while it is empty: ASCII.
inline constexpr std::string_view kDescriptionPlaceholder = "What was seen, and where";

/// The interface "KestrumSaveViewController": a table of what is saved, a description, Save and Cancel.
class SaveInterface {
public:
    virtual ~SaveInterface() = default;
    virtual TableView& saveContentTable() = 0;
    virtual TextField& saveDescription() = 0;
    virtual void setFrame(Rect frame) = 0;
};

/// What a navigation view reports.
class NavigationViewDelegate {
public:
    virtual ~NavigationViewDelegate() = default;
    /// The user wants the pane before this one: the back button, Escape, a swipe.
    virtual void backRequested() = 0;
};

enum class Transition { None, Push, Pop };

/// Shows the top of a stack of panes. It owns none: the stack of ui/ keeps them, and shows another one before it
/// lets go of one that is shown.
class NavigationView {
public:
    virtual ~NavigationView() = default;

    /// The pane to show, at once as far as input goes: the transition only draws, and what leaves takes no input.
    /// `titles` are the stack's, root first, the shown pane's last.
    virtual void show(TableScreen& pane, std::vector<std::string> titles, Transition transition, bool animated) = 0;
    /// The titles changed, the pane did not.
    virtual void setTitles(std::vector<std::string> titles) = 0;
    virtual void setToolbarHidden(bool hidden) = 0;
    /// One line that says what was done, over whichever pane is shown, until another text replaces it; empty for
    /// none. It takes no input.
    virtual void setNotice(std::string_view text) = 0;

    /// A modal screen over the panes, and its end. At most one.
    virtual void present(SaveInterface& screen, bool animated) = 0;
    virtual void dismiss(bool animated) = 0;
};

/// The one window.
class Window {
public:
    virtual ~Window() = default;
    virtual void setRoot(NavigationView& root) = 0;
    virtual void makeKeyAndVisible() = 0;
    virtual void orderOut() = 0;
};

/// The application object, as the main loop sees it.
class ApplicationDelegate {
public:
    virtual ~ApplicationDelegate() = default;
    virtual void applicationDidFinishLaunching() = 0;
    virtual void applicationWillTerminate() = 0; ///< exactly once, whatever ends the program
};

/// The toolkit itself.
class Toolkit {
public:
    virtual ~Toolkit() = default;

    virtual Rect mainScreenBounds() const = 0;
    virtual Rect mainScreenApplicationFrame() const = 0; ///< less the status bar
    virtual Size measure(std::string_view text, Font font) const = 0;

    virtual std::unique_ptr<Window> makeWindow(Rect frame) = 0;
    virtual std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) = 0;
    /// The controllers make these while they are being built: they are asked for nothing before the screen is shown.
    virtual std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) = 0;
    virtual std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) = 0;
    virtual std::shared_ptr<Label> makeLabel() = 0;
    virtual std::shared_ptr<ScrollView> makeScrollView() = 0;

    /// A message with a single button that closes it; one after the other when several are shown.
    virtual void showAlert(std::string_view title, std::string_view message, std::string_view button) = 0;

    /// Runs the main loop for the application until it is to end.
    virtual int run(ApplicationDelegate& application) = 0;
};

} // namespace kestrum
