#include "EndToEnd.h"
#include "harness/FileContents.h"
#include "harness/Places.h"

#include <csignal>

namespace kestrum {
namespace {

using testing::HasSubstr;

class TheProgram : public EndToEnd {
protected:
    ~TheProgram() override
    {
        program.kill();
        program.waitForFinished();
    }

    /// An empty value removes a variable.
    void start(const std::vector<std::pair<QString, QString>>& variables = {})
    {
        auto environment = QProcessEnvironment::systemEnvironment();
        for (const auto& [name, value] : variables)
            if (value.isEmpty())
                environment.remove(name);
            else
                environment.insert(name, value);
        program.setProcessEnvironment(environment);
        program.start(QString::fromStdString(builtProgram("kestrum")), QStringList());
    }
    bool ends()
    {
        return eventually([&] { return program.state() == QProcess::NotRunning; });
    }

    QProcess program;
};

class AnyEnd : public TheProgram, public testing::WithParamInterface<int> {
protected:
    auto entriesOfRuntime() const
    {
        const std::filesystem::directory_iterator entries(runtime());
        return std::distance(begin(entries), end(entries));
    }
};

TEST_P(AnyEnd, ResetsTheHomeScreensKeyAndExitsWithZero)
{
    ASSERT_TRUE(startService());
    const auto before = entriesOfRuntime();
    start();
    // The program has launched, and opens its port.
    ASSERT_TRUE(eventually([&] { return entriesOfRuntime() > before; }));
    ::kill(static_cast<pid_t>(program.processId()), GetParam());
    ASSERT_TRUE(ends());
    EXPECT_EQ(program.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(program.exitCode(), 0);

    std::string written;
    for (const auto& each : std::filesystem::recursive_directory_iterator(directory / "config"))
        if (each.is_regular_file())
            written += contentsOf(each.path());
    EXPECT_THAT(written, HasSubstr("HXShowGSMRSSI=false"));
}

INSTANTIATE_TEST_SUITE_P(TheProgram, AnyEnd, testing::Values(SIGTERM, SIGINT, SIGHUP),
                         [](const auto& each) { return "BySignal" + std::to_string(each.param); });

struct NoDisplay {
    const char* name;
    const char* display;
    const char* platform;
    friend void PrintTo(const NoDisplay& shown, std::ostream* out) { *out << shown.name; }
};

class WithoutADisplay : public TheProgram, public testing::WithParamInterface<NoDisplay> {};

TEST_P(WithoutADisplay, SaysWhatToDoInsteadAndExitsWithOne)
{
    start({{"DISPLAY", GetParam().display}, {"WAYLAND_DISPLAY", ""}, {"QT_QPA_PLATFORM", GetParam().platform}});
    ASSERT_TRUE(ends());
    EXPECT_EQ(program.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(program.exitCode(), 1);
    const auto said = program.readAllStandardError().toStdString();
    EXPECT_THAT(said, HasSubstr("kestrum: no display server can be reached."));
    EXPECT_THAT(said, HasSubstr("kestrum-terminal"));
}

INSTANTIATE_TEST_SUITE_P(TheProgram, WithoutADisplay,
                         testing::Values(NoDisplay{"AtAll", "", ""}, NoDisplay{"ThatAnswers", ":7654", ""},
                                         NoDisplay{"OnAnotherHost", "localhost:7654.0", "xcb"},
                                         NoDisplay{"ThatQtKnows", "", "nonsense"}),
                         [](const auto& each) { return std::string(each.param.name); });

} // namespace
} // namespace kestrum
