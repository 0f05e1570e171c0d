// Until the user asks for it, a history changes nothing of what is shown, logged or written.
#include "doubles/ApplicationDoubles.h"
#include "support/Format.h"
#include "ui/KestrumApp.h"
#include "ui/ServedModem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

/// A run of the application, with a line for all that can be seen after each step.
class Run {
public:
    explicit Run(bool hasHistory) : _app(KestrumApp::make(_doubles.applicationRoles, hasHistory))
    {
        _doubles.files.paths.insert(kInternalInstall);
        _modem.serve();
        _app->applicationDidFinishLaunching();
        _doubles.queue.run();
        note("launch");
    }

    void show(const Value& display)
    {
        EXPECT_TRUE(_modem.show(display));
        note("show");
    }
    void open(std::string_view key)
    {
        _doubles.toolkit.top().rows.tap(_doubles.toolkit.top().rows.find(key).value());
        note("open");
    }
    void back()
    {
        _doubles.toolkit.navigation->pressBack();
        note("back");
    }
    void save()
    {
        _doubles.toolkit.top().pressSave();
        note("the save screen");
        _doubles.toolkit.navigation->presented->owner.savePressed();
        _doubles.queue.run();
        note("save");
    }
    void disconnect()
    {
        _modem.kill();
        _doubles.queue.advance(30s);
        note("disconnect");
        _modem.serve();
        _doubles.queue.advance(30s);
        note("connect");
    }
    void send(const std::string& message)
    {
        _doubles.ports.send(std::string(kLogChannelServiceName), 0, message);
        _doubles.queue.advance(12s);
        note("send");
    }
    void replaceDisplay()
    {
        _app->displayReplaced();
        note("another technology");
    }
    void terminate()
    {
        _app->applicationWillTerminate();
        for (const auto& [priority, text] : _doubles.log.lines)
            seen.push_back("log: " + text);
        for (const auto& [path, bytes] : _doubles.files.files)
            seen.push_back(formatted("file %@: %lu bytes", path, bytes.size()));
    }

    std::vector<std::string> seen;

private:
    void note(const char* step)
    {
        const auto& view = *_doubles.toolkit.navigation;
        auto& top = _doubles.toolkit.top();
        seen.push_back(
            formatted("%s: %@ | %@ | %d reloads, %d cells, %lu transitions, %d titles, %lu alerts, %lu timers", step,
                      testing::PrintToString(view.path), testing::PrintToString(top.rows.texts()), top.rows.reloads,
                      top.rows.cellsMade, view.transitions.size(), view.titleChanges, _doubles.toolkit.alerts.size(),
                      _doubles.queue.timers()));
        seen.push_back(formatted("%@ | %@ | %@ | %d presentations, %d resigned", top.status(), top.hint, view.notice,
                                 view.presentations, top.resigned));
    }

    ApplicationDoubles _doubles;
    ServedModem _modem{_doubles, _doubles.propertyLists};
    std::shared_ptr<KestrumApp> _app;
};

std::vector<std::string> seenInARun(bool hasHistory)
{
    Run run(hasHistory);
    const auto display = [](const char* arfcn, const char* rssi) {
        return makeDictionary(
            {{"Serving Cell", makeDictionary({{"ARFCN", arfcn}, {"RSSI", rssi}})},
             {"Neighbor Cells", makeDictionary({{"0", makeDictionary({{"ARFCN", "31"}, {"RSSI", rssi}})},
                                                {"1", makeDictionary({{"ARFCN", "32"}, {"RSSI", "-80 dBm"}})}})}});
    };
    run.show(display("60", "-53 dBm"));
    run.open("Neighbor Cells");
    run.open("1");
    run.show(display("61", "-57 dBm"));
    run.send("no message of any kind");
    run.disconnect();
    run.show(display("62", "-59 dBm"));
    run.back();
    run.save();
    run.show(makeDictionary({{"a", "b"}, {"c", "d"}}));
    run.replaceDisplay();
    run.terminate();
    return run.seen;
}

TEST(History, ChangesNothingUntilTheUserAsksForIt)
{
    const auto with = seenInARun(true);
    EXPECT_GT(with.size(), 30u);
    EXPECT_EQ(with, seenInARun(false));
}

} // namespace
} // namespace kestrum
