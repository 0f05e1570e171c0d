#include "capture/CaptureReader.h"
#include "capture/PositionRecord.h"
#include "doubles/RecordingLog.h"
#include "harness/FileContents.h"
#include "harness/Places.h"
#include "harness/Scratch.h"
#include "platform/TelephonyService.h"
#include "platform/posix/Frame.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/LinuxTelephonyService.h"
#include "platform/qt/QtMainQueue.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"
#include "support/Record.h"

#include <QProcess>
#include <QTcpServer>
#include <QTcpSocket>
#include <gmock/gmock.h>

#include <csignal>
#include <fstream>
#include <sstream>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using namespace std::string_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

std::string little(std::uint64_t value, int bytes)
{
    std::string text;
    for (int i = 0; i < bytes; ++i, value >>= 8)
        text.push_back(static_cast<char>(value & 0xFF));
    return text;
}

std::string record(std::uint16_t code, std::string_view payload, char type = 1)
{
    return type + little(12 + payload.size(), 2) + little(code, 2) + little(0, 8) + std::string(payload);
}

std::string kcap(const std::vector<std::string>& messages)
{
    std::string bytes;
    for (const auto& each : messages)
        bytes += little(each.size(), 4) + each;
    return bytes;
}

/// The service's reply to a request for a log channel that it refuses.
std::string refusal(std::uint32_t serial, std::uint32_t code)
{
    return frame(kReply, 1, serial, little(1, 4) + little(code, 4));
}
constexpr std::size_t kRefusalSize = 13 + 8;

/// The real program, and its clients in this process.
class ServiceTest : public testing::Test {
protected:
    /// voxd in a separate process, in the test's runtime directory.
    struct Voxd {
        QProcess process;
        std::string errors;

        explicit Voxd(const std::string& directory)
        {
            auto environment = QProcessEnvironment::systemEnvironment();
            environment.insert("KESTRUM_RUNTIME_DIR", QString::fromStdString(directory));
            // The test measures its memory, which must not include freed memory that the address sanitizer keeps.
            environment.insert("ASAN_OPTIONS", environment.value("ASAN_OPTIONS") + ":quarantine_size_mb=1");
            process.setProcessEnvironment(environment);
        }
        ~Voxd()
        {
            process.kill();
            process.waitForFinished();
        }
        void launch(const QStringList& arguments)
        {
            process.start(QString::fromStdString(builtProgram("voxd")), arguments);
        }
        /// Waits until it accepts connections.
        bool start(const QStringList& arguments)
        {
            launch(arguments);
            return eventually([&] { return process.canReadLine(); });
        }
        const std::string& log()
        {
            errors += process.readAllStandardError().toStdString();
            return errors;
        }
        bool logs(std::string_view text)
        {
            return eventually([&] { return log().find(text) != std::string::npos; });
        }
        int finish()
        {
            EXPECT_TRUE(eventually([&] { return process.state() == QProcess::NotRunning; }));
            EXPECT_EQ(process.exitStatus(), QProcess::NormalExit);
            return process.exitCode();
        }
        /// Bytes of resident memory.
        std::size_t memory() const
        {
            std::ifstream file("/proc/" + std::to_string(process.processId()) + "/statm");
            std::size_t total = 0, resident = 0;
            file >> total >> resident;
            return resident * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
        }
    };

    /// The display's end of a channel.
    struct Client {
        ServiceTest& test;
        std::string name;
        std::vector<std::string> received = {};
        std::unique_ptr<LocalPort> local = {};
        std::unique_ptr<RemotePort> remote = {};

        ~Client()
        {
            remote.reset();
            local.reset();
        }
        LogChannelAnswer open()
        {
            local = test.ports.createLocal(name, [this](std::int32_t id, Bytes payload) {
                if (id == 0)
                    received.emplace_back(textOf(payload));
                else
                    EXPECT_EQ(id, 1);
            });
            local->setDeliveryQueue(test.queue);
            auto connection = test.telephony.connect({});
            if (!connection)
                return {-1, -1, std::nullopt};
            const auto answer = connection->networkMonitorCreateLogChannel(name);
            if (answer.remotePort)
                remote = test.ports.createRemote(*answer.remotePort);
            return answer;
        }
        RemotePort::Sent send(const Value& command, RemotePort::Reply reply = RemotePort::Reply::None)
        {
            return remote->sendRequest(0, test.lists.toXml(command)->bytes(), 1s, 5s, reply);
        }
        std::string technology()
        {
            const auto sent =
                send(makeDictionary({{"GetTechnology", Value("GetTechnology")}}), RemotePort::Reply::Awaited);
            if (!sent.reply)
                return "no reply";
            const auto answer = test.lists.parse(sent.reply->bytes()).dictionary();
            return answer ? answer->at("GetTechnology").text().value_or("no answer") : "no answer";
        }
        void startStreaming() { EXPECT_EQ(send(makeDictionary({{"SetState", Value("Streaming")}})).status, 0); }
        bool hasReceived(std::size_t count)
        {
            return eventually([&] { return received.size() >= count; });
        }
    };

    std::string capture(const std::vector<std::string>& messages, const std::string& name = "a.kcap")
    {
        std::ofstream(files / name, std::ios::binary) << kcap(messages);
        return files / name;
    }
    static QStringList replay(const std::string& path, const QStringList& more = {})
    {
        return QStringList{"--replay", QString::fromStdString(path)} + more;
    }
    std::vector<std::string> sockets() const
    {
        std::vector<std::string> names;
        for (const auto& each : std::filesystem::directory_iterator(directory.path()))
            names.push_back(each.path().filename().string());
        return names;
    }

    /// Requests a channel to a port that the test serves, the service's `number`th, and returns its command port.
    RawSocket openChannel(const std::string& address, int number) const
    {
        const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
        server.send(frame(kRequest, 1, 1, address));
        const auto name =
            "org.kestrum.vox.command." + std::to_string(voxd.process.processId()) + "." + std::to_string(number);
        constexpr std::size_t kFrameAndErrors = 13 + 8;
        return RawSocket::connectTo(directory / server.receive(kFrameAndErrors + name.size()).substr(kFrameAndErrors));
    }

    ScratchDirectory directory, files;
    PropertyListCodec lists;
    RecordingLog log;
    QtMainQueue queue;
    LinuxMessagePorts ports{directory.path(), queue, log};
    LinuxTelephonyService telephony{directory.path(), ports, queue, log};
    Voxd voxd{directory.path()};
};

TEST_F(ServiceTest, AnswersGetTechnologyAndStreamsTheScenario)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    Client client{*this, "log"};
    const auto answer = client.open();
    EXPECT_EQ(answer.errorCode, 0);
    ASSERT_TRUE(client.remote);
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_IFX");
    EXPECT_THAT(client.received, IsEmpty()) << "before the start command";
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(10));
    for (const auto& each : client.received)
        EXPECT_TRUE(lists.parse(bytesOf(each)).dictionary());
    EXPECT_THAT(log.lines, IsEmpty());
}

TEST_F(ServiceTest, StreamsNothingBeforeTheStartCommandAndLosesNothingUntilThen)
{
    ASSERT_TRUE(voxd.start(replay(capture({record(0xB0C2, "1"), record(0xB0C2, "2")}), {"--speed", "1000"})));
    Client client{*this, "log"};
    client.open();
    for (int i = 0; i < 20; ++i) // each one a round trip through the service's event loop
        EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_THAT(client.received, IsEmpty());
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(2));
    EXPECT_THAT(client.received, ElementsAre(record(0xB0C2, "1"), record(0xB0C2, "2")));
}

TEST_F(ServiceTest, SendsOnlyTheCodesAskedFor)
{
    const std::vector<std::string> messages{record(0xB0C2, "a"),
                                            record(0xB179, "b"),
                                            record(1, "c", '\xFF'),
                                            record(2, "d", '\xFF'),
                                            "\x81\x01" + record(0xB0C2, "e"),
                                            record(0xB0C2, "last")};
    ASSERT_TRUE(voxd.start(replay(capture(messages), {"--speed", "1000"})));
    Client client{*this, "log"};
    client.open();
    client.send(makeDictionary({{"SetState", Value("Streaming")},
                                {"SetZephraLogCodes", makeArray({Value(0xB0C2)})},
                                {"SetVoxExtraCodes", makeArray({Value(2)})}}));
    ASSERT_TRUE(client.hasReceived(4));
    EXPECT_THAT(client.received, ElementsAre(messages[0], messages[3], messages[4], messages[5]));
}

TEST_F(ServiceTest, StopsWhenAskedForAnotherState)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "200"}));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(5));
    client.send(makeDictionary({{"SetState", Value("Idle")}}));
    client.technology(); // earlier messages have arrived when this is answered, or arrive in the next round of the loop
    ASSERT_TRUE(eventually([&, before = std::size_t{0}]() mutable {
        client.technology();
        return std::exchange(before, client.received.size()) == client.received.size();
    }));
}

TEST_F(ServiceTest, ServesSeveralClientsTheSameLog)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    Client one{*this, "one"}, two{*this, "two"};
    one.open();
    two.open();
    EXPECT_EQ(one.technology(), two.technology());
    one.startStreaming();
    ASSERT_TRUE(one.hasReceived(3));
    two.startStreaming();
    ASSERT_TRUE(two.hasReceived(5));
    ASSERT_TRUE(eventually([&] { return std::ranges::count(one.received, two.received[4]) == 1; }));
    const auto at = std::ranges::find(one.received, two.received[0]);
    EXPECT_TRUE(std::equal(two.received.begin(), two.received.begin() + 5, at));
    one.remote.reset(); // closing the first channel must not close the second
    const auto before = two.received.size();
    EXPECT_TRUE(two.hasReceived(before + 5));
}

TEST_F(ServiceTest, EndsAChannelWhoseClientHasGoneAndGoesOnForTheNext)
{
    std::vector<std::string> messages;
    for (int i = 0; i < 40; ++i)
        messages.push_back(record(0xB0C2, std::to_string(i)));
    ASSERT_TRUE(voxd.start(replay(capture(messages), {"--speed", "20"})));
    std::size_t seen = 0;
    {
        Client first{*this, "log"};
        first.open();
        first.startStreaming();
        ASSERT_TRUE(first.hasReceived(3));
        seen = first.received.size();
    }
    ASSERT_TRUE(eventually([&] { return sockets() == std::vector<std::string>{"org.kestrum.vox"}; }))
        << "the channel's command port is gone";
    Client second{*this, "log"};
    second.open();
    second.startStreaming();
    ASSERT_TRUE(second.hasReceived(3));
    // The log did not advance between the two.
    EXPECT_LT(std::ranges::find(messages, second.received[0]) - messages.begin(),
              static_cast<std::ptrdiff_t>(seen) + 10);
}

TEST_F(ServiceTest, ChangesItsTechnologyByMakingTheClientsConnectAgain)
{
    ASSERT_TRUE(voxd.start(
        replay(capture({record(0xB0C2, "lte"), record(0x417A, "umts"), record(0x417A, "more")}), {"--speed", "100"})));
    Client client{*this, "log"};
    client.open();
    std::vector<std::string> notifications;
    const auto connection = telephony.connect([&](std::string_view name) { notifications.emplace_back(name); });
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_Zephra_LTE");
    client.startStreaming();
    ASSERT_TRUE(eventually([&] { return !client.remote->isValid(); }));
    ASSERT_TRUE(client.hasReceived(1));
    EXPECT_THAT(client.received, ElementsAre(record(0xB0C2, "lte")));
    EXPECT_TRUE(eventually([&] { return !notifications.empty(); }));
    EXPECT_THAT(notifications, ElementsAre("kVoxTechnologyChangedNotification"));

    client.remote.reset();
    client.local.reset();
    client.open();
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_Zephra_GSM");
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(3));
    EXPECT_EQ(client.received[1], record(0x417A, "umts")) << "nothing is lost by the change";
    EXPECT_EQ(client.received[2], record(0x417A, "more"));
}

TEST_F(ServiceTest, RecordsWhatItStreamsAndReplaysIt)
{
    const auto recorded = files / "recorded.kcap";
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "100", "--record", QString::fromStdString(recorded)}));
    std::vector<std::string> live;
    {
        Client client{*this, "log"};
        client.open();
        client.startStreaming();
        ASSERT_TRUE(client.hasReceived(20));
        live = client.received;
    }
    voxd.process.terminate();
    EXPECT_EQ(voxd.finish(), 0);

    Voxd again(directory.path());
    ASSERT_TRUE(again.start(replay(recorded, {"--speed", "100"})));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(20));
    client.received.resize(20);
    live.resize(20);
    EXPECT_EQ(client.received, live);
}

TEST_F(ServiceTest, WritesACaptureAtOnceEqualForEqualSeeds)
{
    for (const char* name : {"/one.kcap", "/two.kcap"}) {
        Voxd writer(directory.path());
        writer.launch({"--scenario", "ifx", "--seed", "5", "--start", "2026-11-16T06:05:42Z", "--seconds", "30",
                       "--write", QString::fromStdString(files.path() + name)});
        EXPECT_EQ(writer.finish(), 0);
    }
    const auto one = contentsOf(files / "one.kcap");
    EXPECT_GT(one.size(), 60u * 500);
    EXPECT_TRUE(one == contentsOf(files / "two.kcap"));
}

TEST_F(ServiceTest, AfterAKillItsPortsAreInvalidAndItStartsAgain)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(1));
    voxd.process.kill();
    ASSERT_TRUE(eventually([&] { return !client.remote->isValid(); }));
    EXPECT_TRUE(client.local->isValid());
    // Its sockets are closed one after the other. All of them are closed after its end.
    ASSERT_TRUE(eventually([&] { return voxd.process.state() == QProcess::NotRunning; }));
    EXPECT_FALSE(telephony.connect({}));
    EXPECT_THAT(sockets(), testing::Contains("org.kestrum.vox")) << "killed, it could not remove it";

    Voxd next(directory.path());
    ASSERT_TRUE(next.start({"--scenario", "ifx", "--speed", "50"}));
    client.remote.reset();
    client.local.reset();
    client.received.clear();
    EXPECT_EQ(client.open().errorCode, 0);
    client.startStreaming();
    EXPECT_TRUE(client.hasReceived(3));
}

class Termination : public ServiceTest, public testing::WithParamInterface<int> {};

TEST_P(Termination, EndsItCleanly)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(1));
    ::kill(static_cast<pid_t>(voxd.process.processId()), GetParam());
    EXPECT_EQ(voxd.finish(), 0);
    client.local.reset();
    EXPECT_THAT(sockets(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Signals, Termination, testing::Values(SIGTERM, SIGINT),
                         [](const auto& each) { return std::string(each.param == SIGTERM ? "Term" : "Int"); });

TEST_F(ServiceTest, ASecondOneInTheSameDirectorySaysWhatIsWrong)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    Voxd second(directory.path());
    second.launch({"--scenario", "ifx"});
    EXPECT_EQ(second.finish(), 1);
    EXPECT_EQ(second.log(), "voxd: another process listens at " + (directory / "org.kestrum.vox") + "\n");
    Client client{*this, "log"};
    EXPECT_EQ(client.open().errorCode, 0) << "the first one is unharmed";
}

TEST_F(ServiceTest, MalformedFramesEndTheirConnectionWithOneLineEach)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    Client client{*this, "log"};
    client.open();
    const auto bad = RawSocket::connectTo(directory / "org.kestrum.vox");
    bad.send("\xFF\xFF\xFF\xFF more");
    EXPECT_TRUE(eventually([&] { return bad.isAbandoned(); }));
    EXPECT_TRUE(voxd.logs("Port org.kestrum.vox: closed the connection of process " + std::to_string(::getpid()) +
                          ": a frame of 4294967295 bytes"));

    const auto receiving = RawSocket::listenAt(directory / "rude.1");
    const auto command = openChannel("rude.1", 2);
    ASSERT_TRUE(command.isOpen());
    command.send(std::string("\0\0\0\0", 4));
    EXPECT_TRUE(eventually([&] { return command.isAbandoned(); }));
    EXPECT_TRUE(voxd.logs(".2: closed the connection of process"));

    client.startStreaming();
    EXPECT_TRUE(client.hasReceived(3)) << "the others are served";
}

TEST_F(ServiceTest, CommandsThatAreNoDictionaryAreLoggedAndTheNextOneIsServed)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    Client client{*this, "log"};
    client.open();
    const auto deep = [] {
        std::string text = "<plist version=\"1.0\">";
        for (int i = 0; i < 100'000; ++i)
            text += "<array>";
        return text;
    }();
    for (const auto& each : {"noise"s, "<plist version=\"1.0\"><string>text</string></plist>"s, ""s, deep})
        client.remote->sendRequest(0, bytesOf(each), 1s, 0ms, RemotePort::Reply::None);
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_IFX");
    EXPECT_TRUE(voxd.logs("a command that is not a dictionary (5 bytes)"));
    EXPECT_TRUE(voxd.logs("a command that is not a dictionary (0 bytes)"));
    EXPECT_TRUE(voxd.logs("a command that is not a dictionary (" + std::to_string(deep.size()) + " bytes)"));
}

TEST_F(ServiceTest, IgnoresOtherMessageIds)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "100"}));
    Client client{*this, "log"};
    client.open();
    const auto start = lists.toXml(makeDictionary({{"SetState", Value("Streaming")}}));
    client.remote->sendRequest(7, start->bytes(), 1s, 0ms, RemotePort::Reply::None);
    for (int i = 0; i < 20; ++i)
        client.technology();
    EXPECT_THAT(client.received, IsEmpty());
}

TEST_F(ServiceTest, RefusesALogChannelToAPortWithoutAListener)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
    server.send(frame(kRequest, 1, 1, "absent"));
    EXPECT_EQ(server.receive(kRefusalSize), refusal(1, 3));
    server.send(frame(kRequest, 1, 2, "../../etc/passwd"));
    EXPECT_EQ(server.receive(kRefusalSize), refusal(2, 1));
    Client client{*this, "log"};
    EXPECT_EQ(client.open().errorCode, 0);
}

TEST_F(ServiceTest, AListenerThatNeverAcceptsDelaysOnlyItsClient)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    const auto full = RawSocket::listenAt(directory / "full.1", 0);
    const auto first = RawSocket::connectTo(directory / "full.1");
    std::vector<RawSocket> askers;
    for (int i = 0; i < 20; ++i) {
        askers.push_back(RawSocket::connectTo(directory / "org.kestrum.vox"));
        for (std::uint32_t serial = 1; serial <= 10; ++serial)
            askers.back().send(frame(kRequest, 1, serial, "full.1"));
    }
    // Each of those requests takes a second. The others are served during that time.
    Client client{*this, "log"};
    EXPECT_EQ(client.open().errorCode, 0);
    client.startStreaming();
    EXPECT_TRUE(client.hasReceived(3));
    EXPECT_EQ(askers.front().received(), "");
    EXPECT_EQ(askers.back().receive(kRefusalSize), refusal(1, 3));
}

TEST_F(ServiceTest, LogsARefusalOnceUntilSomethingChanges)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
    const auto askForAbsent = [&](std::uint32_t serial) {
        server.send(frame(kRequest, 1, serial, "absent." + std::to_string(serial)));
        EXPECT_EQ(server.receive(kRefusalSize), refusal(serial, 3));
    };
    for (std::uint32_t serial = 1; serial <= 50; ++serial)
        askForAbsent(serial);
    EXPECT_TRUE(voxd.logs("refused a log channel to \"absent.1\": no process listens there"));
    Client client{*this, "log"};
    EXPECT_EQ(client.open().errorCode, 0);
    askForAbsent(51);
    EXPECT_TRUE(voxd.logs("refused a log channel to \"absent.51\""));
    EXPECT_EQ(voxd.log().find("absent.2"), std::string::npos);
}

TEST_F(ServiceTest, RepliesThatAreNotReadCostBoundedMemory)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    Client client{*this, "log"};
    ASSERT_EQ(client.open().errorCode, 0);
    const auto before = voxd.memory();
    const auto flood = [&](const RawSocket& socket, const std::string& request) {
        std::string requests;
        for (int i = 0; i < 2000; ++i)
            requests += request;
        // Until the service takes no more, which its answers to another client prove.
        std::size_t sent = 0;
        for (int refused = 0; refused < 20;) {
            const auto n = socket.sendSome(std::string_view(requests).substr(sent % requests.size()));
            if (n > 0) {
                sent += static_cast<std::size_t>(n);
                refused = 0;
            } else {
                ++refused;
                EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_IFX");
            }
            if (sent > (std::size_t{64} << 20))
                break;
        }
        EXPECT_FALSE(socket.isAbandoned());
        return sent;
    };
    const auto server = RawSocket::connectTo(directory / "org.kestrum.vox");
    EXPECT_LT(flood(server, frame(kRequest, 99, 1, "")), std::size_t{16} << 20);

    const auto receiving = RawSocket::listenAt(directory / "mute.1");
    const auto command = openChannel("mute.1", 2);
    const auto question = lists.toXml(makeDictionary({{"GetTechnology", Value("GetTechnology")}}));
    EXPECT_LT(flood(command, frame(kRequest, 0, 1, textOf(question->bytes()))), std::size_t{16} << 20);
    EXPECT_LT(voxd.memory(), before + (std::size_t{16} << 20));
}

TEST_F(ServiceTest, SilentConnectionsDelayNoOtherClient)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "50"}));
    std::vector<RawSocket> silent;
    for (int i = 0; i < 30; ++i)
        silent.push_back(RawSocket::connectTo(directory / "org.kestrum.vox"));
    Client client{*this, "log"};
    EXPECT_EQ(client.open().errorCode, 0);
    client.startStreaming();
    EXPECT_TRUE(client.hasReceived(3));
}

TEST_F(ServiceTest, BoundsItsConnectionsAndItsChannels)
{
    ASSERT_TRUE(voxd.start({"--scenario", "ifx"}));
    std::vector<std::unique_ptr<Client>> clients;
    for (int i = 0; i < 16; ++i) {
        clients.push_back(std::make_unique<Client>(*this, "log" + std::to_string(i)));
        EXPECT_EQ(clients.back()->open().errorCode, 0) << i;
    }
    Client oneMore{*this, "more"};
    EXPECT_EQ(oneMore.open().errorCode, 2);
    std::vector<RawSocket> many;
    for (int i = 0; i < 70; ++i)
        many.push_back(RawSocket::connectTo(directory / "org.kestrum.vox"));
    EXPECT_TRUE(voxd.logs("refused a server connection: there are already 64"));
}

TEST_F(ServiceTest, AClientThatReadsNothingCostsBoundedMemoryAndDelaysNoOther)
{
    std::vector<std::string> messages;
    for (int i = 0; i < 100; ++i)
        messages.push_back(record(0xB0C2, std::string(20'000, static_cast<char>('a' + i % 26))));
    // The nominal spacing of 0.5 s becomes 5 µs: about 200,000 messages per second, if they were read.
    ASSERT_TRUE(voxd.start(replay(capture(messages), {"--loop", "--speed", "100000"})));
    const auto receiving = RawSocket::listenAt(directory / "deaf.1");
    const auto command = openChannel("deaf.1", 1);
    const auto start = lists.toXml(makeDictionary({{"SetState", Value("Streaming")}}));
    command.send(frame(kMessage, 0, 0, textOf(start->bytes())));
    ASSERT_TRUE(voxd.logs("its client does not read, the oldest messages are dropped"));

    Client client{*this, "log"};
    client.open();
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_Zephra_LTE") << "commands are served under the flood";
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(2000)) << client.received.size() << voxd.log();
    for (const auto& each : client.received)
        ASSERT_EQ(each.size(), 20'013u) << "messages are dropped whole";
    EXPECT_LT(voxd.memory(), std::size_t{100} << 20);

    // When it reads again, the service reports the lost messages to it, and in the service's log.
    const auto deaf = receiving.accept();
    client.send(makeDictionary({{"SetState", Value("Idle")}}));
    command.send(frame(kMessage, 0, 0, textOf(lists.toXml(makeDictionary({{"SetState", Value("Idle")}}))->bytes())));
    FrameReader reader;
    std::uint64_t missing = 0;
    EXPECT_TRUE(eventually([&] {
        const auto bytes = deaf.received();
        const auto room = reader.room(bytes.size());
        std::ranges::copy(bytesOf(bytes), room.begin());
        reader.filled(bytes.size());
        while (const auto each = reader.next()) {
            EXPECT_THAT(each->messageId, testing::AnyOf(0, 1));
            if (each->messageId != 1)
                continue;
            EXPECT_EQ(each->kind, Frame::Kind::Message);
            EXPECT_EQ(each->payload.size(), 8u);
            missing += Record(each->payload).read(u32(0)).value_or(0);
        }
        return voxd.log().find("its client reads again, ") != std::string::npos;
    }));
    EXPECT_GT(missing, 0u);
    EXPECT_THAT(voxd.log(), HasSubstr("its client reads again, " + std::to_string(missing) + " messages were dropped"));
}

TEST_F(ServiceTest, ItsRecordingHoldsAllAndNotesWhatAClientMissed)
{
    const auto recording = files / "recording.kcap";
    const std::vector<std::string> messages(100, record(0xB0C2, std::string(20'000, 'r')));
    // The nominal spacing of 0.5 s, 4,000 times as fast: 160 MB per second.
    ASSERT_TRUE(voxd.start(
        replay(capture(messages), {"--loop", "--speed", "4000", "--record", QString::fromStdString(recording)})));
    const auto receiving = RawSocket::listenAt(directory / "deaf.1");
    const auto command = openChannel("deaf.1", 1);
    const auto order = [&](const char* state) {
        const auto list = lists.toXml(makeDictionary({{"SetState", Value(state)}}));
        command.send(frame(kMessage, 0, 0, textOf(list->bytes())));
    };
    order("Streaming");
    ASSERT_TRUE(voxd.logs("its client does not read, the oldest messages are dropped"));
    order("Idle");
    const auto deaf = receiving.accept();
    ASSERT_TRUE(eventually([&] {
        deaf.received();
        return voxd.log().find("its client reads again, ") != std::string::npos;
    }));

    std::ifstream file(recording, std::ios::binary);
    ByteWindow window(file);
    const auto recorded = CaptureReader::make(CaptureFormat::Kcap, window, OnDamage::Stop,
                                              [](const CaptureFault& fault) { ADD_FAILURE() << fault.reason; });
    while (const auto message = recorded->next())
        ASSERT_EQ(message->size(), 20'013u);
    EXPECT_GT(recorded->missing(), 0u);
    EXPECT_THAT(voxd.log(),
                HasSubstr("its client reads again, " + std::to_string(recorded->missing()) + " messages were dropped"));
}

/// A gpsd that reports one position, ten times a second.
class OneReceiver {
public:
    OneReceiver()
    {
        _server.listen(QHostAddress::LocalHost);
        QObject::connect(&_timer, &QTimer::timeout, &_server, [this] {
            if (auto* const peer = _server.nextPendingConnection())
                _peers.push_back(peer);
            for (auto* const peer : _peers)
                peer->write("{\"class\":\"TPV\",\"device\":\"/dev/a\",\"mode\":2,\"lat\":52.52,\"lon\":13.4}\n");
        });
        _timer.start(100ms);
    }
    QString address() const { return "127.0.0.1:" + QString::number(_server.serverPort()); }

private:
    QTcpServer _server;
    std::vector<QTcpSocket*> _peers;
    QTimer _timer;
};

bool isPosition(std::string_view message)
{
    const auto record = channelRecord(bytesOf(message));
    return record && record->code == kPositionRecord;
}

TEST_F(ServiceTest, PositionsAreRecordedAndReachNoDisplayThatDoesNotAskForThem)
{
    const OneReceiver receiver;
    const auto recording = files / "recording.kcap";
    ASSERT_TRUE(voxd.start({"--scenario", "lte", "--speed", "5", "--position", receiver.address(), "--record",
                            QString::fromStdString(recording)}));
    Client all{*this, "all"}, display{*this, "display"};
    all.open();
    display.open();
    display.send(makeDictionary({{"SetState", "Streaming"},
                                 {"SetZephraLogCodes", makeArray({Value(0xB0C1), Value(0xB17F)})},
                                 {"SetVoxExtraCodes", makeArray({Value(0), Value(1), Value(2)})}}));
    all.startStreaming();
    ASSERT_TRUE(eventually([&] { return std::ranges::count_if(all.received, isPosition) >= 3; }));
    const auto sent = static_cast<std::size_t>(std::ranges::count_if(all.received, isPosition));
    EXPECT_FALSE(display.received.empty());
    EXPECT_EQ(std::ranges::count_if(display.received, isPosition), 0);
    voxd.process.terminate();
    EXPECT_EQ(voxd.finish(), 0);

    std::ifstream file(recording, std::ios::binary);
    ByteWindow window(file);
    const auto recorded = CaptureReader::make(CaptureFormat::Kcap, window, OnDamage::Stop,
                                              [](const CaptureFault& fault) { ADD_FAILURE() << fault.reason; });
    std::size_t positions = 0;
    std::optional<std::uint64_t> stamp;
    while (const auto message = recorded->next()) {
        const auto read = channelRecord(*message);
        ASSERT_TRUE(read);
        if (stamp) {
            EXPECT_EQ(read->timeStamp, stamp) << "of the record behind it";
        }
        stamp = isPosition(textOf(*message)) ? std::optional(read->timeStamp) : std::nullopt;
        positions += stamp.has_value();
    }
    EXPECT_GE(positions, sent);
}

TEST_F(ServiceTest, TreesGetThePosition)
{
    const OneReceiver receiver;
    ASSERT_TRUE(voxd.start({"--scenario", "ifx", "--speed", "5", "--position", receiver.address()}));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    EXPECT_TRUE(eventually([&] {
        return !client.received.empty() &&
               positionIn(lists.parse(bytesOf(client.received.back())).dictionary()->at("Position")) ==
                   Position{2, 52.52, 13.4, {}, {}};
    }));
}

struct BadUse {
    const char* name;
    QStringList arguments;
    int status;
    const char* says;

    friend void PrintTo(const BadUse& shown, std::ostream* out) { *out << shown.name; }
};

class BadUses : public ServiceTest, public testing::WithParamInterface<BadUse> {};

TEST_P(BadUses, AreReportedWithTheirReason)
{
    voxd.launch(GetParam().arguments);
    EXPECT_EQ(voxd.finish(), GetParam().status);
    EXPECT_THAT(voxd.log(), HasSubstr(GetParam().says));
    EXPECT_THAT(voxd.process.readAllStandardOutput().toStdString(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(
    CommandLine, BadUses,
    testing::Values(BadUse{"NoSource", {}, 2, "--scenario, --replay or --modem is required"},
                    BadUse{"UnknownScenario", {"--scenario", "moon"}, 2, "there is no scenario moon"},
                    BadUse{"UnknownOption", {"--frobnicate"}, 2, "--frobnicate"},
                    BadUse{"TwoSources", {"--scenario", "ifx", "--replay", "a.kcap"}, 2, "excludes"},
                    BadUse{"SpeedZero", {"--scenario", "ifx", "--speed", "0"}, 2, "--speed"},
                    BadUse{"SpeedNoNumber", {"--scenario", "ifx", "--speed", "fast"}, 2, "--speed"},
                    BadUse{"StartNoDate", {"--scenario", "ifx", "--start", "yesterday"}, 2, "yesterday is not a date"},
                    BadUse{"AModemAndAScenario", {"--scenario", "ifx", "--modem"}, 2, "excludes"},
                    BadUse{"AModemAndACapture", {"--replay", "a.kcap", "--modem"}, 2, "excludes"},
                    BadUse{"AModemAtAnotherSpeed", {"--modem", "all", "--speed", "2"}, 2, "excludes"},
                    BadUse{"AModemOfASeed", {"--modem", "--seed", "2"}, 2, "--scenario"},
                    BadUse{"AModemFromAStart", {"--modem", "--start", "2026-11-16T06:05:42Z"}, 2, "--scenario"},
                    BadUse{"AModemAgain", {"--modem", "--loop"}, 2, "--replay"},
                    BadUse{"AModemWritten", {"--modem", "--write", "a.kcap"}, 2, "excludes"},
                    BadUse{"IdentitiesOfNoModem", {"--scenario", "ifx", "--identities"}, 2, "--modem"},
                    BadUse{"LoopWithoutReplay", {"--scenario", "ifx", "--loop"}, 2, "--replay"},
                    BadUse{"UnknownFault", {"--scenario", "ifx", "--fault", "flood,moon"}, 2, "there is no fault moon"},
                    BadUse{"PositionOfNoAddress",
                           {"--scenario", "ifx", "--position", "host:0"},
                           2,
                           "host:0 is not an address such as localhost:2947"},
                    BadUse{"PositionOfNoTime", {"--scenario", "ifx", "--position", "--write", "a.kcap"}, 2, "excludes"},
                    BadUse{"NoSuchCapture", {"--replay", "/nowhere/a.kcap"}, 1, "/nowhere/a.kcap: cannot be read"},
                    BadUse{"RecordNowhere",
                           {"--scenario", "ifx", "--record", "/nowhere/a.kcap"},
                           1,
                           "/nowhere/a.kcap: cannot be written"}),
    [](const auto& each) { return std::string(each.param.name); });

TEST_F(ServiceTest, PrintsItsVersionAndItsHelp)
{
    voxd.launch({"--version"});
    EXPECT_EQ(voxd.finish(), 0);
    EXPECT_EQ(voxd.process.readAllStandardOutput(), "voxd 1.0.0\n");
    Voxd help(directory.path());
    help.launch({"--help"});
    EXPECT_EQ(help.finish(), 0);
    const auto text = help.process.readAllStandardOutput().toStdString();
    for (const char* each : {"--scenario", "--replay", "--speed", "--loop", "--record", "--seed", "ifx", "--fault",
                             "flood", "--position", "--modem", "--identities"})
        EXPECT_THAT(text, HasSubstr(each));
}

TEST_F(ServiceTest, ReportsThatItsDirectoryCannotBeCreated)
{
    std::ofstream(files / "file") << "";
    Voxd elsewhere(files / "file/inside");
    elsewhere.launch({"--scenario", "ifx"});
    EXPECT_EQ(elsewhere.finish(), 1);
    EXPECT_THAT(elsewhere.log(), HasSubstr("voxd: cannot create " + (files / "file/inside")));
}

TEST_F(ServiceTest, GoesOnServingWhenTheCaptureEnds)
{
    ASSERT_TRUE(voxd.start(replay(capture({record(0xB0C2, "only")}), {"--speed", "1000"})));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(1));
    EXPECT_TRUE(voxd.logs("the log has ended; clients stay connected"));
    EXPECT_EQ(client.technology(), "kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_TRUE(client.remote->isValid());
}

TEST_F(ServiceTest, LogsWhatKestrumLogAllows)
{
    auto environment = voxd.process.processEnvironment();
    environment.insert("KESTRUM_LOG", "error");
    voxd.process.setProcessEnvironment(environment);
    ASSERT_TRUE(voxd.start(replay(capture({record(0xB0C2, "only")}), {"--speed", "1000"})));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(1));
    client.technology(); // the end of the log has been noticed before this is answered
    voxd.process.terminate();
    EXPECT_EQ(voxd.finish(), 0);
    EXPECT_EQ(voxd.log(), "") << "a notice";
}

TEST_F(ServiceTest, LogsWhereADamagedCaptureEnds)
{
    const auto path = files / "damaged.kcap";
    std::ofstream(path, std::ios::binary) << kcap({record(0xB0C2, "good")}) << "\x40\0\0\0short"s;
    ASSERT_TRUE(voxd.start(replay(path, {"--speed", "1000"})));
    Client client{*this, "log"};
    client.open();
    client.startStreaming();
    ASSERT_TRUE(client.hasReceived(1));
    EXPECT_TRUE(voxd.logs(path + ": at offset 21: the last message is cut off (59 bytes missing)"));
}

} // namespace
} // namespace kestrum
