#include "voxd/Gpsd.h"

#include "doubles/RecordingLog.h"
#include "harness/FileContents.h"
#include "harness/Places.h"
#include "qtplatform/EventLoop.h"

#include <QFileInfo>
#include <QProcess>
#include <QTcpServer>
#include <gmock/gmock.h>

#include <algorithm>
#include <memory>
#include <sstream>

namespace kestrum {
namespace {

using namespace std::chrono;

QByteArray report(const std::string& values)
{
    return QByteArray::fromStdString("{\"class\":\"TPV\",\"device\":\"/dev/a\"," + values + "}\n");
}
const QByteArray kHere =
    report(R"("mode":3,"time":"2026-11-16T06:05:42.250Z","lat":52.52,"lon":13.4,"altMSL":34.0,"speed":13.89)");
constexpr Position kHereIs{3, 52.52, 13.4, 13.89, sys_days(2026y / 11 / 16) + 6h + 5min + 42s + 250ms};
const QByteArray kElsewhere = report(R"("mode":2,"lat":-33.9,"lon":-18.4)");
constexpr Position kElsewhereIs{2, -33.9, -18.4, {}, {}};

class GpsdTest : public testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(server.listen(QHostAddress::LocalHost));
        port = server.serverPort();
    }
    Gpsd::Address address() const { return {"127.0.0.1", port}; }
    Gpsd::Settings settings()
    {
        return {.retry = 5ms, .patience = 30s, .now = [this] { return now; }};
    }
    void start() { start(settings()); }
    void start(Gpsd::Settings with)
    {
        gpsd = std::make_unique<Gpsd>(address(), log, std::move(with));
        ASSERT_TRUE(connects());
    }
    /// Waits for the next connection to the server.
    bool connects()
    {
        return eventually([&] { return server.hasPendingConnections(); }) && (peer = server.nextPendingConnection());
    }
    bool has(const std::optional<Position>& position)
    {
        return eventually([&] { return gpsd->current() == position; });
    }
    /// Sends it and closes the connection. Returns when all of it has been read.
    bool takes(const QByteArray& lines)
    {
        peer->write(lines);
        peer->disconnectFromHost();
        return connects();
    }

    bool logs(std::string_view text) const
    {
        return std::ranges::any_of(log.lines, [&](const auto& line) { return line.second.find(text) != text.npos; });
    }

    QTcpServer server;
    quint16 port = 0;
    QTcpSocket* peer = nullptr; ///< belongs to the server
    RecordingLog log;
    steady_clock::time_point now{};
    std::unique_ptr<Gpsd> gpsd;
};

TEST_F(GpsdTest, AsksForReports)
{
    start();
    EXPECT_TRUE(eventually([&] { return peer->canReadLine(); }));
    EXPECT_EQ(peer->readAll(), "?WATCH={\"enable\":true,\"json\":true};\n");
}

TEST_F(GpsdTest, GivesThePositionOfTheLastReport)
{
    start();
    EXPECT_FALSE(gpsd->current());
    peer->write(R"({"class":"VERSION","release":"3.22","proto_major":3})"
                "\r\n" +
                kHere);
    EXPECT_TRUE(has(kHereIs));
    peer->write(kElsewhere.first(10));
    peer->flush();
    peer->write(kElsewhere.sliced(10));
    EXPECT_TRUE(has(kElsewhereIs));
}

TEST_F(GpsdTest, APositionCountsForLessThanFiveSeconds)
{
    start();
    peer->write(kHere);
    ASSERT_TRUE(has(kHereIs));
    now += 4999ms;
    EXPECT_EQ(gpsd->current(), kHereIs);
    now += 1ms;
    EXPECT_FALSE(gpsd->current());
    peer->write(kHere);
    EXPECT_TRUE(has(kHereIs)) << "the same report again is a new one";
}

TEST_F(GpsdTest, AReportWithoutAFixEndsThePosition)
{
    for (const auto* mode : {R"("mode":1)", R"("mode":0)", R"("lat":1,"lon":2)", R"("mode":4,"lat":1,"lon":2)",
                             R"("mode":"3","lat":1,"lon":2)", R"("mode":2.5,"lat":1,"lon":2)"}) {
        start();
        peer->write(kHere);
        ASSERT_TRUE(has(kHereIs));
        peer->write(report(mode));
        EXPECT_TRUE(has({})) << mode;
    }
}

TEST_F(GpsdTest, AnotherReceiverWithoutAFixSaysNothing)
{
    start();
    EXPECT_TRUE(takes(kHere + R"({"class":"TPV","device":"/dev/b","mode":1})" + "\n"));
    EXPECT_EQ(gpsd->current(), kHereIs);
}

TEST_F(GpsdTest, NonsenseChangesNothing)
{
    start();
    peer->write(kHere);
    ASSERT_TRUE(has(kHereIs));
    for (const QByteArray& line : {QByteArray("\n"),
                                   QByteArray("garbage\n"),
                                   QByteArray("{\n"),
                                   QByteArray("[1,2]\n"),
                                   QByteArray("3\n"),
                                   QByteArray("\0\xFF\xFE\n", 4),
                                   QByteArray(60'000, '[') + "\n",
                                   QByteArray(R"({"class":3,"mode":3})") + "\n",
                                   QByteArray(R"({"class":"SKY","device":"/dev/a","mode":3,"lat":1,"lon":2})") + "\n",
                                   report(R"("mode":3)"),
                                   report(R"("mode":3,"lat":1)"),
                                   report(R"("mode":3,"lon":2)"),
                                   report(R"("mode":3,"lat":"1","lon":"2")"),
                                   report(R"("mode":3,"lat":null,"lon":2)"),
                                   report(R"("mode":3,"lat":[1],"lon":2)"),
                                   report(R"("mode":3,"lat":true,"lon":true)"),
                                   report(R"("mode":3,"lat":NaN,"lon":NaN)"),
                                   report(R"("mode":3,"lat":90.0001,"lon":2)"),
                                   report(R"("mode":3,"lat":-91,"lon":2)"),
                                   report(R"("mode":3,"lat":1,"lon":180.0001)"),
                                   report(R"("mode":3,"lat":1e308,"lon":1e308)"),
                                   report(R"("mode":3,"lat":1e999,"lon":2)"),
                                   report(R"("mode":3,"lat":1,"lon":2)").chopped(3) + "\n"}) {
        ASSERT_TRUE(takes(line)) << line.left(80).toStdString();
        EXPECT_EQ(gpsd->current(), kHereIs) << line.left(80).toStdString();
    }
}

TEST_F(GpsdTest, ANonsensicalSpeedOrTimeIsNotKnown)
{
    start();
    for (const auto* values : {R"("speed":-1)", R"("speed":1e308)", R"("speed":"fast")", R"("time":1794809142)",
                               R"("time":"9999-12-31T23:59:59Z")", R"("speed":null,"time":null)"}) {
        peer->write(kHere);
        ASSERT_TRUE(has(kHereIs));
        peer->write(report(R"("mode":2,"lat":-33.9,"lon":-18.4,)" + std::string(values)));
        EXPECT_TRUE(has(kElsewhereIs)) << values;
    }
}

TEST_F(GpsdTest, ConnectsAgainToAServerThatComesBack)
{
    start();
    server.close();
    peer->write(kHere);
    ASSERT_TRUE(has(kHereIs));
    peer->abort();
    EXPECT_TRUE(eventually([&] { return logs("refused"); }));
    EXPECT_EQ(gpsd->current(), kHereIs) << "for the rest of its time";
    ASSERT_TRUE(server.listen(QHostAddress::LocalHost, port));
    ASSERT_TRUE(connects());
    peer->write(kElsewhere);
    EXPECT_TRUE(has(kElsewhereIs));
}

TEST_F(GpsdTest, ConnectsToAServerThatStartsLater)
{
    server.close();
    gpsd = std::make_unique<Gpsd>(address(), log, settings());
    EXPECT_TRUE(eventually([&] { return logs("refused"); }));
    ASSERT_TRUE(server.listen(QHostAddress::LocalHost, port));
    ASSERT_TRUE(connects());
    peer->write(kHere);
    EXPECT_TRUE(has(kHereIs));
}

TEST_F(GpsdTest, AttemptsHaveABoundedPaceAndAreLoggedOnce)
{
    auto slow = settings();
    slow.retry = 20ms;
    const auto begin = steady_clock::now();
    start(slow);
    int attempts = 1;
    for (; attempts < 10; ++attempts) {
        peer->abort();
        ASSERT_TRUE(connects());
    }
    EXPECT_GE(steady_clock::now() - begin, (attempts - 1) * 15ms) << "a timer may be a little early";
    EXPECT_EQ(log.lines.size(), 1u);
}

TEST_F(GpsdTest, ASilentServerIsAskedAgain)
{
    auto impatient = settings();
    impatient.patience = 20ms;
    start(impatient);
    EXPECT_TRUE(connects());
    EXPECT_TRUE(logs("no data"));
}

TEST_F(GpsdTest, ALineWithoutEndEndsTheConnection)
{
    start();
    auto* const endless = peer;
    const QByteArray piece(1 << 20, 'x');
    EXPECT_TRUE(eventually([&] {
        if (endless->state() == QTcpSocket::ConnectedState && endless->bytesToWrite() == 0)
            endless->write(piece);
        return server.hasPendingConnections();
    }));
    EXPECT_TRUE(logs("a line of more than 65536 bytes"));
    ASSERT_TRUE(connects());
    peer->write(kHere);
    EXPECT_TRUE(has(kHereIs));
}

TEST(GpsdAddress, IsAHostAndAPort)
{
    const auto text = [](std::string_view given) {
        const auto address = Gpsd::addressFrom(given);
        return address ? address->host + " " + std::to_string(address->port) : "nothing";
    };
    EXPECT_EQ(text(""), "localhost 2947");
    EXPECT_EQ(text("gps.example"), "gps.example 2947");
    EXPECT_EQ(text("192.0.2.1:65535"), "192.0.2.1 65535");
    EXPECT_EQ(text("[::1]"), "::1 2947");
    EXPECT_EQ(text("[2001:db8::1]:1"), "2001:db8::1 1");
    for (const auto* wrong : {":2947", "host:", "host:0", "host:65536", "host:-1", "host:2947x", "host:port", "::1",
                              "[::1", "[]:1", "[::1]1", "a:1:2"})
        EXPECT_EQ(text(wrong), "nothing") << wrong;
}

/// The real gpsd. It reads NMEA sentences from a connection to the test.
class RealGpsdTest : public testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(receiver.listen(QHostAddress::LocalHost));
        std::istringstream file(contentsOf(inCheckout("tests/voxd/tunnel.nmea")));
        for (std::string sentence; std::getline(file, sentence);) {
            if (sentence.starts_with("$GPRMC"))
                seconds.emplace_back();
            seconds.back() += sentence + "\r\n";
        }
        ASSERT_EQ(seconds.size(), 30u);
    }
    ~RealGpsdTest() override
    {
        process.kill(); // it may hang at its end
        process.waitForFinished();
    }

    /// Another process can take a free port before gpsd does: then the next one is tried.
    bool start()
    {
        for (int i = 0; i < 5; ++i) {
            QTcpServer free;
            if (!free.listen(QHostAddress::LocalHost))
                return false;
            port = free.serverPort();
            free.close();
            process.start(program(), {"-N", "-n", "-b", "-S", QString::number(port),
                                      "tcp://127.0.0.1:" + QString::number(receiver.serverPort())});
            if (eventually(
                    [&] { return receiver.hasPendingConnections() || process.state() == QProcess::NotRunning; }) &&
                process.state() != QProcess::NotRunning) {
                antenna = receiver.nextPendingConnection();
                return true;
            }
        }
        return false;
    }
    static QString program()
    {
        for (const auto* path : {"/usr/sbin/gpsd", "/usr/local/sbin/gpsd"})
            if (QFileInfo::exists(path))
                return path;
        return "gpsd";
    }
    /// Sends the sentences of these seconds in turn, a second each time, until the condition is true.
    bool feed(std::size_t from, std::size_t to, const std::function<bool()>& until)
    {
        std::size_t next = from;
        QTimer paced;
        QObject::connect(&paced, &QTimer::timeout, &paced, [&] {
            antenna->write(QByteArray::fromStdString(seconds[next]));
            next = next + 1 < to ? next + 1 : from;
        });
        paced.start(20ms);
        return eventually(until);
    }

    QTcpServer receiver;
    QTcpSocket* antenna = nullptr;
    std::vector<std::string> seconds; ///< the sentences of each
    QProcess process;
    quint16 port = 0;
    RecordingLog log;
};

TEST_F(RealGpsdTest, GivesThePositionOfAReceiver)
{
    ASSERT_TRUE(start()) << process.readAllStandardError().toStdString();
    const Gpsd gpsd({"127.0.0.1", port}, log, {.retry = 10ms, .now = [] { return steady_clock::time_point(); }});
    // gpsd begins in the middle of a second, so its first report may lack the altitude.
    ASSERT_TRUE(feed(0, 10, [&] { return gpsd.current() && gpsd.current()->dimensions == 3; }));
    const auto position = *gpsd.current();
    EXPECT_NEAR(position.latitude, 52 + 31.2 / 60, 0.00125 + 1e-6); // ten seconds of the drive
    EXPECT_NEAR(position.longitude, 13.405, 1e-6);
    ASSERT_TRUE(position.speed && position.time);
    EXPECT_NEAR(*position.speed, 27 * 1852 / 3600.0, 0.01);
    EXPECT_GE(*position.time, Date(sys_days(2026y / 11 / 16) + 6h + 5min));
    EXPECT_LT(*position.time, Date(sys_days(2026y / 11 / 16) + 6h + 5min + 10s));

    EXPECT_TRUE(feed(10, 20, [&] { return !gpsd.current(); })) << "in the tunnel";
    EXPECT_TRUE(feed(20, 30, [&] { return gpsd.current() && gpsd.current()->latitude > 52.5224; })) << "behind it";
}

} // namespace
} // namespace kestrum
