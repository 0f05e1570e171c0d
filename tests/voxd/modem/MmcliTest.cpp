#include "Mmcli.h"
#include "ModemFixture.h"

#include <QJsonArray>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using Fake = FakeModemManager;

/// ModemManager's own client reads the made-up daemon as this client does, so that the two agree on what numbers mean.
class MmcliTest : public ModemManagerTest {
protected:
    QJsonObject modemByMmcli(const QStringList& arguments = {})
    {
        return mmcli(QStringList{"-m", path} + arguments)["modem"].toObject();
    }
    /// Prints what mmcli prints in its place.
    static std::string decimals(std::optional<double> level)
    {
        return level ? QString::number(*level, 'f', 2).toStdString() : "--";
    }

    ScopedVariable systemVariable{"DBUS_SYSTEM_BUS_ADDRESS", bus.address()};
    QString path;
};

TEST_F(MmcliTest, ListsTheModemAndSaysTheSameOfIt)
{
    auto interfaces = Fake::modem("abcd");
    interfaces[Fake::kModem]["AccessTechnologies"] = 0xC000U;
    path = daemon->plugIn(interfaces);
    ASSERT_TRUE(eventually([&] { return client.states().modems.size() == 1; }));
    EXPECT_EQ(mmcli({"-L"})["modem-list"].toArray(), QJsonArray{path});

    const auto generic = modemByMmcli()["generic"].toObject(), network = modemByMmcli()["3gpp"].toObject();
    EXPECT_EQ(modem().phase, ModemPhase::Registered);
    EXPECT_EQ(generic["state"], "registered");
    EXPECT_EQ(modem().model, generic["model"].toString().toStdString());
    EXPECT_EQ(modem().manufacturer, generic["manufacturer"].toString().toStdString());
    EXPECT_EQ(modem().identifier, generic["device-identifier"].toString().toStdString());
    EXPECT_EQ(modem().equipmentIdentifier, generic["equipment-identifier"].toString().toStdString());
    EXPECT_EQ(modem().accessTechnologies,
              static_cast<unsigned>(AccessTechnology::Lte) | static_cast<unsigned>(AccessTechnology::Nr));
    EXPECT_EQ(generic["access-technologies"].toArray(), (QJsonArray{"lte", "5gnr"}));
    const auto quality = generic["signal-quality"].toObject();
    EXPECT_EQ(modem().signalQuality, quality["value"].toString().toUInt());
    EXPECT_EQ(quality["recent"], "yes");
    EXPECT_TRUE(modem().signalQualityRecent);
    EXPECT_EQ(modem().operatorCode, network["operator-code"].toString().toStdString());
    EXPECT_EQ(modem().operatorName, network["operator-name"].toString().toStdString());
    EXPECT_EQ(modem().registration, ModemRegistration::Home);
    EXPECT_EQ(network["registration-state"], "home");
}

TEST_F(MmcliTest, NamesTheStateOfThePacketServiceAlike)
{
    path = daemon->plugIn(Fake::modem("abcd"));
    for (const auto& [state, name] :
         {std::pair(PacketService::Attached, "attached"), {PacketService::Detached, "detached"}}) {
        daemon->set(path, Fake::kModem3gpp, {{"PacketServiceState", static_cast<unsigned>(state)}});
        EXPECT_TRUE(eventually([&] { return modem().packetService == state; }));
        EXPECT_EQ(modemByMmcli()["3gpp"].toObject()["packet-service-state"], name);
    }
}

TEST_F(MmcliTest, MeasuresTheSameLevelsOf5gNsa)
{
    path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    daemon->set(path, Fake::kSignal,
                {{"Lte", QVariantMap{{"rssi", -65.0}, {"rsrp", -98.25}, {"rsrq", -11.5}, {"snr", 12.5}}},
                 {"Nr5g", QVariantMap{{"rsrp", -101.0}, {"rsrq", -12.0}, {"snr", 7.25}}}});
    ASSERT_TRUE(eventually([&] { return modem().signal.lte && modem().signal.nr; }));
    const auto signal = modemByMmcli({"--signal-get"})["signal"].toObject();
    for (const auto& [name, levels] : {std::pair("lte", modem().signal.lte), {"5g", modem().signal.nr}}) {
        const auto printed = signal[name].toObject();
        EXPECT_EQ(printed["rsrp"].toString().toStdString(), decimals(levels->rsrp)) << name;
        EXPECT_EQ(printed["rsrq"].toString().toStdString(), decimals(levels->rsrq)) << name;
        EXPECT_EQ(printed["snr"].toString().toStdString(), decimals(levels->snr)) << name;
    }
    EXPECT_EQ(signal["lte"].toObject()["rssi"].toString().toStdString(), decimals(modem().signal.lte->rssi));
    EXPECT_EQ(signal["refresh"].toObject()["rate"], "1");
}

TEST_F(MmcliTest, FindsTheSameLocation)
{
    path = daemon->plugIn(Fake::modem("abcd"));
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    wait(1s);
    ASSERT_TRUE(modem().location);
    const auto location = modemByMmcli({"--location-get"})["location"].toObject()["3gpp"].toObject();
    const auto number = [&](const char* key) { return location[key].toString().toUInt(nullptr, 16); };
    EXPECT_EQ(modem().location->mcc, location["mcc"].toString().toStdString());
    EXPECT_EQ(modem().location->mnc, location["mnc"].toString().toStdString());
    EXPECT_EQ(modem().location->lac, number("lac"));
    EXPECT_EQ(modem().location->tac, number("tac"));
    EXPECT_EQ(modem().location->ci, number("cid"));
}

// mmcli prints each cell as a text, and the cells in another order.
TEST_F(MmcliTest, SeesTheSameCells)
{
    path = daemon->plugIn(Fake::modem("abcd"));
    daemon->cells = {{{"cell-type", 5U},
                      {"serving", true},
                      {"tac", "1502"},
                      {"ci", "1A2301"},
                      {"physical-ci", "7B"},
                      {"earfcn", 6300U},
                      {"rsrp", -98.5}},
                     {{"cell-type", 6U}, {"serving", false}, {"ci", "3FFFFFFFF"}, {"nrarfcn", 632448U}}};
    client.setMeasuring(true);
    ASSERT_TRUE(measures(path));
    wait(1s);
    ASSERT_EQ(modem().cells.size(), 2U);
    const auto printed = modemByMmcli({"--get-cell-info"})["generic"].toObject()["cell-info"].toArray();
    ASSERT_EQ(printed.size(), 2);
    for (const auto& cell : modem().cells) {
        const bool isLte = cell.type == CellType::Lte;
        const auto found = std::ranges::find_if(
            printed, [&](const auto& each) { return each.toString().contains(isLte ? "lte" : "5gnr"); });
        ASSERT_NE(found, printed.end());
        const std::string text = (*found).toString().toStdString();
        const auto hexadecimal = [](auto number) { return QString::number(number, 16).toUpper().toStdString(); };
        EXPECT_THAT(text, testing::HasSubstr(hexadecimal(cell.ci.value_or(0))));
        EXPECT_THAT(text, testing::HasSubstr(std::to_string(cell.channel.value_or(0))));
        EXPECT_THAT(text, testing::HasSubstr(cell.serving ? "yes" : "no"));
        if (isLte) {
            EXPECT_THAT(text, testing::HasSubstr(hexadecimal(cell.tac.value_or(0))));
            EXPECT_THAT(text, testing::HasSubstr(hexadecimal(cell.physicalCell.value_or(0))));
            EXPECT_THAT(text, testing::HasSubstr(QString::number(cell.rsrp.value_or(0)).toStdString()));
        }
    }
}

} // namespace
} // namespace kestrum
