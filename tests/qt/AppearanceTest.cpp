#include "QtTest.h"

#include "frontends/qt/Appearance.h"
#include "frontends/qt/Motion.h"
#include "qtplatform/PrivateBus.h"

#include <QDBusMessage>
#include <QDBusVirtualObject>

#include <map>

namespace kestrum {
namespace {

const QString kPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString kSettings = QStringLiteral("org.freedesktop.portal.Settings");
const QString kScheme = QStringLiteral("org.freedesktop.appearance color-scheme");
const QString kAnimations = QStringLiteral("org.gnome.desktop.interface enable-animations");
constexpr uint kDark = 1, kLight = 2;

/// The settings part of the desktop's portal. It ends with its connection.
class Portal final : public QDBusVirtualObject {
public:
    explicit Portal(const PrivateBus& bus) : _connection(bus.connect(kName))
    {
        _connection.registerVirtualObject(kPath, this);
        _running = _connection.registerService("org.freedesktop.portal.Desktop");
    }
    ~Portal() override
    {
        _connection.unregisterObject(kPath);
        _connection.unregisterService("org.freedesktop.portal.Desktop");
        QDBusConnection::disconnectFromBus(kName);
    }

    bool isRunning() const { return _running; }
    void set(const QString& setting, const QVariant& value) { _values[setting] = value; }
    /// As `set`, and emits the signal.
    void change(const QString& setting, const QVariant& value)
    {
        set(setting, value);
        QDBusMessage signal = QDBusMessage::createSignal(kPath, kSettings, "SettingChanged");
        signal << setting.section(' ', 0, 0) << setting.section(' ', 1) << QVariant::fromValue(QDBusVariant(value));
        _connection.send(signal);
    }

    QString introspect(const QString&) const override { return {}; }
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override
    {
        if (message.member() != "Read")
            return false;
        const auto found = _values.find(message.arguments()[0].toString() + ' ' + message.arguments()[1].toString());
        if (found == _values.end())
            return connection.send(
                message.createErrorReply("org.freedesktop.portal.Error.NotFound", "No such setting"));
        // The portal wraps this reply twice.
        const auto once = QVariant::fromValue(QDBusVariant(found->second));
        return connection.send(message.createReply(QVariant::fromValue(QDBusVariant(once))));
    }

private:
    static constexpr const char* kName = "portal";

    QDBusConnection _connection;
    std::map<QString, QVariant> _values;
    bool _running = false;
};

class ADesktop : public InAWindow {
protected:
    ADesktop()
    {
        navigation().show(*_screen, {"Kestrum"}, Transition::None, false);
        makeVisible();
    }
    ~ADesktop() override
    {
        QDBusConnection::disconnectFromBus("display");
        qt::setMotionWanted(true);
        QApplication::setPalette(qt::paletteOf(qt::lightColours()));
    }

    bool turns(const char* rowGround)
    {
        return QTest::qWaitFor(
            [&] { return table().cellAt(0)->grab().toImage().pixelColor(2, 2).name() == rowGround; });
    }
    static bool wantsMotion(bool wanted)
    {
        return QTest::qWaitFor([&] { return qt::motionWanted() == wanted; });
    }

    static constexpr const char* kLightRow = "#ffffff";
    static constexpr const char* kDarkRow = "#171b21";

    Rows _rows = Rows::leaves(3);
    std::unique_ptr<TableScreen> _screen = screenOf(_rows);
    PrivateBus bus;
};

TEST_F(ADesktop, IsFollowedFromLightToDarkAndBack)
{
    // Before any other part of this process has registered the types of D-Bus.
    const qt::Appearance appearance(bus.connect("display"));
    ASSERT_TRUE(turns(kLightRow));
    Portal portal(bus);
    ASSERT_TRUE(portal.isRunning());
    portal.change(kScheme, kDark);
    EXPECT_TRUE(turns(kDarkRow));
    portal.change(kScheme, kLight);
    EXPECT_TRUE(turns(kLightRow));
}

TEST_F(ADesktop, IsAskedAtTheStart)
{
    Portal portal(bus);
    portal.set(kScheme, kDark);
    portal.set(kAnimations, false);
    const qt::Appearance appearance(bus.connect("display"));
    EXPECT_TRUE(turns(kDarkRow));
    EXPECT_TRUE(wantsMotion(false));
}

TEST_F(ADesktop, IsFollowedInItsWishForReducedMotion)
{
    const qt::Appearance appearance(bus.connect("display"));
    screen(*_screen).setToolbarItems({ActivityIndicatorItem{true}}, false);
    const auto& spinner = static_cast<qt::Spinner&>(*screen(*_screen).toolbar().widgetAt(0));
    ASSERT_TRUE(spinner.isTurning());
    Portal portal(bus);
    portal.change(kAnimations, false);
    EXPECT_TRUE(wantsMotion(false));
    EXPECT_TRUE(QTest::qWaitFor([&] { return !spinner.isTurning(); }));
    portal.change(kAnimations, true);
    EXPECT_TRUE(wantsMotion(true));
    screen(*_screen).setToolbarItems({ActivityIndicatorItem{true}}, false);
    EXPECT_TRUE(spinner.isTurning());
}

TEST_F(ADesktop, WithoutAPortalIsAskedOnceThereIsOne)
{
    const qt::Appearance appearance(bus.connect("display"));
    EXPECT_TRUE(turns(kLightRow));
    EXPECT_TRUE(qt::motionWanted());
    Portal portal(bus);
    portal.set(kScheme, kDark);
    EXPECT_TRUE(turns(kDarkRow));
}

TEST_F(ADesktop, KeepsItsAppearanceUntilANewPortalSetsIt)
{
    const qt::Appearance appearance(bus.connect("display"));
    {
        Portal portal(bus);
        portal.set(kScheme, kDark);
        ASSERT_TRUE(turns(kDarkRow));
    }
    EXPECT_TRUE(turns(kDarkRow));
    Portal next(bus);
    next.set(kScheme, kLight);
    EXPECT_TRUE(turns(kLightRow));
    next.change(kScheme, kDark);
    EXPECT_TRUE(turns(kDarkRow));
}

TEST_F(ADesktop, WithoutABusIsLight)
{
    const qt::Appearance appearance{QDBusConnection(QString())};
    EXPECT_TRUE(turns(kLightRow));
}

} // namespace
} // namespace kestrum
