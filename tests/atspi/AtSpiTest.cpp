#include "qt/QtTest.h"

#include "frontends/qt/Motion.h"

#include <QDBusArgument>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// The accessibility bus as a screen reader sees it.
QDBusConnection& bus()
{
    static QDBusConnection connection = [] {
        const auto ask = QDBusMessage::createMethodCall("org.a11y.Bus", "/org/a11y/bus", "org.a11y.Bus", "GetAddress");
        const auto answer = QDBusConnection::sessionBus().call(ask, QDBus::BlockWithGui);
        return QDBusConnection::connectToBus(answer.arguments().value(0).toString(), "screen reader");
    }();
    return connection;
}

/// An accessible object of the application, accessed over the bus.
class Part {
public:
    enum State { Checked = 4, Enabled = 8 };

    Part() = default;
    Part(QString service, QString path) : _service(std::move(service)), _path(std::move(path)) {}
    static Part desktop() { return {"org.a11y.atspi.Registry", "/org/a11y/atspi/accessible/root"}; }

    bool isThere() const { return !_path.isEmpty(); }
    std::string name() const
    {
        return call("org.freedesktop.DBus.Properties", "Get", {"org.a11y.atspi.Accessible", "Name"})
            .value<QDBusVariant>()
            .variant()
            .toString()
            .toStdString();
    }
    std::string role() const { return accessible("GetRoleName").toString().toStdString(); }
    bool is(State state) const
    {
        const auto words = qdbus_cast<QList<uint>>(accessible("GetState"));
        return words.size() == 2 && (words[state / 32] >> (state % 32) & 1);
    }
    std::vector<Part> children() const
    {
        std::vector<Part> children;
        const auto list = accessible("GetChildren").value<QDBusArgument>();
        list.beginArray();
        while (!list.atEnd()) {
            QString service;
            QDBusObjectPath path;
            list.beginStructure();
            list >> service >> path;
            list.endStructure();
            children.emplace_back(service, path.path());
        }
        list.endArray();
        return children;
    }
    /// The object and all objects inside it.
    std::vector<Part> all() const
    {
        std::vector<Part> all{*this};
        for (const Part& child : children())
            for (const Part& each : child.all())
                all.push_back(each);
        return all;
    }
    Part find(const std::string& role, const std::string& name) const
    {
        for (const Part& each : all())
            if (each.role() == role && each.name() == name)
                return each;
        return {};
    }
    /// The names of all of its actions.
    void tryEverything() const
    {
        for (int action = 0; action < 3; ++action)
            call("org.a11y.atspi.Action", "DoAction", {action});
        call("org.a11y.atspi.Component", "GrabFocus");
        call("org.a11y.atspi.EditableText", "SetTextContents", {"typed by another"});
    }
    void press() const { call("org.a11y.atspi.Action", "DoAction", {0}); }

private:
    QVariant accessible(const char* method) const { return call("org.a11y.atspi.Accessible", method); }
    QVariant call(const char* interface, const char* method, const QVariantList& arguments = {}) const
    {
        auto message = QDBusMessage::createMethodCall(_service, _path, interface, method);
        message.setArguments(arguments);
        return bus().call(message, QDBus::BlockWithGui).arguments().value(0);
    }

    QString _service, _path;
};

class TheAccessibilityBus : public InAWindow {
protected:
    struct Owner final : SaveInterfaceOwner {
        std::unique_ptr<SaveInterface> interface = toolkit().loadSaveInterface(*this);
        int saves = 0, cancels = 0;
        std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 1; }
        std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath) override
        {
            auto cell = std::make_shared<ReusableCell>(table.makeCell(CellStyle::Default), "entry");
            cell->cell().textLabel().setText("Snapshot");
            cell->cell().setAccessory(Accessory::CheckMark);
            return cell;
        }
        void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
        void savePressed() override { ++saves; }
        void cancelPressed() override { ++cancels; }
        void backgroundTouched() override {}
        bool textFieldShouldReturn() override { return true; }
    };

    TheAccessibilityBus()
    {
        qt::setMotionWanted(false);
        rows.rows[1] = {"Neighbours", std::nullopt};
        _screen = screenOf(rows);
        _screen->setTitle("Serving Cell");
        _screen->setToolbarItems({LabelItem{"Updated", systemFont(14)}, SaveItem{[this] { ++saves; }}}, true);
        navigation().show(*_screen, {"Kestrum", "Serving Cell"}, Transition::None, false);
    }
    ~TheAccessibilityBus() override
    {
        navigation().dismiss(false);
        qt::setMotionWanted(true);
    }
    void SetUp() override
    {
        makeVisible();
        ASSERT_TRUE(bus().isConnected());
        // The application registers itself after the services have started.
        ASSERT_TRUE(QTest::qWaitFor([&] { return frame().isThere(); }, 20'000));
    }
    static Part frame()
    {
        for (const Part& application : Part::desktop().children())
            for (const Part& window : application.children())
                if (window.role() == "frame")
                    return window;
        return {};
    }

    Rows rows = Rows::leaves(5);
    std::unique_ptr<TableScreen> _screen;
    Owner owner;
    int saves = 0;
};

TEST_F(TheAccessibilityBus, KnowsTheWindowThePaneAndItsRows)
{
    EXPECT_EQ(frame().name(), "Serving Cell");
    const Part list = frame().find("list", "Serving Cell");
    ASSERT_TRUE(list.isThere());
    std::vector<std::string> names;
    for (const Part& row : list.children()) {
        EXPECT_EQ(row.role(), "list item");
        EXPECT_FALSE(row.is(Part::Checked));
        names.push_back(row.name());
    }
    EXPECT_THAT(names,
                ElementsAre("Key 0, Value 0", "Neighbours", "Key 2, Value 2", "Key 3, Value 3", "Key 4, Value 4"));
    EXPECT_TRUE(frame().find("push button", "Back to Kestrum").isThere());
    navigation().setTitles({"Kestrum"});
    EXPECT_FALSE(frame().find("push button", "Back to Kestrum").isThere());
}

TEST_F(TheAccessibilityBus, PressesARow)
{
    frame().find("list item", "Neighbours").press();
    EXPECT_THAT(rows.selected, ElementsAre(1u));
}

TEST_F(TheAccessibilityBus, KnowsTheSaveSheetAndItsCheckedRows)
{
    navigation().present(*owner.interface, false);
    const Part sheet = frame().find("dialog", "Save Snapshot");
    ASSERT_TRUE(sheet.isThere());
    const Part row = sheet.find("list item", "Snapshot");
    ASSERT_TRUE(row.isThere());
    EXPECT_TRUE(row.is(Part::Checked));
}

TEST_F(TheAccessibilityBus, ReachesNothingUnderTheSaveSheet)
{
    const auto covered = frame().all();
    const Part row = frame().find("list item", "Neighbours");
    ASSERT_TRUE(row.isThere());
    navigation().present(*owner.interface, false);
    for (const Part& each : covered)
        each.tryEverything();
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(saves + backs, 0);
    EXPECT_TRUE(navigation().sheet()->description().hasFocus());
    EXPECT_FALSE(row.is(Part::Enabled));
    navigation().dismiss(false);
    EXPECT_TRUE(row.is(Part::Enabled));
    row.press();
    EXPECT_THAT(rows.selected, ElementsAre(1u));
}

TEST_F(TheAccessibilityBus, ReachesNothingUnderAnAlert)
{
    navigation().present(*owner.interface, false);
    const auto covered = frame().all();
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    for (const Part& each : covered)
        each.tryEverything();
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(saves + backs + owner.saves + owner.cancels, 0);
    EXPECT_EQ(navigation().sheet()->description().text(), "");
    EXPECT_EQ(QApplication::focusWidget(), &window().alert()->button());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
}

} // namespace
} // namespace kestrum
