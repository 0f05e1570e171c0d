// The order of the model's calls to its ports and its log, and what keeps the model alive during them.
#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// Message ports that record the calls.
class WatchedPorts final : public MessagePorts {
public:
    explicit WatchedPorts(MessagePorts& ports) : _ports(ports) {}

    std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) override
    {
        auto port = std::make_unique<WatchedLocal>("receive", _ports.createLocal(name, std::move(handler)), *this);
        local = port.get();
        return port;
    }
    std::unique_ptr<RemotePort> createRemote(std::string_view name) override
    {
        tell("create send");
        auto port = std::make_unique<WatchedRemote>("send", _ports.createRemote(name), *this);
        remote = port.get();
        return port;
    }

    std::vector<std::string> calls;
    std::function<void(std::string_view call)> onCall;
    const void* local = nullptr;
    const void* remote = nullptr;

private:
    template <typename Role>
    class Watched : public Role {
    public:
        Watched(std::string name, std::unique_ptr<Role> port, WatchedPorts& by)
            : _port(std::move(port)), _name(std::move(name)), _by(by)
        {}

        bool isValid() const override { return _port->isValid(); }
        void invalidate() override
        {
            _by.tell("invalidate " + _name);
            _port->invalidate();
        }
        void setInvalidationHandler(std::function<void()> handler) override
        {
            _by.tell((handler ? "handle end of " : "ignore end of ") + _name);
            _port->setInvalidationHandler(std::move(handler));
        }

    protected:
        std::unique_ptr<Role> _port;

    private:
        std::string _name;
        WatchedPorts& _by;
    };
    class WatchedLocal final : public Watched<LocalPort> {
    public:
        using Watched::Watched;
        void setDeliveryQueue(MainQueue& queue) override { _port->setDeliveryQueue(queue); }
    };
    class WatchedRemote final : public Watched<RemotePort> {
    public:
        using Watched::Watched;
        Sent sendRequest(std::int32_t id, Bytes payload, std::chrono::milliseconds sendTimeout,
                         std::chrono::milliseconds receiveTimeout, Reply reply) override
        {
            return _port->sendRequest(id, payload, sendTimeout, receiveTimeout, reply);
        }
    };

    void tell(const std::string& call)
    {
        calls.push_back(call);
        if (const auto run = onCall) // a copy, because the call may replace it
            run(call);
    }

    MessagePorts& _ports;
};

class Order : public Monitor {
protected:
    Order()
    {
        model = std::make_shared<KestrumModel>(watchedRoles);
        model->setObserver(nullptr);
    }
    // The model is destroyed before the ports that it uses.
    ~Order() override
    {
        queue.drop();
        model.reset();
    }

    /// Releases the test's reference to the model. Work in progress must keep the model alive until its end.
    void letGo()
    {
        watched = model;
        model.reset();
        EXPECT_FALSE(watched.expired()) << "it is being called";
    }
    static std::string shown(const void* address) { return formatted("%p", address); }

    WatchedPorts watchedPorts{ports};
    MonitorRoles watchedRoles{roles, queue, watchedPorts, telephony};
    std::weak_ptr<KestrumModel> watched;
};

TEST_F(Order, LinesNameThePortsInTheirPlaces)
{
    log.showsAddresses = true;
    model->startMonitor();
    EXPECT_EQ(log.errors().front(),
              " ***** Created ports (send=" + shown(watchedPorts.remote) + ", recv=" + shown(watchedPorts.local) + ")");
    const auto local = watchedPorts.local;
    log.lines.clear();
    ports.invalidateLocal(kLogPort);
    queue.run();
    EXPECT_EQ(log.errors().front(), " ***** INVALIDATED " + shown(local) + " *****");
}

TEST_F(Order, LinesNameTheGeneratorThatWasMade)
{
    log.showsAddresses = true;
    model->startMonitor();
    const std::string made = "Creating Log object: ";
    const auto line = log.texts(Priority::Warning).front();
    ASSERT_TRUE(line.starts_with(made));
    EXPECT_EQ(log.count("Got log generated: " + line.substr(made.size())), 1u);
}

TEST_F(Order, APortsHandlerIsRemovedBeforeItIsClosed)
{
    model->startMonitor();
    watchedPorts.calls.clear();
    model->destroyPorts();
    EXPECT_THAT(watchedPorts.calls,
                ElementsAre("ignore end of receive", "invalidate receive", "ignore end of send", "invalidate send"));
}

TEST_F(Order, TheServerConnectionIsReleasedBeforeTheCommandPortIsMade)
{
    int open = -1;
    watchedPorts.onCall = [&](std::string_view call) {
        if (call == "create send")
            open = telephony.openConnections();
    };
    model->startMonitor();
    EXPECT_EQ(open, 0);
}

TEST_F(Order, AFailureIsLoggedThenThePortsAreClosedThenTheRetryIsPosted)
{
    telephony.answer.errorCode = 1;
    std::vector<std::string> order;
    const auto retries = [this] { return std::to_string(queue.tasks()); };
    log.onWrite = [&](std::string_view text) {
        if (text == "Could not create the ports necessary")
            order.push_back(ports.hasLocal(kLogPort) ? "logged, open, " + retries() : "logged, closed");
    };
    watchedPorts.onCall = [&](std::string_view call) {
        if (call == "invalidate receive")
            order.push_back("closed, " + retries());
    };
    model->startMonitor();
    EXPECT_THAT(order, ElementsAre("logged, open, 0", "closed, 0"));
    seconds(1);
    EXPECT_EQ(queue.tasks(), 1u);
}

// Each entry point keeps the model alive until it returns.

TEST_F(Order, RefreshKeepsTheModel)
{
    ASSERT_TRUE(model->createPorts());
    ports.kill(kCommandPort);
    watchedPorts.onCall = [this](std::string_view call) {
        watchedPorts.onCall = nullptr;
        EXPECT_EQ(call, "invalidate receive");
        letGo();
    };
    model->updateWithData({});
    model->refresh();
    EXPECT_TRUE(watched.expired());
}

TEST_F(Order, UpdateKeepsTheModel)
{
    ASSERT_TRUE(model->createPorts());
    model->configureGenerator();
    log.onWrite = [this](std::string_view) {
        log.onWrite = nullptr;
        letGo();
    };
    model->updateWithData(bytesOf("no property list"));
    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(model, nullptr);
}

TEST_F(Order, ClosingKeepsTheModel)
{
    ASSERT_TRUE(model->createPorts());
    watchedPorts.onCall = [this](std::string_view call) {
        if (call == "invalidate receive")
            letGo();
    };
    model->destroyPorts();
    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(watchedPorts.calls.back(), "invalidate send");
}

TEST_F(Order, OpeningKeepsTheModel)
{
    watchedPorts.onCall = [this](std::string_view call) {
        if (call == "create send")
            letGo();
    };
    EXPECT_TRUE(model->createPorts());
    EXPECT_TRUE(watched.expired());
}

TEST_F(Order, RestartKeepsTheModelUntilItRunsItself)
{
    model->startMonitor();
    watchedPorts.onCall = [this](std::string_view call) {
        watchedPorts.onCall = nullptr;
        EXPECT_EQ(call, "ignore end of receive");
        letGo();
    };
    model->restartMonitor();
    EXPECT_FALSE(watched.expired()) << "its timer holds it";
    queue.drop();
    EXPECT_TRUE(watched.expired());
}

} // namespace
} // namespace kestrum
