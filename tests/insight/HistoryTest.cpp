// What a history keeps of a model that runs.
#include "insight/History.h"

#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class HistoryTest : public Monitor {
protected:
    HistoryTest()
    {
        startRunning();
        model->setWatch(&history);
    }
    ~HistoryTest() override { model->setWatch(nullptr); }

    void show(const char* arfcn, const char* rssi)
    {
        stream(makeDictionary({{"Serving Cell", makeDictionary({{"ARFCN", arfcn}, {"RSSI", rssi}})}, {"Band", "3"}}));
        seconds(2);
        model->topLevelNodes();
    }
    std::vector<std::string> happened() const
    {
        std::vector<std::string> list;
        for (const auto& each : history.events())
            list.push_back(std::string(word(each.kind)) + ": " + each.is);
        return list;
    }

    History history{clock};
};

TEST_F(HistoryTest, KeepsDisplaysAndTheirNumbers)
{
    show("60", "-53 dBm");
    show("60", "-57 dBm");
    EXPECT_EQ(history.moments().size(), 2u);
    const auto points = history.trends().exact("/Serving Cell/RSSI");
    ASSERT_EQ(points.size(), 2u);
    EXPECT_EQ(points[0].number, -53);
    EXPECT_EQ(points[1].number, -57);
    EXPECT_EQ(points[1].time, history.moments().newest()->time);
}

TEST_F(HistoryTest, ASilenceIsNotedWhileItLasts)
{
    show("60", "-53 dBm");
    seconds(8);
    EXPECT_THAT(happened(), testing::Not(testing::Contains("silence: silent")));
    seconds(60);
    EXPECT_THAT(happened(), testing::Contains("silence: silent").Times(1));
    show("60", "-53 dBm");
    show("60", "-53 dBm");
    EXPECT_THAT(happened(), testing::Contains("silence: streaming").Times(1));
}

TEST_F(HistoryTest, AStepOfTheClockIsNoSilence)
{
    show("60", "-53 dBm");
    clock.date += std::chrono::hours(1);
    seconds(4);
    EXPECT_THAT(happened(), testing::Not(testing::Contains("silence: silent")));
}

TEST_F(HistoryTest, ConnectionsAreEvents)
{
    EXPECT_THAT(happened(), IsEmpty()) << "the first one is none";
    ports.kill(kCommandPort);
    seconds(2);
    serve();
    seconds(60);
    EXPECT_THAT(happened(), ElementsAre("connection: lost", "connection: connected"));
}

} // namespace
} // namespace kestrum
