#pragma once

#include "core/KestrumModel.h"
#include "doubles/MonitorDoubles.h"

#include <gmock/gmock.h>

#include <string>
#include <vector>

namespace kestrum {

/// A model and its telephony service. The service runs IFX and answers every request correctly, until the test
/// changes it.
class Monitor : public testing::Test, protected MonitorDoubles, protected KestrumModelObserver {
protected:
    static constexpr const char* kCommandPort = "vox.commands";
    static constexpr const char* kLogPort = "org.kestrum.vox.baseband-state-report.log";

    Monitor()
    {
        model = std::make_shared<KestrumModel>(monitorRoles);
        model->setObserver(this);
        modemRuns("kVoxLogChannelTechnology_IFX");
        serve();
    }

    /// Listens for commands, as a service does after its start.
    void serve()
    {
        ports.serve(kCommandPort, [this](const MemoryPorts::Request& request) {
            if (request.text() != R"({"GetTechnology": "GetTechnology"})")
                return MemoryPorts::Answer{startStatus};
            if (whileAsked)
                whileAsked();
            return technology;
        });
    }

    void modemRuns(std::string_view name) { replyIs(makeDictionary({{"GetTechnology", name}})); }
    /// The reply is a property list with that value; null for bytes that are no property list.
    void replyIs(const Value& value, std::chrono::milliseconds after = std::chrono::milliseconds(0))
    {
        propertyLists.parsed["reply"] = value;
        technology = {0, Data(bytesOf("reply")), after};
    }

    /// The service streams a property list, which is delivered at once.
    void stream(const Value& list, std::int32_t messageId = 0)
    {
        propertyLists.parsed["list"] = list;
        ports.send(kLogPort, messageId, "list");
        queue.run();
    }

    void seconds(double count) { queue.advance(std::chrono::milliseconds(static_cast<std::int64_t>(count * 1000))); }

    /// Starts the model, and discards its notifications and log lines so far.
    void startRunning()
    {
        model->startMonitor();
        queue.run();
        ASSERT_TRUE(model->isConnected());
        ASSERT_EQ(queue.timers(), 1u);
        log.lines.clear();
        ports.requests.clear();
        told.clear();
    }

    /// The number of GetTechnology requests.
    std::size_t attempts() const
    {
        return static_cast<std::size_t>(std::ranges::count_if(
            ports.requests, [](const auto& request) { return request.reply == RemotePort::Reply::Awaited; }));
    }

    std::string textAt(const std::string& path)
    {
        const auto node = model->nodeAtPath(path);
        return node == nullptr ? "(no node)" : node->value() == nullptr ? "(inner node)" : *node->value();
    }

    std::shared_ptr<KestrumModel> model;
    MemoryPorts::Answer technology;
    std::int32_t startStatus = 0;
    std::function<void()> whileAsked;
    std::vector<std::string> told;

private:
    void updateViewControllerFromModel() override { told.push_back("update"); }
    void updateStatus() override { told.push_back("status"); }
    void displayReplaced() override { told.push_back("replaced"); }
    void messagesLost() override { told.push_back("lost " + std::to_string(model->lostMessages())); }
};

} // namespace kestrum
