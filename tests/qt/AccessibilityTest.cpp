#include "QtTest.h"

#include "frontends/qt/Motion.h"

#include <QAbstractButton>
#include <QScrollBar>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// All objects that an assistive technology finds from this one on.
void collect(QAccessibleInterface* from, std::vector<QAccessibleInterface*>& into)
{
    into.push_back(from);
    for (int i = 0; i < from->childCount(); ++i)
        collect(from->child(i), into);
}

void act(QAccessibleInterface* on, const QString& action)
{
    if (auto* actions = on->actionInterface())
        actions->doAction(action);
}

const auto kPress = QAccessibleActionInterface::pressAction();
const auto kFocus = QAccessibleActionInterface::setFocusAction();

class Accessibility : public InAWindow {
protected:
    struct Owner final : SaveInterfaceOwner {
        std::unique_ptr<SaveInterface> interface = toolkit().loadSaveInterface(*this);
        int saves = 0, cancels = 0;
        std::size_t numberOfRowsInSection(TableView&, std::size_t) override { return 0; }
        std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView&, IndexPath) override { return nullptr; }
        void didSelectRowAtIndexPath(TableView&, std::optional<IndexPath>) override {}
        void savePressed() override { ++saves; }
        void cancelPressed() override { ++cancels; }
        void backgroundTouched() override {}
        bool textFieldShouldReturn() override { return true; }
    };

    Accessibility() : _screen(screenOf(rows))
    {
        qt::setMotionWanted(false);
        rows.rows[2].value.reset();
        _screen->setTitle("Serving Cell");
        _screen->setToolbarItems({LabelItem{"Updated", systemFont(14)}, SaveItem{[this] { ++saves; }}}, true);
        navigation().show(*_screen, {"Kestrum", "Serving Cell"}, Transition::None, false);
        makeVisible();
    }
    ~Accessibility() override
    {
        navigation().dismiss(false);
        qt::setMotionWanted(true);
    }

    static QAccessibleInterface* interfaceOf(QWidget& widget) { return QAccessible::queryAccessibleInterface(&widget); }
    std::vector<QAccessibleInterface*> everything()
    {
        std::vector<QAccessibleInterface*> all;
        collect(interfaceOf(window()), all);
        return all;
    }
    /// The object with its name; null when it is not there.
    QAccessibleInterface* find(const QString& name)
    {
        for (auto* each : everything())
            if (each->text(QAccessible::Name) == name)
                return each;
        return nullptr;
    }
    /// A button that is pressed this way stays pressed for a moment.
    static void tryEverything(const std::vector<QAccessibleInterface*>& things)
    {
        for (auto* each : things)
            for (const auto& action : {kPress, kFocus, QAccessibleActionInterface::toggleAction()})
                act(each, action);
        EXPECT_TRUE(QTest::qWaitFor([&] {
            return std::none_of(things.begin(), things.end(), [](const QAccessibleInterface* each) {
                const auto* button = qobject_cast<QAbstractButton*>(each->object());
                return button && button->isDown();
            });
        }));
    }

    Rows rows = Rows::leaves(100);
    std::unique_ptr<TableScreen> _screen;
    Owner owner;
    int saves = 0;
};

TEST_F(Accessibility, NamesTheListAfterItsPane)
{
    EXPECT_EQ(interfaceOf(table())->text(QAccessible::Name), "Serving Cell");
    _screen->setTitle("Neighbour\nCell");
    EXPECT_EQ(interfaceOf(table())->text(QAccessible::Name), "Neighbour Cell");
}

TEST_F(Accessibility, KnowsTheWindowAndItsModalScreensByTheirRoles)
{
    EXPECT_EQ(interfaceOf(window())->role(), QAccessible::Window);
    navigation().present(*owner.interface, false);
    auto* sheet = interfaceOf(*navigation().sheet());
    EXPECT_EQ(sheet->role(), QAccessible::Dialog);
    EXPECT_TRUE(sheet->state().modal);
    EXPECT_EQ(sheet->text(QAccessible::Name), "Save Snapshot");
}

TEST_F(Accessibility, ShowsTheBackButtonOnlyWhereItLeadsSomewhere)
{
    EXPECT_NE(find("Back to Kestrum"), nullptr);
    navigation().setTitles({"Kestrum"});
    EXPECT_EQ(find("Back to Kestrum"), nullptr);
    for (const auto* each : everything())
        EXPECT_FALSE(each->state().invisible) << each->text(QAccessible::Name).toStdString();
}

TEST_F(Accessibility, FindsEveryPartByItsPlaceInItsParent)
{
    for (auto* each : everything())
        for (int i = 0; i < each->childCount(); ++i) {
            EXPECT_EQ(each->indexOfChild(each->child(i)), i);
            EXPECT_EQ(each->child(i)->parent(), each);
        }
}

TEST_F(Accessibility, FindsWhatCoversAtAPoint)
{
    navigation().present(*owner.interface, false);
    const QPoint at = navigation().mapToGlobal(navigation().rect().center());
    auto* found = interfaceOf(navigation())->childAt(at.x(), at.y());
    EXPECT_EQ(found, interfaceOf(*navigation().sheet()));
}

TEST_F(Accessibility, OffersNothingToCheckInAPane)
{
    EXPECT_FALSE(find("Key 2")->state().checkable);
    EXPECT_TRUE(find("Key 2")->state().focusable);
}

TEST_F(Accessibility, ReachesNothingUnderTheSaveSheet)
{
    const auto covered = everything();
    ASSERT_NE(find("Key 2"), nullptr);
    auto* row = find("Key 2");
    navigation().present(*owner.interface, false);
    tryEverything(covered);
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(table().current(), std::nullopt);
    EXPECT_EQ(saves, 0);
    EXPECT_EQ(backs, 0);
    EXPECT_TRUE(navigation().sheet()->description().hasFocus());
    EXPECT_TRUE(row->state().disabled);
    EXPECT_FALSE(row->state().focusable);

    navigation().dismiss(false);
    act(row, kPress);
    EXPECT_THAT(rows.selected, ElementsAre(2u));
}

TEST_F(Accessibility, ReachesNothingUnderAnAlert)
{
    navigation().present(*owner.interface, false);
    navigation().sheet()->description().setText("roof");
    const auto covered = everything();
    toolkit().showAlert("File Error", "Unable to write file to disk", "Close");
    ASSERT_NE(window().alert(), nullptr);
    tryEverything(covered);
    for (auto* each : covered)
        each->setText(QAccessible::Value, "typed by another");
    EXPECT_EQ(owner.saves + owner.cancels + saves + backs, 0);
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(navigation().sheet()->description().text(), "roof");
    EXPECT_EQ(QApplication::focusWidget(), &window().alert()->button());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
}

TEST_F(Accessibility, ScrollsNoTableFromOutside)
{
    auto* bar = interfaceOf(*table().verticalScrollBar());
    ASSERT_NE(bar, nullptr);
    EXPECT_EQ(bar->valueInterface(), nullptr);
}

TEST_F(Accessibility, ReachesNothingInARemovedPane)
{
    const auto left = everything();
    Rows others = Rows::leaves(3);
    const auto other = screenOf(others);
    navigation().show(*other, {"Kestrum"}, Transition::Pop, false);
    tryEverything(left);
    EXPECT_THAT(rows.selected, IsEmpty());
    EXPECT_EQ(saves, 0);
    navigation().show(*_screen, {"Kestrum", "Serving Cell"}, Transition::Push, false);
    act(find("Key 2"), kPress);
    EXPECT_THAT(rows.selected, ElementsAre(2u));
}

} // namespace
} // namespace kestrum
