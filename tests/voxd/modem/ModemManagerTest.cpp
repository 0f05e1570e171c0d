#include "ModemFixture.h"

#include <cfloat>
#include <limits>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using Fake = FakeModemManager;

const QString kUnauthorized = "org.freedesktop.ModemManager1.Error.Core.Unauthorized";
const QString kUnsupported = "org.freedesktop.ModemManager1.Error.Core.Unsupported";
const QString kAccessDenied = "org.freedesktop.DBus.Error.AccessDenied";

SignalLevels levels(std::initializer_list<std::pair<std::optional<double> SignalLevels::*, double>> known)
{
    SignalLevels made;
    for (const auto& [level, value] : known)
        made.*level = value;
    return made;
}

TEST_F(ModemManagerTest, FindsTheModemThatIsThereAndWhatItSays)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kModem]["AccessTechnologies"] = 0xC000U;
    daemon->plugIn(interfaces);
    ASSERT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::Present; }));
    EXPECT_TRUE(eventually([&] { return client.states().daemonVersion == "1.24.0"; }));
    ASSERT_THAT(client.states().modems, SizeIs(1));
    EXPECT_EQ(modem().identifier, "abcd");
    EXPECT_EQ(modem().number, 1U);
    EXPECT_EQ(modem().manufacturer, "Test");
    EXPECT_EQ(modem().model, "Fake");
    EXPECT_EQ(modem().revision, "1");
    EXPECT_EQ(modem().equipmentIdentifier, "123456789012345");
    EXPECT_EQ(modem().phase, ModemPhase::Registered);
    EXPECT_EQ(modem().lock, ModemLock::None);
    EXPECT_EQ(modem().accessTechnologies, 0xC000U);
    EXPECT_EQ(modem().signalQuality, 54U);
    EXPECT_TRUE(modem().signalQualityRecent);
    EXPECT_EQ(modem().registration, ModemRegistration::Home);
    EXPECT_EQ(modem().operatorCode, "00101");
    EXPECT_EQ(modem().operatorName, "Test Net");
    EXPECT_EQ(modem().packetService, PacketService::Attached);
}

TEST_F(ModemManagerTest, MeasuresOnlyWhileItIsAskedToAndPutsTheSettingsBack)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kSignal]["Rate"] = 30U;
    interfaces[Fake::kLocation]["Enabled"] = 4U;
    interfaces[Fake::kLocation]["Capabilities"] = 7U;
    const auto path = daemon->plugIn(interfaces);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    settle();
    EXPECT_EQ(daemon->calls("Setup"), 0U);
    EXPECT_EQ(queue.timers(), 0U) << "nothing wakes up while no display streams";

    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    EXPECT_EQ(daemon->sources(path), 5U) << "what was enabled stays so";
    EXPECT_FALSE(daemon->objects[path][Fake::kLocation]["SignalsLocation"].toBool());
    wait(1s);
    ASSERT_TRUE(modem().location);
    EXPECT_EQ(*modem().location, (ModemLocation{"001", "01", 0, 0x1A2301, 0x1502}));

    client.setMeasuring(false);
    EXPECT_TRUE(eventually([&] { return client.isAtRest(); }));
    EXPECT_EQ(daemon->rate(path), 30U);
    EXPECT_EQ(daemon->sources(path), 4U);
    EXPECT_FALSE(modem().location) << "it may be of long ago when it is measured again";
    settle();
    wait(1s);
    EXPECT_EQ(queue.timers(), 0U);
}

TEST_F(ModemManagerTest, LeavesSettingsAloneThatServeAlready)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kSignal]["Rate"] = 1U;
    interfaces[Fake::kLocation]["Enabled"] = 1U;
    interfaces[Fake::kLocation]["SignalsLocation"] = true;
    const auto path = daemon->plugIn(interfaces);
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(3s);
    EXPECT_TRUE(modem().location);
    client.setMeasuring(false);
    wait(1s);
    EXPECT_EQ(daemon->calls("Setup"), 0U);
}

TEST_F(ModemManagerTest, LeavesItAsItIsWhetherTheDaemonTellsEveryoneThePosition)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kLocation]["SignalsLocation"] = true;
    const auto path = daemon->plugIn(interfaces);
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    EXPECT_TRUE(daemon->objects[path][Fake::kLocation]["SignalsLocation"].toBool());
    client.setMeasuring(false);
    ASSERT_TRUE(eventually([&] { return client.isAtRest() && daemon->sources(path) == 0; }));
    EXPECT_TRUE(daemon->objects[path][Fake::kLocation]["SignalsLocation"].toBool());
}

TEST_F(ModemManagerTest, APropertyThatIsInvalidatedIsUnknown)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    ASSERT_TRUE(eventually([&] { return modem().operatorName == "Test Net"; }));
    daemon->objects[path][Fake::kModem3gpp].remove("OperatorName"); // the client may ask for all once more
    daemon->emitSignal(path, "org.freedesktop.DBus.Properties", "PropertiesChanged",
                       {Fake::kModem3gpp, QVariantMap(), QStringList{"OperatorName"}});
    EXPECT_TRUE(eventually([&] { return modem().operatorName.empty(); }));
    EXPECT_EQ(modem().operatorCode, "00101");
}

TEST_F(ModemManagerTest, TakesNoChangeOfAnotherModem)
{
    daemon->plugIn(Fake::modem("abcd"));
    const auto second = daemon->plugIn(Fake::modem("efgh"));
    ASSERT_TRUE(eventually([&] { return client.states().otherModems == 1; }));
    daemon->set(second, Fake::kModem, {{"Model", "Other"}});
    settle();
    EXPECT_EQ(modem().model, "Fake");
}

TEST_F(ModemManagerTest, DoesNotPutBackWhatAnotherProgramHasChanged)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    daemon->set(path, Fake::kSignal, {{"Rate", 7U}});
    daemon->set(path, Fake::kLocation, {{"Enabled", 0U}, {"Capabilities", 0U}});
    wait(6s);
    client.setMeasuring(false);
    EXPECT_TRUE(eventually([&] { return client.isAtRest(); }));
    EXPECT_EQ(daemon->rate(path), 7U);
}

TEST_F(ModemManagerTest, EndsWhenAllIsPutBack)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    bool ended = false;
    client.end(3s, [&] { ended = true; });
    client.setMeasuring(true); // a display that connects now comes too late
    EXPECT_TRUE(eventually([&] { return ended; }));
    EXPECT_EQ(daemon->rate(path), 0U);
    EXPECT_EQ(daemon->sources(path), 0U);
}

TEST_F(ModemManagerTest, EndsAfterItsLimitWhenTheDaemonDoesNotAnswer)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    daemon->isSilent = true;
    int ends = 0;
    client.end(3s, [&] { ++ends; });
    queue.advance(2s);
    EXPECT_EQ(ends, 0);
    queue.advance(1s);
    EXPECT_EQ(ends, 1);
    queue.advance(20s);
    EXPECT_EQ(ends, 1);
}

TEST_F(ModemManagerTest, FollowsLevelsOfAllTechnologies)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    daemon->set(path, Fake::kSignal,
                {{"Gsm", QVariantMap{{"rssi", -71.0}}},
                 {"Umts", QVariantMap{{"rscp", -95.0}, {"ecio", -6.5}}},
                 {"Lte", QVariantMap{{"rssi", -65.0}, {"rsrp", -98.0}, {"rsrq", -11.0}, {"snr", 12.5}}},
                 {"Nr5g", QVariantMap{{"rsrp", -101.0}, {"error-rate", 2.0}}}});
    ASSERT_TRUE(eventually([&] { return modem().signal.nr.has_value(); }));
    EXPECT_EQ(modem().signal.gsm, levels({{&SignalLevels::rssi, -71.0}}));
    EXPECT_EQ(modem().signal.umts, levels({{&SignalLevels::rscp, -95.0}, {&SignalLevels::ecio, -6.5}}));
    EXPECT_EQ(modem().signal.lte, levels({{&SignalLevels::rssi, -65.0},
                                          {&SignalLevels::rsrp, -98.0},
                                          {&SignalLevels::rsrq, -11.0},
                                          {&SignalLevels::snr, 12.5}}));
    EXPECT_EQ(modem().signal.nr, levels({{&SignalLevels::rsrp, -101.0}, {&SignalLevels::errorRate, 2.0}}));
    daemon->set(path, Fake::kSignal, {{"Lte", QVariantMap()}});
    EXPECT_TRUE(eventually([&] { return !modem().signal.lte; }));
    EXPECT_TRUE(modem().signal.nr) << "only what has changed is sent";
}

TEST_F(ModemManagerTest, ReadsTheSimAndNamedKeysOfTheBearers)
{
    daemon->objects["/sim"][Fake::kSim] = {{"SimIdentifier", "89010"},
                                           {"Imsi", "001010123456789"},
                                           {"OperatorIdentifier", "00101"},
                                           {"OperatorName", "Home"}};
    daemon->objects["/bearer"][Fake::kBearer] = {
        {"Connected", true},
        {"Suspended", false},
        {"Interface", "wwan0"},
        {"Ip4Config", QVariantMap{{"address", "192.0.2.7"}}},
        {"Ip6Config", QVariantMap{{"address", "2001:db8::7"}}},
        {"Properties", QVariantMap{{"apn", "internet.example"}, {"user", "anna"}, {"password", "secret"}}},
        {"Stats",
         QVariantMap{{"duration", 60U}, {"rx-bytes", qulonglong(5'000'000'000)}, {"tx-bytes", qulonglong(7)}}}};
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kModem]["Sim"] = QVariant::fromValue(QDBusObjectPath("/sim"));
    interfaces[Fake::kModem]["Bearers"] = QVariant::fromValue(QList{QDBusObjectPath("/bearer")});
    const auto path = daemon->plugIn(interfaces);
    ASSERT_TRUE(eventually([&] { return modem().sim && modem().bearers.size() == 1; }));
    EXPECT_EQ(*modem().sim, (ModemSim{"89010", "001010123456789", "00101", "Home"}));
    const ModemBearer expected{true, false,         "wwan0", "internet.example", "192.0.2.7", "2001:db8::7",
                               60,   5'000'000'000, 7};
    EXPECT_EQ(modem().bearers[0], expected);

    daemon->set("/bearer", Fake::kBearer, {{"Stats", QVariantMap{{"rx-bytes", qulonglong(5'000'000'001)}}}});
    EXPECT_TRUE(eventually([&] { return modem().bearers[0].receivedBytes == 5'000'000'001; }));
    EXPECT_EQ(modem().bearers[0].interface, "wwan0");
    daemon->set(path, Fake::kModem,
                {{"Bearers", QVariant::fromValue(QList<QDBusObjectPath>())},
                 {"Sim", QVariant::fromValue(QDBusObjectPath("/"))}});
    EXPECT_TRUE(eventually([&] { return !modem().sim && modem().bearers.empty(); }));
}

TEST_F(ModemManagerTest, ReadsTheCellsOfAnMbimModem)
{
    daemon->cells = {{{"cell-type", 5U},
                      {"serving", true},
                      {"operator-id", "00101"},
                      {"tac", "1502"},
                      {"ci", "1A2301"},
                      {"physical-ci", "7B"},
                      {"earfcn", 6300U},
                      {"rsrp", -98.5},
                      {"rsrq", -11.0},
                      {"timing-advance", 4U}},
                     {{"cell-type", 6U}, {"serving", false}, {"ci", "3FFFFFFFF"}, {"nrarfcn", 632448U}, {"sinr", 3.0}},
                     {{"cell-type", 2U}, {"lac", "A1"}, {"arfcn", 62U}, {"base-station-id", "3F"}, {"rx-level", 20U}},
                     {{"cell-type", 3U}, {"psc", 300U}, {"uarfcn", 10712U}, {"rscp", -99.0}, {"ecio", -7.0}}};
    daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(1s);
    ASSERT_THAT(modem().cells, SizeIs(4));
    ModemCell lte;
    lte.type = CellType::Lte;
    lte.serving = true;
    lte.operatorCode = "00101";
    lte.tac = 0x1502;
    lte.ci = 0x1A2301;
    lte.physicalCell = 0x7B;
    lte.channel = 6300;
    lte.rsrp = -98.5;
    lte.rsrq = -11.0;
    lte.timingAdvance = 4;
    EXPECT_EQ(modem().cells[0], lte);
    EXPECT_EQ(modem().cells[1].type, CellType::Nr);
    EXPECT_EQ(modem().cells[1].ci, 0x3FFFFFFFFU);
    EXPECT_EQ(modem().cells[1].channel, 632448U);
    EXPECT_EQ(modem().cells[1].sinr, 3.0);
    EXPECT_EQ(modem().cells[2].lac, 0xA1U);
    EXPECT_EQ(modem().cells[2].baseStation, 0x3FU);
    EXPECT_EQ(modem().cells[2].rxLevel, 20U);
    EXPECT_EQ(modem().cells[3].scramblingCode, 300U);
    EXPECT_EQ(modem().cells[3].ecio, -7.0);
    EXPECT_THAT(modem().refusals, IsEmpty());
}

TEST_F(ModemManagerTest, KeepsABoundedNumberOfNeighbours)
{
    daemon->cells = QList<QVariantMap>(10'000, {{"cell-type", 5U}, {"physical-ci", "7B"}});
    daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    queue.advance(1s);
    ASSERT_TRUE(eventually([&] { return !modem().cells.empty(); }));
    EXPECT_THAT(modem().cells, SizeIs(1024));
}

TEST_F(ModemManagerTest, NeverAsksForCellsTwiceAtOnceAndDropsALateAnswer)
{
    std::vector<QDBusMessage> waiting;
    daemon->answers["GetCellInfo"] = [&](const QDBusMessage& call) {
        waiting.push_back(call);
        return QDBusMessage();
    };
    daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(20s);
    EXPECT_THAT(modem().refusals, IsEmpty());
    wait(1s);
    EXPECT_THAT(modem().refusals,
                ElementsAre(ModemRefusal{ModemService::CellInformation, RefusalReason::NoAnswer, {}}));
    EXPECT_TRUE(modem().location) << "the rest goes on";
    wait(278s);
    ASSERT_THAT(waiting, SizeIs(1));
    daemon->send(waiting[0].createReply(QVariant::fromValue(QList<QVariantMap>{{{"cell-type", 5U}}})));
    daemon->answers["GetCellInfo"] = [&](const QDBusMessage& call) {
        return call.createReply(QVariant::fromValue(QList<QVariantMap>{{{"cell-type", 6U}}}));
    };
    settle();
    EXPECT_THAT(modem().cells, IsEmpty()) << "what the modem saw five minutes ago";
    wait(60s);
    ASSERT_THAT(modem().cells, SizeIs(1));
    EXPECT_EQ(modem().cells[0].type, CellType::Nr);
    EXPECT_THAT(modem().refusals, IsEmpty());
}

TEST_F(ModemManagerTest, ForgetsWhatItMeasuredWhenTheDaemonDoesNotAnswerAndGoesOnAfterwards)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    daemon->set(path, Fake::kSignal, {{"Lte", QVariantMap{{"rsrp", -98.0}}}});
    wait(2s);
    ASSERT_TRUE(modem().signal.lte);
    ASSERT_TRUE(modem().location);
    daemon->isSilent = true;
    wait(10s);
    EXPECT_EQ(client.states().daemon, ModemDaemon::Silent);
    EXPECT_FALSE(modem().signal.lte);
    EXPECT_FALSE(modem().signalQuality);
    wait(20s);
    EXPECT_FALSE(modem().location);
    daemon->isSilent = false;
    wait(6s);
    EXPECT_EQ(client.states().daemon, ModemDaemon::Present);
    EXPECT_EQ(modem().signal.lte, levels({{&SignalLevels::rsrp, -98.0}}));
    wait(60s);
    EXPECT_TRUE(modem().location);
}

TEST_F(ModemManagerTest, AModemThatComesAgainIsTheSameOneUnderAGreaterNumber)
{
    auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    daemon->unplug(path);
    ASSERT_TRUE(eventually([&] { return client.states().modems.empty(); }));
    EXPECT_TRUE(client.isAtRest());
    path = daemon->plugIn(Fake::modem("abcd"));
    EXPECT_TRUE(path.endsWith("/1"));
    ASSERT_TRUE(measures(path));
    EXPECT_EQ(modem().number, 1U);
    EXPECT_EQ(modem().identifier, "abcd");
}

TEST_F(ModemManagerTest, FindsADaemonThatRestarts)
{
    daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    daemon.reset();
    ASSERT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::Absent; }));
    EXPECT_THAT(client.states().modems, IsEmpty());
    daemon = std::make_unique<Fake>(bus);
    ASSERT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::Present; }));
    EXPECT_THAT(client.states().modems, IsEmpty());
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    EXPECT_TRUE(measures(path));
}

TEST_F(ModemManagerTest, ConnectsAgainWhenTheBusComesBack)
{
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::Present; }));
    bus.kill();
    ASSERT_TRUE(eventually([&] {
        queue.advance(1s);
        return client.states().daemon == ModemDaemon::NoBus;
    }));
    nextBus = std::make_unique<PrivateBus>();
    daemon = std::make_unique<Fake>(*nextBus);
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    queue.advance(5s);
    EXPECT_TRUE(eventually([&] { return daemon->rate(path) == 1; }));
}

struct Refusal {
    const char* name;
    QString method, error;
    ModemRefusal expected;

    friend void PrintTo(const Refusal& shown, std::ostream* out) { *out << shown.name; }
};

class ARefusal : public ModemManagerTest, public testing::WithParamInterface<Refusal> {};

TEST_P(ARefusal, IsToldAndTheRestGoesOn)
{
    daemon->objects["/sim"][Fake::kSim] = {{"Imsi", "001010123456789"}};
    daemon->objects["/bearer"][Fake::kBearer] = {{"Interface", "wwan0"}};
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kModem]["Sim"] = QVariant::fromValue(QDBusObjectPath("/sim"));
    interfaces[Fake::kModem]["Bearers"] = QVariant::fromValue(QList{QDBusObjectPath("/bearer")});
    const auto refused = [&](const QDBusMessage& call) {
        const QString what = call.member() == "GetAll" ? call.path() : call.interface() + "." + call.member();
        return what.endsWith(GetParam().method);
    };
    for (const char* method : {"Setup", "GetLocation", "GetCellInfo", "GetAll"}) {
        auto before = daemon->answers[method];
        if (!before)
            before = [this](const QDBusMessage& call) {
                return call.createReply(daemon->objects[call.path()][call.arguments()[0].toString()]);
            };
        daemon->answers[method] = [=](const QDBusMessage& call) {
            return refused(call) ? Fake::refusal(call, GetParam().error) : before(call);
        };
    }
    const auto path = daemon->plugIn(interfaces);
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(10s);
    EXPECT_THAT(modem().refusals, ElementsAre(GetParam().expected));
    EXPECT_EQ(log.texts(Priority::Warning).size(), 1U);
    using enum ModemService;
    EXPECT_EQ(daemon->rate(path) == 1, GetParam().expected.service != Signal);
    EXPECT_EQ(modem().location.has_value(), GetParam().expected.service != Location);
    EXPECT_EQ(modem().sim.has_value(), GetParam().expected.service != Sim);
    EXPECT_EQ(modem().bearers.size() == 1, GetParam().expected.service != Data);
    client.setMeasuring(false);
    EXPECT_TRUE(eventually([&] { return client.isAtRest(); }));
    EXPECT_EQ(daemon->rate(path), 0U);
    EXPECT_EQ(daemon->sources(path), 0U);
}

INSTANTIATE_TEST_SUITE_P(
    ModemManager, ARefusal,
    testing::Values(Refusal{"SignalByPolkit",
                            "Signal.Setup",
                            kUnauthorized,
                            {ModemService::Signal, RefusalReason::NotPermitted, {}}},
                    Refusal{"LocationByPolkit",
                            "Location.Setup",
                            kUnauthorized,
                            {ModemService::Location, RefusalReason::NotPermitted, {}}},
                    Refusal{"LocationOnceSetUp",
                            "Location.GetLocation",
                            kUnauthorized,
                            {ModemService::Location, RefusalReason::NotPermitted, {}}},
                    Refusal{"CellsByTheBus",
                            "Modem.GetCellInfo",
                            kAccessDenied,
                            {ModemService::CellInformation, RefusalReason::NotPermitted, {}}},
                    Refusal{"CellsUnsupported",
                            "Modem.GetCellInfo",
                            kUnsupported,
                            {ModemService::CellInformation, RefusalReason::NotSupported, {}}},
                    Refusal{"CellsUnknown",
                            "Modem.GetCellInfo",
                            "org.freedesktop.DBus.Error.UnknownMethod",
                            {ModemService::CellInformation, RefusalReason::NotSupported, {}}},
                    Refusal{"SimByTheBus", "/sim", kAccessDenied, {ModemService::Sim, RefusalReason::NotPermitted, {}}},
                    Refusal{"BearerFailed",
                            "/bearer",
                            "org.freedesktop.ModemManager1.Error.Core.Failed",
                            {ModemService::Data, RefusalReason::Failed, "because of the test"}}),
    [](const auto& each) { return std::string(each.param.name); });

TEST_F(ModemManagerTest, AsksAgainForWhatWasNotPermittedWhenADisplayConnects)
{
    const auto permitted = daemon->answers["Setup"];
    daemon->answers["Setup"] = [](const QDBusMessage& call) { return Fake::refusal(call, kUnauthorized); };
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return modem().refusals.size() == 2; }));
    wait(200s);
    EXPECT_EQ(daemon->calls("Setup"), 2U) << "no dialogue of polkit every minute";
    daemon->answers["Setup"] = permitted;
    client.setMeasuring(false);
    client.setMeasuring(true);
    EXPECT_TRUE(measures(path));
    EXPECT_TRUE(eventually([&] { return modem().refusals.empty(); }));
}

TEST_F(ModemManagerTest, AnInterfaceThatIsMissingIsNotSupported)
{
    auto interfaces = Fake::modem("abcd");
    interfaces.remove(Fake::kSignal);
    interfaces.remove(Fake::kLocation);
    const auto path = daemon->plugIn(interfaces);
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(2s);
    EXPECT_THAT(modem().refusals, ElementsAre(ModemRefusal{ModemService::Signal, RefusalReason::NotSupported, {}},
                                              ModemRefusal{ModemService::Location, RefusalReason::NotSupported, {}}));
    const auto whole = Fake::modem("abcd");
    for (const auto& each : {Fake::kSignal, Fake::kLocation})
        daemon->objects[path][each] = whole[each];
    wait(10s);
    EXPECT_THAT(modem().refusals, IsEmpty());
    EXPECT_TRUE(measures(path));
}

TEST_F(ModemManagerTest, AsksNothingOfAModemThatIsDisabledOrLocked)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kModem]["State"] = 2;
    interfaces[Fake::kModem]["UnlockRequired"] = 2U;
    const auto path = daemon->plugIn(interfaces);
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    wait(10s);
    EXPECT_EQ(modem().phase, ModemPhase::Locked);
    EXPECT_EQ(modem().lock, ModemLock::SimPin);
    EXPECT_THAT(modem().refusals, IsEmpty());
    EXPECT_EQ(daemon->calls("Setup") + daemon->calls("GetLocation") + daemon->calls("GetCellInfo"), 0U);
    daemon->set(path, Fake::kModem, {{"State", 8}});
    ASSERT_TRUE(measures(path));
    wait(1s);
    ASSERT_TRUE(modem().location);
    daemon->set(path, Fake::kModem, {{"State", 3}});
    EXPECT_TRUE(eventually([&] { return !modem().location; }));
    EXPECT_EQ(daemon->rate(path), 1U) << "the daemon keeps it for when the modem is enabled again";
    client.setMeasuring(false);
    EXPECT_TRUE(eventually([&] { return daemon->rate(path) == 0 && daemon->sources(path) == 0; }));
}

TEST_F(ModemManagerTest, NonsenseIsUnknown)
{
    auto interfaces = Fake::modem("abcd");
    auto& modemSays = interfaces[Fake::kModem];
    modemSays["State"] = "registered";
    modemSays["AccessTechnologies"] = qulonglong(1) << 63;
    modemSays["SignalQuality"] = 54U;
    modemSays["Model"] = 7;
    modemSays["Manufacturer"] = QString(100'000, QChar(0x20AC));
    modemSays["Sim"] = "none";
    modemSays["Bearers"] = QStringList{"/bearer"};
    interfaces[Fake::kModem3gpp] = {{"RegistrationState", -1}, {"OperatorCode", QVariantMap{{"a", 1}}}};
    const double nan = std::numeric_limits<double>::quiet_NaN();
    interfaces[Fake::kSignal]["Rate"] = -1.5;
    interfaces[Fake::kSignal]["Gsm"] = "loud";
    interfaces[Fake::kSignal]["Umts"] = QVariantMap{{"rscp", nan}, {"ecio", "-6"}};
    interfaces[Fake::kSignal]["Lte"] = QVariantMap{{"rsrp", 9223372036854775808.0}, {"rsrq", DBL_MIN}, {"snr", -3}};
    interfaces[Fake::kLocation]["Enabled"] = true;
    daemon->cells = {{{"cell-type", "LTE"}, {"ci", "xyz"}, {"tac", "100000000"}, {"physical-ci", ""}, {"earfcn", -1}}};
    for (const char* text : {"", "1,2", "001,01,zz,,1A2301FFFFFFFFFFFFFFFF"}) {
        daemon->location = text;
        const auto path = daemon->plugIn(interfaces);
        client.setMeasuring(true);
        ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
        EXPECT_EQ(modem().phase, ModemPhase::Unknown);
        daemon->set(path, Fake::kModem, {{"State", 8}});
        ASSERT_TRUE(measures(path));
        wait(3s);
        EXPECT_EQ(modem().accessTechnologies, 0U);
        EXPECT_FALSE(modem().signalQuality);
        EXPECT_EQ(modem().model, "");
        EXPECT_EQ(modem().manufacturer.size(), 255U) << "whole characters of three bytes";
        EXPECT_FALSE(modem().sim);
        EXPECT_THAT(modem().bearers, IsEmpty());
        EXPECT_FALSE(modem().registration);
        EXPECT_EQ(modem().operatorCode, "");
        EXPECT_FALSE(modem().signal.gsm);
        EXPECT_FALSE(modem().signal.umts);
        EXPECT_EQ(modem().signal.lte, levels({{&SignalLevels::snr, -3.0}}));
        EXPECT_EQ(modem().location.value_or(ModemLocation{}).ci, std::nullopt);
        ASSERT_THAT(modem().cells, SizeIs(1));
        EXPECT_EQ(modem().cells[0], ModemCell{});
        daemon->unplug(path);
        ASSERT_TRUE(eventually([&] { return client.states().modems.empty(); }));
    }
}

TEST_F(ModemManagerTest, RepliesAndSignalsOfAnotherShapeChangeNothing)
{
    daemon->plugIn(Fake::modem("abcd"));
    for (const char* method : {"Setup", "GetLocation", "GetCellInfo"})
        daemon->answers[method] = [](const QDBusMessage& call) { return call.createReply("what?"); };
    client.setMeasuring(true);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    const QString manager = "/org/freedesktop/ModemManager1", objects = "org.freedesktop.DBus.ObjectManager";
    daemon->emitSignal(manager, objects, "InterfacesAdded", {"text"});
    daemon->emitSignal(manager, objects, "InterfacesRemoved", {});
    daemon->emitSignal(manager, objects, "InterfacesAdded",
                       {QVariant::fromValue(QDBusObjectPath("/elsewhere")), QVariant::fromValue(Fake::modem("x"))});
    daemon->emitSignal(manager, "org.freedesktop.DBus.Properties", "PropertiesChanged", {1, 2, 3});
    wait(5s);
    EXPECT_THAT(client.states().modems, SizeIs(1));
    EXPECT_FALSE(modem().location);
    EXPECT_THAT(modem().cells, IsEmpty());
    daemon->answers["GetManagedObjects"] = [](const QDBusMessage& call) { return call.createReply(7); };
    wait(6s);
    EXPECT_EQ(client.states().daemon, ModemDaemon::Silent);
}

TEST_F(ModemManagerTest, TakesNoMoreModemsThanItCanShow)
{
    for (int i = 0; i < 40; ++i)
        daemon->plugIn(Fake::modem(QString::number(i)));
    ASSERT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::Present; }));
    EXPECT_TRUE(eventually([&] { return client.states().otherModems == 15; }));
    settle();
    EXPECT_EQ(client.states().otherModems, 15U);
}

TEST_F(ModemManagerTest, SaysThatItMayNotAskTheDaemon)
{
    daemon->answers["GetManagedObjects"] = [](const QDBusMessage& call) { return Fake::refusal(call, kAccessDenied); };
    client.setMeasuring(true);
    EXPECT_TRUE(eventually([&] { return client.states().daemon == ModemDaemon::NotPermitted; }));
}

class AllModems : public ModemManagerTest {
protected:
    AllModems() : ModemManagerTest("all") {}
};

TEST_F(AllModems, KeepTheirOrderWhenOneComesAgain)
{
    const auto one = daemon->plugIn(Fake::modem("bbbb"));
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    const auto two = daemon->plugIn(Fake::modem("aaaa"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(one) && measures(two));
    daemon->unplug(one);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    daemon->plugIn(Fake::modem("bbbb"));
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 2; }));
    EXPECT_EQ(client.states().modems[0].identifier, "bbbb");
    EXPECT_EQ(client.states().modems[0].number, 1U);
    EXPECT_EQ(client.states().modems[1].number, 2U);
    EXPECT_EQ(client.states().otherModems, 0U);
}

class OneModem : public ModemManagerTest {
protected:
    OneModem() : ModemManagerTest("aaa") {}
};

TEST_F(OneModem, IsChosenByTheBeginningOfItsIdentifierAndTheOthersAreLeftAlone)
{
    const auto other = daemon->plugIn(Fake::modem("bbbb")), wanted = daemon->plugIn(Fake::modem("aaaa"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(wanted));
    EXPECT_EQ(client.states().otherModems, 1U);
    EXPECT_EQ(modem().identifier, "aaaa");
    EXPECT_EQ(daemon->rate(other), 0U);
    // Deselected, because it is another one now.
    daemon->set(wanted, Fake::kModem, {{"DeviceIdentifier", "cccc"}});
    EXPECT_TRUE(eventually([&] { return client.states().modems.empty() && client.isAtRest(); }));
    EXPECT_EQ(daemon->rate(wanted), 0U);
    EXPECT_EQ(daemon->sources(wanted), 0U);
}

} // namespace
} // namespace kestrum
