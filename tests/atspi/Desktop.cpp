// The main() of tests that need a desktop: an X server, a session bus and the accessibility services on it.
#include "frontends/qt/QtToolkit.h"
#include "harness/QtTestToolkit.h"
#include "harness/Scratch.h"

#include <QProcess>
#include <gmock/gmock.h>

#include <cstdio>

namespace {

kestrum::Toolkit* made = nullptr;

/// A server that writes its address in its first line; empty when it does not start.
class Server {
public:
    explicit Server(const QString& program, const QStringList& arguments) { _process.start(program, arguments); }
    ~Server()
    {
        _process.terminate();
        if (!_process.waitForFinished())
            _process.kill();
    }
    QByteArray address()
    {
        while (!_process.canReadLine())
            if (!_process.waitForReadyRead())
                return {};
        return _process.readLine().trimmed();
    }

private:
    QProcess _process;
};

} // namespace

kestrum::Toolkit& kestrum::toolkit()
{
    return *made;
}

int main(int argc, char** argv)
{
    testing::InitGoogleMock(&argc, argv);
    const kestrum::ScratchDirectory home;
    for (const char* name : {"HOME", "XDG_RUNTIME_DIR", "XDG_CONFIG_HOME", "XDG_CACHE_HOME", "XDG_DATA_HOME"})
        qputenv(name, home.path().c_str());
    for (const char* name : {"AT_SPI_BUS_ADDRESS", "WAYLAND_DISPLAY", "XAUTHORITY", "GTK_MODULES"})
        qunsetenv(name);
    Server screen("Xvfb", {"-displayfd", "1", "-screen", "0", "1280x1024x24", "-nolisten", "tcp"});
    const QByteArray display = screen.address();
    if (display.isEmpty()) {
        std::fputs("no X server: is Xvfb installed?\n", stderr);
        return 1;
    }
    qputenv("DISPLAY", ":" + display);
    Server bus("dbus-daemon", {"--session", "--nofork", "--print-address"});
    const QByteArray address = bus.address();
    if (address.isEmpty()) {
        std::fputs("no session bus: is dbus-daemon installed?\n", stderr);
        return 1;
    }
    qputenv("DBUS_SESSION_BUS_ADDRESS", address);
    qputenv("QT_QPA_PLATFORM", "xcb");
    qputenv("QT_LINUX_ACCESSIBILITY_ALWAYS_ON", "1");
    const auto toolkit = kestrum::makeQtToolkit();
    made = toolkit.get();
    return RUN_ALL_TESTS();
}
