#include "Tool.h"
#include "capture/Messages.h"
#include "harness/Places.h"
#include "harness/Scratch.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <sstream>
#include <sys/resource.h>

namespace kestrum::tools {
namespace {

using namespace std::string_literals;
using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

// "Num Tx Antennas" of an LTE record, which needs 22 bytes.
std::string antennas(int count, std::uint64_t stamp = kStamp)
{
    return message(0xB0C1, std::string(7, '\0') + static_cast<char>(count) + '\0', stamp);
}

std::string ifx(const std::string& value)
{
    return R"(<?xml version="1.0" encoding="UTF-8"?><plist version="1.0"><dict><key>Cell</key><string>)" + value +
           "</string><key>Other</key><string>o</string></dict></plist>";
}

class ProgramTest : public testing::Test {
protected:
    ProgramTest() { std::signal(SIGPIPE, SIG_IGN); }

    std::string capture(const std::string& contents, const std::string& name = "a.kcap") const
    {
        writeFile(scratch / name, contents);
        return scratch / name;
    }

    ScratchDirectory scratch;
};

TEST_F(ProgramTest, HelpNamesEveryOptionAndStatus)
{
    const auto ran = run({"--help"});
    EXPECT_EQ(ran.status, 0);
    for (const auto* each : {"--technology", "--format", "--log", "--stats", "--follow", "--extract", "--force",
                             "--jobs", "--version", "standard input", "Exit status"})
        EXPECT_THAT(ran.output, HasSubstr(each));
}

TEST_F(ProgramTest, VersionIsOneLine)
{
    EXPECT_EQ(run({"--version"}).output, "kestrum-decode 1.0.0\n");
}

struct Usage {
    const char* name;
    std::vector<std::string> arguments;

    friend void PrintTo(const Usage& shown, std::ostream* out) { *out << shown.name; }
};

class WrongUsage : public testing::TestWithParam<Usage> {};

TEST_P(WrongUsage, EndsWithStatus2AndSaysWhy)
{
    const auto ran = run(GetParam().arguments);
    EXPECT_EQ(ran.status, 2);
    EXPECT_EQ(ran.output, "");
    EXPECT_NE(ran.remarks, "");
}

INSTANTIATE_TEST_SUITE_P(CommandLine, WrongUsage,
                         testing::Values(Usage{"NoFile", {}}, Usage{"UnknownOption", {"--colour", "a.kcap"}},
                                         Usage{"UnknownFormat", {"--format", "xml", "a.kcap"}},
                                         Usage{"UnknownTechnology", {"--technology", "nmt", "a.kcap"}},
                                         Usage{"FollowASnapshot", {"--follow", "a.kestrum"}},
                                         Usage{"ExtractFromACapture", {"--extract", "d", "a.kcap"}}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST_F(ProgramTest, AFileThatIsNotThereIsBadInput)
{
    const auto ran = run({"/no/such.kcap"});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks,
                StartsWith("kestrum-decode: /no/such.kcap: cannot be opened: No such file or directory\n"));
}

TEST_F(ProgramTest, ADirectoryIsBadInput)
{
    const auto ran = run({scratch.path()});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks, HasSubstr("cannot be read: Is a directory"));
}

TEST_F(ProgramTest, AnEmptyCaptureHasNothingToShow)
{
    const auto ran = run({"--format", "json", capture("")});
    EXPECT_EQ(ran.status, 0);
    EXPECT_EQ(ran.output,
              "{\n  \"technology\": null,\n  \"messages\": 0,\n  \"dropped\": 0,\n  \"display\": null\n}\n");
    EXPECT_EQ(ran.remarks, "kestrum-decode: no message was found\n");
}

TEST_F(ProgramTest, BadInputIsNamedWithFileAndOffsetAndTheRestIsShown)
{
    const auto file = capture(kcap(antennas(1)) + "\xFF\xFF\xFF\xFF" + kcap(antennas(2)));
    const auto ran = run({file});
    EXPECT_EQ(ran.status, 1);
    EXPECT_EQ(
        ran.remarks,
        "kestrum-decode: " + file +
            ": at offset 26: a message of 4294967295 bytes, longer than the limit of 16777216; 4 bytes skipped\n");
    EXPECT_THAT(ran.output, HasSubstr("Num Tx Antennas: 2\n"));
}

TEST_F(ProgramTest, MessagesThatTellNoTechnologyNeedItNamed)
{
    const auto file = capture(kcap(message(1, "no list", kStamp, 0xFF)));
    EXPECT_EQ(run({file}).status, 1);
    EXPECT_THAT(run({file}).remarks, HasSubstr("the messages do not show the technology: set it with --technology"));
    EXPECT_EQ(run({"--technology", "lte", file}).status, 0);
}

TEST_F(ProgramTest, MessagesBeforeTheOneThatShowsTheTechnologyAreDecodedToo)
{
    const auto ran = run({"--stats", capture(kcap(message(1, "no list", kStamp, 0xFF)) + kcap(antennas(4)))});
    EXPECT_THAT(ran.remarks, HasSubstr("0xFF0001           1"));
    EXPECT_THAT(ran.remarks, HasSubstr("total              2"));
    EXPECT_THAT(ran.remarks, EndsWith("bytes skipped: 0\n"));
}

TEST_F(ProgramTest, StatisticsCountTheMessagesThatARecordingNotesAsMissing)
{
    const auto ran = run({"--stats", capture(kcap(antennas(1)) + note(17) + kcap(antennas(2)) + note(17))});
    EXPECT_EQ(ran.status, 0);
    EXPECT_THAT(ran.remarks, HasSubstr("total              2"));
    EXPECT_THAT(ran.remarks, EndsWith("bytes skipped: 0\nmessages missing: 34\n"));
}

TEST_F(ProgramTest, ALogThatContinuesInAnotherTechnologyShowsThatTechnology)
{
    const auto ran = run({"--format", "json", capture(kcap(antennas(4)) + kcap(ifx("here")))});
    EXPECT_THAT(ran.output, HasSubstr("\"technology\": \"kVoxLogChannelTechnology_IFX\""));
    EXPECT_THAT(ran.output, HasSubstr("\"Cell\": \"here\""));
}

TEST_F(ProgramTest, ForeignCodesDoNotChangeTheTechnology)
{
    const auto ran = run({"--format", "json", capture(kcap(antennas(4)) + kcap(message(0x5FFF, "?")))});
    EXPECT_THAT(ran.output, HasSubstr("Zephra_LTE"));
}

TEST_F(ProgramTest, StatisticsHideNothing)
{
    const auto ran = run(
        {"--stats", "--technology", "lte",
         capture(kcap("fragment") + kcap(antennas(1)) + kcap(message(0xB0C1, "odd type", kStamp, 7)) +
                 kcap(message(0xB0C1, "short")) + kcap(message(0xB193, "unknown")) + kcap(antennas(2)) + "#########")});
    EXPECT_EQ(ran.status, 1);
    EXPECT_THAT(ran.remarks, EndsWith("code        messages     decoded   too short  without subscriber     refused\n"
                                      "(none)             1           0           1                   0           0\n"
                                      "0xB0C1             4           2           1                   0           1\n"
                                      "0xB193             1           0           0                   1           0\n"
                                      "total              6           2           2                   1           1\n"
                                      "bytes skipped: 9\n"));
}

TEST_F(ProgramTest, DroppedAreThoseThatCouldNotBeTaken)
{
    const auto ran = run({"--format", "json", capture(kcap(ifx("a")) + kcap("<no list>") + kcap(ifx("b")))});
    EXPECT_THAT(ran.output, HasSubstr("\"messages\": 3,\n  \"dropped\": 1,\n"));
    EXPECT_THAT(ran.output, HasSubstr("\"Cell\": \"b\""));
}

TEST_F(ProgramTest, TheLogFollowsTheDisplayInJson)
{
    const auto ran = run({"--format", "json", "--log", capture(kcap(ifx("a")) + kcap("<no list>"))});
    EXPECT_THAT(ran.output, HasSubstr("  \"log\": [\n    [4,\"Creating Log object: 0x0\"],\n    [3,"));
    EXPECT_THAT(ran.output, HasSubstr("Could not deserialize the object"));
    EXPECT_THAT(ran.output, EndsWith("\"]\n  ]\n}\n"));
    EXPECT_EQ(ran.remarks, "");
}

TEST_F(ProgramTest, TheLogOfTheOtherFormatsGoesToStandardError)
{
    const auto ran = run({"--log", capture(kcap(ifx("a")))});
    EXPECT_EQ(ran.output, "Cell: a\nOther: o\n");
    EXPECT_EQ(ran.remarks, "[4,\"Creating Log object: 0x0\"]\n");
}

TEST_F(ProgramTest, TreesShowControlCharactersHarmlessly)
{
    EXPECT_EQ(run({capture(kcap(ifx("a&#10;b\x7F&#x9B;")))}).output, "Cell: a\\x0ab\\x7f\\xc2\\x9b\nOther: o\n");
}

TEST_F(ProgramTest, JsonlGivesOneObjectForEachMessageThatChangedTheDisplay)
{
    const auto file = capture(kcap(antennas(2)) + kcap(antennas(2, kStamp + (800ull << 16))) +
                              kcap(antennas(4, kStamp + (801ull << 16))));
    const auto ran = run({"--format", "jsonl", file});
    EXPECT_EQ(std::ranges::count(ran.output, '\n'), 2);
    EXPECT_THAT(ran.output, StartsWith(R"({"time":"2026-11-16T06:05:42.000000Z","code":"0xB0C1","changes":{)"));
    EXPECT_THAT(ran.output, EndsWith(R"({"time":"2026-11-16T06:05:43.001250Z","code":"0xB0C1","changes":{)"
                                     R"("/0;Serving Cell/Serving Cell Info/Num Tx Antennas":"4"}})"
                                     "\n"));
}

TEST_F(ProgramTest, JsonlHasNoTimeWhereAMessageHasNone)
{
    EXPECT_EQ(run({"--format", "jsonl", capture(kcap(ifx("a")) + kcap(ifx("b")))}).output,
              "{\"time\":null,\"code\":null,\"changes\":{\"/Cell\":\"a\",\"/Other\":\"o\"}}\n"
              "{\"time\":null,\"code\":null,\"changes\":{\"/Cell\":\"b\"}}\n");
    EXPECT_THAT(run({"--format", "jsonl", capture(kcap(antennas(1, 0)))}).output,
                StartsWith("{\"time\":null,\"code\":\"0xB0C1\""));
}

std::string timedTree(const std::string& time, const std::string& value)
{
    return "<plist><dict><key>Time</key>" + time + "<key>Cell</key><string>" + value + "</string></dict></plist>";
}

TEST_F(ProgramTest, JsonlAndCsvHaveTheTimesOfTrees)
{
    const auto file = capture(kcap(timedTree("<string>2026-11-16T06:05:42.125Z</string>", "a")) +
                              kcap(timedTree("<string>2026-11-16 06:05:43 +0000</string>", "b")));
    EXPECT_EQ(
        run({"--format", "jsonl", file}).output,
        R"({"time":"2026-11-16T06:05:42.125000Z","code":null,"changes":{"/Time":"2026-11-16T06:05:42.125Z","/Cell":"a"}})"
        "\n"
        R"({"time":"2026-11-16T06:05:43.000000Z","code":null,"changes":{"/Time":"2026-11-16 06:05:43 +0000","/Cell":"b"}})"
        "\n");
    EXPECT_THAT(run({"--format", "csv", file}).output,
                AllOf(HasSubstr("\n2026-11-16T06:05:42.125000Z,,/Cell,a,,\r\n"),
                      HasSubstr("\n2026-11-16T06:05:43.000000Z,,/Cell,b,,\r\n")));
}

TEST_F(ProgramTest, EveryRowOfATreesCaptureHasATime)
{
    const auto csv = run({"--format", "csv", inCheckout("captures/ifx.kcap")}).output;
    std::istringstream rows(csv);
    std::string row;
    std::getline(rows, row);
    while (std::getline(rows, row))
        ASSERT_THAT(row, StartsWith("2026-11-16T06:05:"));
    EXPECT_THAT(csv, HasSubstr("\n2026-11-16T06:05:51.000000Z,,/Serving Cell/RSSI,-53 dBm,,\r\n"));
}

TEST_F(ProgramTest, ATreeWithoutAUsableTimeHasNone)
{
    for (const auto* bad :
         {"<string>soon</string>", "<string>9999-12-31T23:59:59Z</string>", "<array><string>1</string></array>",
          "<dict><key>Time</key><string>2026-11-16T06:05:42Z</string></dict>"}) {
        const auto ran = run({"--format", "jsonl", capture(kcap(timedTree(bad, "a")))});
        EXPECT_THAT(ran.output, StartsWith("{\"time\":null,")) << bad;
        EXPECT_EQ(ran.status, 0);
    }
    // A tree that cannot be shown changes nothing, also not the time of the next one.
    const auto ran = run({"--format", "jsonl",
                          capture(kcap(timedTree("<string>2026-11-16T06:05:42Z</string>", "a")) +
                                  kcap(timedTree("<integer>1</integer>", "b")) + kcap(ifx("c")))});
    EXPECT_THAT(ran.output, HasSubstr("\n{\"time\":null,\"code\":null,"));
}

TEST_F(ProgramTest, CsvQuotesAsRfc4180)
{
    EXPECT_EQ(run({"--format", "csv", capture(kcap(ifx("a,\"b\"&#10;c")))}).output,
              "time,code,path,value,number,unit\r\n,,/Cell,\"a,\"\"b\"\"\nc\",,\r\n,,/Other,o,,\r\n");
}

TEST_F(ProgramTest, CsvHasTimeAndCode)
{
    EXPECT_THAT(
        run({"--format", "csv", capture(kcap(antennas(4)))}).output,
        HasSubstr("\n2026-11-16T06:05:42.000000Z,0xB0C1,/0;Serving Cell/Serving Cell Info/Num Tx Antennas,4,4,\r\n"));
}

/// A serving cell measurement of LTE: RSRP -98.25 dBm, P_Max absent.
std::string servingCell()
{
    std::string record("\x01\x21\x00\x7F\xB1\x00\x00\x00\x00\x00\x00\x00\x00", 13);
    record.resize(33);
    record[21] = static_cast<char>(167); // (140 - 98.25) * 4
    record[27] = static_cast<char>(64 >> 1);
    return record;
}

TEST_F(ProgramTest, CsvHasNumberAndUnitWhereAValueMeasuresSomething)
{
    EXPECT_THAT(run({"--format", "csv", capture(kcap(servingCell()))}).output,
                AllOf(HasSubstr("/Measured RSRP,-98.25 dBm,-98.25,dBm\r\n"), HasSubstr("/P_Max,Not Present,,\r\n"),
                      HasSubstr("/Version,0,0,\r\n"), HasSubstr("/Measurement Rules Updated,False,,\r\n")));
}

TEST_F(ProgramTest, JsonlHasNumbersAndUnitsWhenAsked)
{
    EXPECT_THAT(run({"--format", "jsonl", "--numbers", capture(kcap(servingCell()))}).output,
                AllOf(HasSubstr(R"(/Measured RSRP":{"text":"-98.25 dBm","number":-98.25,"unit":"dBm"})"),
                      HasSubstr(R"(/P_Max":"Not Present")"),
                      HasSubstr(R"(/Version":{"text":"0","number":0,"unit":""})")));
}

TEST_F(ProgramTest, NumbersNeedJsonl)
{
    const auto ran = run({"--format", "csv", "--numbers", capture(kcap(servingCell()))});
    EXPECT_EQ(ran.status, 2);
    EXPECT_THAT(ran.remarks, HasSubstr("--numbers: needs --format jsonl"));
}

TEST_F(ProgramTest, StandardInputIsReadAsWhatItHolds)
{
    EXPECT_THAT(run({"-"}, kcap(antennas(3))).output, HasSubstr("Num Tx Antennas: 3\n"));
    EXPECT_THAT(run({"-"}, antennas(2).substr(1)).output, HasSubstr("Num Tx Antennas: 2\n"));
    const auto cut = run({"-"}, kcap(antennas(3)) + "abc");
    EXPECT_EQ(cut.remarks,
              "kestrum-decode: standard input: at offset 26: the length has only 3 of its 4 bytes; 3 bytes skipped\n");
}

TEST_F(ProgramTest, SeveralFilesArePartsOfOneLog)
{
    const auto first = capture(kcap(antennas(1)), "1.kcap"), second = capture(antennas(4).substr(1), "2.dlf");
    const auto ran = run({"--format", "json", first, "/no/such.kcap", second});
    EXPECT_EQ(ran.status, 1) << "one of them is bad";
    EXPECT_THAT(ran.output, AllOf(HasSubstr("\"messages\": 2"), HasSubstr("\"Num Tx Antennas\": \"4\"")));
}

// Damage, a missing file and a change of technology lie between the pieces of several processes.
TEST_F(ProgramTest, SeveralProcessesWriteTheSameAsOne)
{
    const auto repeated = [&](const std::string& name) {
        std::string all;
        while (all.size() < (5 << 18))
            all += contentsOf(inCheckout("captures/" + name + ".kcap"));
        return all;
    };
    const auto gsm = capture(repeated("gsm") + "\xFF\xFF\xFF\xFF" + kcap(antennas(2)), "1.kcap");
    const auto cdma = capture(repeated("cdma"), "2.kcap");
    for (const std::string format : {"jsonl", "csv"}) {
        const auto remarks = [&](const std::string& jobs) {
            const auto command = "'" + builtProgram("kestrum-decode") + "' --stats -j " + jobs + " --format " + format +
                                 " '" + gsm + "' /no/such.kcap '" + cdma + "' >'" + (scratch / jobs) + "' 2>'" +
                                 (scratch / "told") + "'";
            EXPECT_EQ(WEXITSTATUS(std::system(command.c_str())), 1);
            return contentsOf(scratch / "told");
        };
        const auto alone = remarks("1");
        EXPECT_EQ(remarks("8"), alone);
        EXPECT_THAT(alone, AllOf(HasSubstr("cannot be opened"), HasSubstr("4 bytes skipped")));
        EXPECT_EQ(std::system(("cmp '" + (scratch / "1") + "' '" + (scratch / "8") + "'").c_str()), 0) << format;
    }
}

TEST_F(ProgramTest, TellsThatAProcessHasEnded)
{
    std::string all;
    while (all.size() < (3 << 20))
        all += contentsOf(inCheckout("captures/lte.kcap"));
    const auto told = scratch / "told", status = scratch / "status";
    // A file beyond the limit ends the process that writes it.
    const auto command = "(ulimit -f 8; '" + builtProgram("kestrum-decode") + "' -j 2 --format csv '" + capture(all) +
                         "' 2>'" + told + "'; echo $? >'" + status + "') | cat >/dev/null";
    EXPECT_EQ(std::system(command.c_str()), 0);
    EXPECT_EQ(contentsOf(status), "1\n");
    EXPECT_THAT(contentsOf(told), HasSubstr("a process that writes was ended by signal"));
}

TEST_F(ProgramTest, AClosedPipeEndsAllProcesses)
{
    std::string all;
    while (all.size() < (4 << 20))
        all += contentsOf(inCheckout("captures/gsm.kcap"));
    Tool tool({"-j", "2", "--format", "csv", capture(all)});
    tool.line();
    tool.closeOutput();
    EXPECT_EQ(tool.remarks(), "") << "which ends when no process has standard error any more";
    EXPECT_EQ(tool.status(), 0);
}

TEST_F(ProgramTest, AClosedPipeEndsItQuietly)
{
    Tool tool({"--format", "csv", "-"});
    tool.closeOutput();
    std::string piece;
    for (int i = 0; i < 1000; ++i)
        piece += kcap(antennas(i & 1));
    while (tool.write(piece)) {
    }
    EXPECT_EQ(tool.remarks(), "");
    EXPECT_EQ(tool.status(), 0);
}

TEST_F(ProgramTest, AFullDiskIsReported)
{
    const auto file = capture(kcap(antennas(1))), told = scratch / "told";
    const auto command = "'" + builtProgram("kestrum-decode") + "' '" + file + "' >/dev/full 2>'" + told + "'";
    EXPECT_EQ(WEXITSTATUS(std::system(command.c_str())), 1);
    EXPECT_EQ(contentsOf(told), "kestrum-decode: standard output: No space left on device\n");
}

TEST_F(ProgramTest, FollowsAFileAsItGrows)
{
    const auto file = capture(kcap(antennas(1)));
    Tool tool({"--follow", "--format", "jsonl", "--stats", file});
    EXPECT_THAT(tool.line(), HasSubstr("\"1\""));
    writeFile(file, kcap(antennas(2)), std::ios::app);
    EXPECT_THAT(tool.line(), HasSubstr("\"2\""));
    // A message that is written in two pieces.
    const auto third = kcap(antennas(3));
    writeFile(file, third.substr(0, 7), std::ios::app);
    writeFile(file, third.substr(7), std::ios::app);
    EXPECT_THAT(tool.line(), HasSubstr("\"3\""));
    tool.signal(SIGINT);
    EXPECT_THAT(tool.remarks(), HasSubstr("0xB0C1             3           3"));
    EXPECT_EQ(tool.status(), 0);
}

TEST_F(ProgramTest, AFollowedTreeIsShownWhenItsEndIsMetAndAtTheEnd)
{
    const auto file = capture(kcap(ifx("a")));
    Tool tool({"--follow", file});
    EXPECT_EQ(tool.line(), "Cell: a");
    EXPECT_EQ(tool.line(), "Other: o");
    tool.signal(SIGTERM);
    EXPECT_EQ(tool.output(), "") << "nothing has changed since";
    EXPECT_EQ(tool.status(), 0);
}

TEST_F(ProgramTest, AFollowedFileThatIsEmptiedIsReadFromItsStart)
{
    const auto file = capture(kcap(ifx("a")) + kcap(ifx("b")));
    Tool tool({"--follow", "--format", "jsonl", file});
    tool.line();
    tool.line();
    writeFile(file, "");
    EXPECT_EQ(tool.remark(), "kestrum-decode: " + file + " was replaced or emptied: it is read from its start");
    writeFile(file, kcap(ifx("c")), std::ios::app);
    EXPECT_THAT(tool.line(), HasSubstr("\"c\""));
    tool.signal(SIGINT);
    EXPECT_EQ(tool.status(), 0);
}

TEST_F(ProgramTest, AFollowedFileThatIsReplacedIsReadFromItsStart)
{
    const auto file = capture(kcap(ifx("a")));
    const auto other = capture(kcap(ifx("b")), "other");
    Tool tool({"--follow", "--format", "jsonl", file});
    tool.line();
    std::filesystem::rename(other, file);
    EXPECT_THAT(tool.line(), HasSubstr("\"b\""));
    EXPECT_EQ(tool.remark(), "kestrum-decode: " + file + " was replaced or emptied: it is read from its start");
    writeFile(file, kcap(ifx("c")), std::ios::app);
    EXPECT_THAT(tool.line(), HasSubstr("\"c\""));
}

TEST_F(ProgramTest, AFollowedFileThatIsDeletedMayComeAgain)
{
    const auto file = capture(kcap(ifx("a")));
    Tool tool({"--follow", "--format", "jsonl", file});
    tool.line();
    std::filesystem::remove(file);
    EXPECT_EQ(tool.remark(), "kestrum-decode: " + file + " was deleted: waiting for a new file");
    std::filesystem::rename(capture(kcap(ifx("b")), "other"), file);
    EXPECT_THAT(tool.line(), HasSubstr("\"b\""));
}

TEST_F(ProgramTest, CsvGuardsFormulasAndLeavesNumbersAlone)
{
    for (const auto* formula : {"=1+2", "+cmd", "-2+3", "-2 dBm+3", "@SUM(1)", "-"})
        EXPECT_THAT(run({"--format", "csv", capture(kcap(ifx(formula)))}).output,
                    HasSubstr(",/Cell,'"s + formula + ",,\r\n"));
    for (const auto* number : {"-98.25 dBm", "+2.50 dB", "-3", "-0.5 %", "4"})
        EXPECT_THAT(run({"--format", "csv", capture(kcap(ifx(number)))}).output,
                    HasSubstr(",/Cell,"s + number + ",,\r\n"));
}

TEST_F(ProgramTest, NamesOfFilesDoNothingToATerminal)
{
    const auto ran = run({scratch / "\x1b[31m\u202Eno.kcap"});
    EXPECT_THAT(ran.remarks, HasSubstr("\\x1b[31m\\xe2\\x80\\xaeno.kcap: cannot be opened"));
}

TEST_F(ProgramTest, ATerminalIsShownNoControlCharacters)
{
    const auto file = capture(kcap(ifx("a\u0085\u202E\x7F")));
    for (const auto* format : {"csv", "json", "jsonl", "tree"}) {
        const auto shown = scratch / "shown";
        const auto command = "script -qec \"'" + builtProgram("kestrum-decode") + "' --format " + format + " '" + file +
                             "'\" /dev/null </dev/null >'" + shown + "'";
        ASSERT_EQ(std::system(command.c_str()), 0);
        EXPECT_THAT(contentsOf(shown), HasSubstr("a\\xc2\\x85\\xe2\\x80\\xae\\x7f")) << format;
    }
}

// Ten times as many keys may take more than ten times as long, but much less than a hundred times.
TEST_F(ProgramTest, TheCostOfRemovedKeysIsNotQuadratic)
{
    const auto seconds = [&](int keys, const char* format) {
        std::string list = "<plist version=\"1.0\"><dict>";
        for (int i = 0; i < keys; ++i)
            list += "<key>k" + std::to_string(i) + "</key><string>v</string>";
        list += "</dict></plist>";
        const auto file = capture(kcap(list) + kcap(ifx("a")) + kcap(list));
        ::rusage before{}, after{};
        ::getrusage(RUSAGE_CHILDREN, &before);
        EXPECT_EQ(run({"--format", format, file}).status, 0);
        ::getrusage(RUSAGE_CHILDREN, &after);
        const auto inSeconds = [](const ::timeval& time) {
            return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
        };
        return inSeconds(after.ru_utime) - inSeconds(before.ru_utime);
    };
    for (const auto* format : {"csv", "jsonl", "json", "geojson"})
        EXPECT_LE(seconds(50'000, format), 45 * seconds(5'000, format) + 0.5) << format;
}

// The pipe carries far more than any buffer holds. The system reports the process's peak memory.
TEST_F(ProgramTest, MemoryDoesNotGrowWithTheCapture)
{
    std::string piece;
    for (int i = 0; i < 4'000; ++i)
        piece += kcap(antennas(i % 5, kStamp + (static_cast<std::uint64_t>(i) << 16)));
    Tool tool({"-", "--log", "--format", "json"});
    const auto resident = [&] {
        const auto status = contentsOf("/proc/" + std::to_string(tool.process()) + "/status");
        return std::stol(status.substr(status.find("VmHWM:") + 6));
    };
    ASSERT_TRUE(tool.write(piece) && tool.write(piece));
    const auto before = resident();
    for (int i = 0; i < 30; ++i)
        ASSERT_TRUE(tool.write(piece));
    EXPECT_LE(resident(), before + 4'000) << "kilobytes, after fifteen times as many messages";
    tool.closeInput();
    tool.closeOutput();
    tool.status();
}

} // namespace
} // namespace kestrum::tools
