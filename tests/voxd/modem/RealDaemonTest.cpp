#include "AtModem.h"
#include "Mmcli.h"
#include "Polkit.h"

#include "harness/Places.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "qtplatform/EventLoop.h"
#include "tools/Tool.h"
#include "voxd/ReplaySource.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusPendingCall>
#include <QDBusVariant>
#include <QDateTime>
#include <QElapsedTimer>
#include <QStandardPaths>
#include <gmock/gmock.h>

#include <unistd.h>

namespace kestrum {
namespace {

using testing::HasSubstr;
using testing::Not;

const QString kService = "org.freedesktop.ModemManager1", kManager = "/org/freedesktop/ModemManager1";

/// ModemManager itself on a private bus, with a made-up modem, voxd and a terminal that shows it.
class ARealModemManager : public testing::Test {
protected:
    ARealModemManager()
    {
        std::filesystem::create_directories(directory / "run");
        std::filesystem::permissions(directory / "run", std::filesystem::perms::owner_all);
        std::filesystem::create_directories(directory / "device");
        modem.setRsrp(-91);
    }
    ~ARealModemManager() override
    {
        for (auto* const each : {&display, &voxd, &daemon}) {
            each->kill();
            each->waitForFinished();
        }
        QDBusConnection::disconnectFromBus("test");
    }

    void start(const QStringList& more = {})
    {
        ASSERT_TRUE(modem.listens());
        startDaemon();
        start(voxd, "voxd", QStringList{"--modem"} + more);
        ASSERT_TRUE(eventually([&] { return voxd.canReadLine(); }));
        start(display, "kestrum-terminal", {"--text=100000"});
    }
    static void start(QProcess& process, std::string_view program, const QStringList& arguments)
    {
        process.setProcessChannelMode(QProcess::MergedChannels);
        process.start(QString::fromStdString(builtProgram(program)), arguments);
    }

    static QElapsedTimer started()
    {
        QElapsedTimer timer;
        timer.start();
        return timer;
    }

    // Debian's place for it is no part of an ordinary user's path.
    void startDaemon()
    {
        const QString program = QStandardPaths::findExecutable("ModemManager", {"/usr/sbin", "/usr/local/sbin"});
        ASSERT_FALSE(program.isEmpty()) << "needs the package modemmanager";
        daemon.setStandardOutputFile(QString::fromStdString(directory / "daemon.log"));
        daemon.setProcessChannelMode(QProcess::MergedChannels);
        daemon.start(program, {"--test-session", "--test-enable", "--test-no-udev", "--test-no-suspend-resume",
                               "--test-no-qrtr", "--debug"});
        ASSERT_TRUE(eventually([&] {
            return call(kManager, kService + ".Test", "SetProfile", {"test", "generic", QStringList{port}}).type() ==
                   QDBusMessage::ReplyMessage;
        }));
        ASSERT_TRUE(eventually([&] { return !modemPath().isEmpty(); }));
        enable();
    }
    // The daemon refuses while it still examines the modem.
    void enable()
    {
        ASSERT_TRUE(eventually([&] {
            return call(modemPath(), kService + ".Modem", "Enable", {true}).type() == QDBusMessage::ReplyMessage;
        }));
    }

    QDBusMessage call(const QString& path, const QString& interface, const QString& method,
                      const QVariantList& arguments = {}) const
    {
        if (path.isEmpty())
            return {};
        auto message = QDBusMessage::createMethodCall(kService, path, interface, method);
        message.setArguments(arguments);
        const QDBusPendingCall pending = connection.asyncCall(message);
        eventually([&] { return pending.isFinished(); });
        return pending.reply();
    }
    QVariant property(const QString& interface, const QString& name) const
    {
        const auto reply = call(modemPath(), "org.freedesktop.DBus.Properties", "Get", {interface, name});
        return reply.arguments().value(0).value<QDBusVariant>().variant();
    }
    QString modemPath() const
    {
        const auto reply = call(kManager, "org.freedesktop.DBus.ObjectManager", "GetManagedObjects");
        if (reply.signature() != "a{oa{sa{sv}}}")
            return {};
        const auto objects =
            qdbus_cast<QMap<QDBusObjectPath, QMap<QString, QVariantMap>>>(reply.arguments()[0].value<QDBusArgument>());
        return objects.isEmpty() ? QString() : objects.firstKey().path();
    }
    static QJsonObject modemByMmcli(const QStringList& arguments)
    {
        return mmcli(QStringList{"-m", "any"} + arguments)["modem"].toObject();
    }

    /// The latest picture of the display that is complete.
    std::string shown()
    {
        _output += display.readAll().toStdString();
        const auto end = _output.rfind("\nUpdated ");
        if (end == std::string::npos)
            return "";
        const auto begin = _output.rfind("Updated ", end - 1);
        _output.erase(0, begin == std::string::npos ? 0 : begin);
        return _output.substr(0, _output.rfind("\nUpdated "));
    }
    bool shows(const std::string& text)
    {
        return eventually([&] { return shown().find(text) != std::string::npos; }, std::chrono::seconds(60));
    }
    /// Does not wait until the picture that has the text is complete.
    bool prints(const std::string& text)
    {
        return eventually(
            [&] {
                const bool isComplete = shown().find(text) != std::string::npos;
                const auto begun = _output.rfind("\nUpdated ");
                return isComplete || (begun != std::string::npos && _output.find(text, begun) != std::string::npos);
            },
            std::chrono::seconds(60));
    }
    int endVoxd()
    {
        voxd.terminate();
        EXPECT_TRUE(eventually([&] { return voxd.state() == QProcess::NotRunning; }));
        return voxd.exitCode();
    }

    ScratchDirectory directory;
    PrivateBus bus;
    ScopedVariable sessionVariable{"DBUS_SESSION_BUS_ADDRESS", bus.address()};
    ScopedVariable systemVariable{"DBUS_SYSTEM_BUS_ADDRESS", bus.address()};
    ScopedVariable runtimeVariable{"KESTRUM_RUNTIME_DIR", directory / "run"};
    ScopedVariable deviceVariable{"KESTRUM_DEVICE_ROOT", directory / "device"};
    Polkit polkit{bus};
    QDBusConnection connection = bus.connect("test");
    const QString port = QString("abstract:kestrum-test-%1").arg(::getpid());
    AtModem modem{port};
    QProcess daemon, voxd, display;
    std::string _output;
};

TEST_F(ARealModemManager, IsShownWithLevelsThatMoveAndGetsItsSettingsBack)
{
    start();
    ASSERT_TRUE(shows("Measured RSRP: -91.00 dBm")) << shown() << voxd.readAll().toStdString();
    const QElapsedTimer sinceTheChange = started();
    modem.setRsrp(-81);
    ASSERT_TRUE(prints("Measured RSRP: -81.00 dBm")) << shown();
    RecordProperty("level_ms", static_cast<int>(sinceTheChange.elapsed()));
    ASSERT_TRUE(shows("Measured RSRP: -81.00 dBm")) << shown();
    ASSERT_TRUE(shows("Cell Identity: 1712897")) << shown();
    const auto rows = shown();
    for (const char* row :
         {"Status: Registered, LTE", "Technology: LTE", "Tracking Area Code: 5378", "Mobile Country Code: 001",
          "Mobile Network Code: 01", "Registration State: Registered, home", "IMSI: 00101********", "Model: Fake"})
        EXPECT_THAT(rows, HasSubstr(row));
    EXPECT_THAT(rows, Not(HasSubstr("001010123456789")));
    EXPECT_THAT(rows, Not(HasSubstr("123456789012345")));

    // The daemon's own client sees the same.
    EXPECT_EQ(modemByMmcli({"--signal-get"})["signal"].toObject()["lte"].toObject()["rsrp"].toString(), "-81.00");
    const auto seen = modemByMmcli({});
    EXPECT_EQ(seen["generic"].toObject()["state"].toString(), "registered");
    EXPECT_EQ(seen["3gpp"].toObject()["operator-code"].toString(), "00101");
    EXPECT_THAT(rows, HasSubstr("Operator: " + seen["3gpp"].toObject()["operator-name"].toString().toStdString()));
    const auto location = modemByMmcli({"--location-get"})["location"].toObject()["3gpp"].toObject();
    EXPECT_EQ(location["cid"].toString().toUInt(nullptr, 16), 1712897U);

    const auto sources = property(kService + ".Modem.Location", "Enabled");
    EXPECT_EQ(property(kService + ".Modem.Signal", "Rate"), 1U);
    EXPECT_EQ(property(kService + ".Modem.Location", "SignalsLocation"), false);
    EXPECT_EQ(endVoxd(), 0);
    EXPECT_EQ(property(kService + ".Modem.Signal", "Rate"), 0U);
    EXPECT_EQ(property(kService + ".Modem.Location", "Enabled"), sources) << "the daemon enables it by itself";
}

TEST_F(ARealModemManager, LocationThatWasDisabledIsDisabledAgain)
{
    startDaemon();
    ASSERT_TRUE(eventually([&] { return property(kService + ".Modem", "State").toInt() == 8; }));
    call(modemPath(), kService + ".Modem.Location", "Setup", {0U, false});
    call(modemPath(), kService + ".Modem.Signal", "Setup", {30U});
    start(voxd, "voxd", {"--modem"});
    ASSERT_TRUE(eventually([&] { return voxd.canReadLine(); }));
    start(display, "kestrum-terminal", {"--text=100000"});
    ASSERT_TRUE(shows("Cell Identity: 1712897")) << shown();
    EXPECT_EQ(property(kService + ".Modem.Location", "Enabled"), 1U);
    EXPECT_EQ(endVoxd(), 0);
    EXPECT_EQ(property(kService + ".Modem.Signal", "Rate"), 30U);
    EXPECT_EQ(property(kService + ".Modem.Location", "Enabled"), 0U);
}

TEST_F(ARealModemManager, AModemThatIsUnpluggedGoesAndComesAgain)
{
    start();
    ASSERT_TRUE(shows("Measured RSRP: -91.00 dBm")) << shown();
    const QString before = modemPath();
    // For its clients the modem is unplugged: the daemon lets it go, and examines it anew afterwards.
    ASSERT_EQ(call(kManager, kService, "InhibitDevice", {"/virtual/test", true}).type(), QDBusMessage::ReplyMessage);
    const QElapsedTimer sinceTheChange = started();
    ASSERT_TRUE(prints("No modem")) << shown();
    RecordProperty("unplugged_ms", static_cast<int>(sinceTheChange.elapsed()));
    ASSERT_TRUE(shows("No modem")) << shown();
    EXPECT_THAT(shown(), Not(HasSubstr("RSRP")));
    modem.setRsrp(-85);
    ASSERT_EQ(call(kManager, kService, "InhibitDevice", {"/virtual/test", false}).type(), QDBusMessage::ReplyMessage);
    ASSERT_TRUE(eventually([&] { return !modemPath().isEmpty(); }));
    EXPECT_NE(modemPath(), before);
    enable();
    EXPECT_TRUE(shows("Measured RSRP: -85.00 dBm")) << shown();
}

TEST_F(ARealModemManager, MayDieAndRestart)
{
    start();
    ASSERT_TRUE(shows("Measured RSRP: -91.00 dBm")) << shown();
    daemon.kill();
    ASSERT_TRUE(shows("ModemManager is not running")) << shown();
    EXPECT_THAT(shown(), Not(HasSubstr("RSRP")));
    ASSERT_TRUE(eventually([&] { return daemon.state() == QProcess::NotRunning; }));
    modem.setRsrp(-85);
    startDaemon();
    EXPECT_TRUE(shows("Measured RSRP: -85.00 dBm")) << shown();
    EXPECT_EQ(endVoxd(), 0);
    EXPECT_EQ(property(kService + ".Modem.Signal", "Rate"), 0U);
}

/// A row of kestrum-decode's csv.
struct CsvRow {
    QDateTime time;
    QString path, value;
};

std::vector<CsvRow> rowsOf(const std::string& capture)
{
    const auto decoded = tools::run({"--format", "csv", capture});
    EXPECT_EQ(decoded.status, 0) << decoded.remarks;
    std::vector<CsvRow> rows;
    for (const auto& line : QString::fromStdString(decoded.output).split('\n', Qt::SkipEmptyParts).mid(1)) {
        const auto fields = line.split(',');
        rows.push_back({QDateTime::fromString(fields[0], Qt::ISODateWithMs), fields.value(2), fields.value(3)});
    }
    return rows;
}

TEST_F(ARealModemManager, IsRecordedWithTrueTimesAndReplayed)
{
    const std::string capture = directory / "modem.kcap";
    struct SetLevel {
        QString value;
        QDateTime set, shown;
    };
    std::vector<SetLevel> levels;
    const auto begin = QDateTime::currentDateTimeUtc();
    start({"--record", QString::fromStdString(capture)});
    ASSERT_TRUE(shows("Measured RSRP: -91.00 dBm")) << shown() << voxd.readAll().toStdString();
    for (const int level : {-81, -71}) {
        SetLevel each{QString("%1.00 dBm").arg(level), QDateTime::currentDateTimeUtc(), {}};
        modem.setRsrp(level);
        ASSERT_TRUE(shows("Measured RSRP: " + each.value.toStdString())) << shown();
        each.shown = QDateTime::currentDateTimeUtc();
        levels.push_back(each);
    }
    ASSERT_EQ(endVoxd(), 0);
    const auto end = QDateTime::currentDateTimeUtc();

    const auto rows = rowsOf(capture);
    ASSERT_FALSE(rows.empty());
    for (const auto& each : rows) {
        EXPECT_GT(each.time, begin) << each.path.toStdString();
        EXPECT_LT(each.time, end) << each.path.toStdString();
    }
    // A row's number grows when a row comes before it, and its value is told again under the new path.
    std::vector<CsvRow> measured;
    std::ranges::copy_if(rows, std::back_inserter(measured), [](const CsvRow& each) {
        return each.path.endsWith(";Measured RSRP") && !each.value.isEmpty();
    });
    ASSERT_FALSE(measured.empty());
    EXPECT_EQ(measured.front().value, "-91.00 dBm");
    EXPECT_EQ(measured.back().value, "-71.00 dBm");
    for (const auto& level : levels) {
        const auto first = std::ranges::find(measured, level.value, &CsvRow::value);
        ASSERT_NE(first, measured.end()) << level.value.toStdString();
        EXPECT_GE(first->time, level.set);
        EXPECT_LE(first->time, level.shown);
    }

    // The replay takes as long as the recording took.
    PropertyListCodec lists;
    ReplaySource replay(capture, false, lists);
    EXPECT_EQ(replay.technology(), kVoxLogChannelTechnology_IFX);
    std::chrono::microseconds last{};
    while (const auto message = replay.next())
        last = message->at;
    EXPECT_EQ(replay.fault(), "");
    const std::chrono::milliseconds recorded(rows.front().time.msecsTo(rows.back().time));
    EXPECT_EQ(last, recorded);
}

} // namespace
} // namespace kestrum
