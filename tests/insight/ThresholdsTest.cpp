#include "insight/Thresholds.h"

#include "harness/FileContents.h"
#include "harness/Places.h"
#include "support/Format.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

TEST(Grade, IsAWordFirst)
{
    EXPECT_EQ(word(Grade::Excellent), "excellent");
    EXPECT_EQ(word(Grade::Good), "good");
    EXPECT_EQ(word(Grade::Fair), "fair");
    EXPECT_EQ(word(Grade::Poor), "poor");
    EXPECT_EQ(word(Grade::NoService), "no service");
}

std::string gradeOf(const Thresholds& thresholds, Measure measure, double number)
{
    const auto verdict = thresholds.grade(measure, number);
    return verdict ? std::string(word(verdict->grade)) : "none";
}

TEST(Thresholds, BelongToTheBetterGrade)
{
    const Thresholds thresholds;
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -44), "excellent");
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -80), "excellent");
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -80.25), "good");
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -100), "fair");
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -120), "poor");
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -120.25), "no service");
}

TEST(Thresholds, OfErrorsRise)
{
    const Thresholds thresholds;
    EXPECT_EQ(gradeOf(thresholds, Measure::FrameErrors, 0), "excellent");
    EXPECT_EQ(gradeOf(thresholds, Measure::FrameErrors, 2), "good");
    EXPECT_EQ(gradeOf(thresholds, Measure::FrameErrors, 2.01), "fair");
    EXPECT_EQ(gradeOf(thresholds, Measure::FrameErrors, 60), "no service");
    EXPECT_EQ(gradeOf(thresholds, Measure::RxQual, 0), "excellent");
    EXPECT_EQ(gradeOf(thresholds, Measure::RxQual, 7), "poor");
}

TEST(Thresholds, GradeNothingWithoutANumber)
{
    EXPECT_EQ(gradeOf(Thresholds(), Measure::Rsrp, std::nan("")), "none");
    EXPECT_EQ(gradeOf(Thresholds(), Measure::None, -80), "none");
}

// A cell is suitable only while Srxlev is greater than 0.
TEST(Thresholds, OfSrxlevFollowTheSelectionCriterion)
{
    EXPECT_EQ(gradeOf(Thresholds(), Measure::Srxlev, 1), "poor");
    EXPECT_EQ(gradeOf(Thresholds(), Measure::Srxlev, 0), "no service");
}

TEST(Thresholds, OfTheProgramHaveSourcesAndFitTheirMeasures)
{
    const Thresholds thresholds;
    for (const auto& profile : thresholds.profiles()) {
        EXPECT_FALSE(profile.source.empty()) << profile.name;
        for (const auto& limits : profile.limits) {
            const auto traits = std::ranges::find(measures(), limits.measure, &MeasureTraits::measure);
            ASSERT_NE(traits, measures().end());
            EXPECT_EQ(traits->lessIsBetter, limits.excellent < limits.poor) << traits->name;
            for (const double limit : {limits.excellent, limits.good, limits.fair, limits.poor}) {
                EXPECT_GE(limit, traits->least) << traits->name;
                EXPECT_LE(limit, traits->greatest) << traits->name;
            }
            const bool falls = limits.excellent > limits.good && limits.good > limits.fair && limits.fair > limits.poor;
            const bool rises = limits.excellent < limits.good && limits.good < limits.fair && limits.fair < limits.poor;
            EXPECT_TRUE(traits->lessIsBetter ? rises : falls) << profile.name << ' ' << traits->name;
        }
    }
    EXPECT_EQ(thresholds.used().name, "drive-test");
    EXPECT_EQ(thresholds.used().limits.size(), measures().size());
}

std::string inTheManual(const ThresholdProfile& profile, Measure measure)
{
    const auto limits = std::ranges::find(profile.limits, measure, &Limits::measure);
    return limits == profile.limits.end()
               ? ""
               : formatted("%.0f, %.0f, %.0f, %.0f ", limits->excellent, limits->good, limits->fair, limits->poor);
}

// docs/thresholds.md has the same numbers, and its example can be read.
TEST(Thresholds, AreThoseOfTheManual)
{
    const std::string manual = contentsOf(inCheckout("docs/thresholds.md"));
    Thresholds thresholds;
    ASSERT_EQ(thresholds.profiles().size(), 2u);
    for (const auto& traits : measures()) {
        const std::string row = formatted("| %s | %s | %s| %s| ", traits.name, traits.unit,
                                          inTheManual(thresholds.profiles()[0], traits.measure),
                                          inTheManual(thresholds.profiles()[1], traits.measure));
        EXPECT_NE(manual.find(traits.unit.empty() ? "| RxQual | | 1, 3, 5, 7 | | " : row), std::string::npos) << row;
    }
    const auto begin = manual.find("# A line that begins"), end = manual.find("```", begin);
    ASSERT_NE(end, std::string::npos);
    EXPECT_EQ(thresholds.read(manual.substr(begin, end - begin)), std::nullopt);
    EXPECT_EQ(thresholds.used().name, "acceptance");
}

constexpr const char* kFile = "# Our network\n"
                              "use ours\r\n"
                              "\n"
                              "profile ours\n"
                              "  source  Acceptance rules of Beispielstraße, 2026  \n"
                              "\tRSRP excellent -75 good -85.5  fair -95 poor -110\n"
                              "FER excellent 0.5 good 1 fair 3 poor 10\n"
                              "profile other\n"
                              "source A second opinion";

TEST(Thresholds, OfTheUserAreUsed)
{
    Thresholds thresholds;
    ASSERT_EQ(thresholds.read(kFile), std::nullopt);
    EXPECT_EQ(thresholds.used().name, "ours");
    EXPECT_EQ(thresholds.used().source, "Acceptance rules of Beispielstraße, 2026");
    EXPECT_EQ(thresholds.used().limits,
              (std::vector<Limits>{{Measure::Rsrp, -75, -85.5, -95, -110}, {Measure::FrameErrors, 0.5, 1, 3, 10}}));
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -115), "no service");
    EXPECT_EQ(thresholds.grade(Measure::Rsrp, -115)->profile, "ours");
    // What the profile leaves out, another one grades, and says so.
    EXPECT_EQ(thresholds.grade(Measure::Rscp, -80)->profile, "drive-test");
    EXPECT_TRUE(thresholds.use("coverage"));
    EXPECT_EQ(gradeOf(thresholds, Measure::Rsrp, -115), "fair");
    EXPECT_FALSE(thresholds.use("nobody's"));
    EXPECT_EQ(thresholds.used().name, "coverage");
}

TEST(Thresholds, OfTheProgramCanBeChosen)
{
    Thresholds thresholds;
    ASSERT_EQ(thresholds.read("use coverage"), std::nullopt);
    EXPECT_EQ(thresholds.used().name, "coverage");
    ASSERT_EQ(thresholds.read(""), std::nullopt);
    EXPECT_EQ(thresholds.used().name, "coverage");
}

struct BadFile {
    const char* name;
    std::string text;
    const char* problem;

    friend void PrintTo(const BadFile& shown, std::ostream* out) { *out << shown.name; }
};

class BadThresholds : public testing::TestWithParam<BadFile> {};

TEST_P(BadThresholds, AreRefusedWithTheirLine)
{
    Thresholds thresholds;
    const auto problem = thresholds.read(GetParam().text);
    ASSERT_TRUE(problem);
    EXPECT_EQ(problem->text, GetParam().problem);
    EXPECT_EQ(thresholds.used().name, "drive-test");
    EXPECT_EQ(thresholds.profiles().size(), Thresholds().profiles().size());
}

std::string inProfile(const std::string& line)
{
    return "profile ours\nsource us\n" + line + "\n";
}

std::string manyProfiles(int count)
{
    std::string text;
    for (int i = 0; i < count; ++i)
        text += "profile p" + std::to_string(i) + "\nsource s\n";
    return text;
}

constexpr const char* kFourWords = "line 3: after RSRP come excellent, good, fair and poor, each with a number";
constexpr const char* kNaming = "line 1: after profile comes a name of at most 32 small letters, digits and hyphens";

INSTANTIATE_TEST_SUITE_P(
    Thresholds, BadThresholds,
    testing::Values(
        BadFile{"UnknownWord", "\n\nrsrp excellent -80",
                "line 3: \"rsrp\" is neither use, profile, source nor a measure such as RSRP"},
        BadFile{"UnprintableWord", "a\x1b[31m\xff",
                "line 1: \"a?[31m?\" is neither use, profile, source nor a measure such as RSRP"},
        BadFile{"LongWord", std::string(1000, 'x'),
                "line 1: \"xxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxxx...\" is neither use, profile, source nor a measure "
                "such as RSRP"},
        BadFile{"LimitsOutsideAProfile", "RSRP excellent -80 good -90 fair -100 poor -120",
                "line 1: RSRP stands before the first profile"},
        BadFile{"SourceOutsideAProfile", "source us", "line 1: source stands before the first profile"},
        BadFile{"NoGrades", inProfile("RSRP"), kFourWords},
        BadFile{"MissingGrade", inProfile("RSRP excellent -80 good -90 fair -100"), kFourWords},
        BadFile{"MissingNumber", inProfile("RSRP excellent -80 good -90 fair -100 poor"), kFourWords},
        BadFile{"OtherOrder", inProfile("RSRP good -90 excellent -80 fair -100 poor -120"), kFourWords},
        BadFile{"NoNumber", inProfile("RSRP excellent -80dBm good -90 fair -100 poor -120"),
                "line 3: \"-80dBm\" is no number"},
        BadFile{"NotANumber", inProfile("RSRP excellent nan good -90 fair -100 poor -120"),
                "line 3: \"nan\" is no number"},
        BadFile{"Infinite", inProfile("RSRP excellent inf good -90 fair -100 poor -120"),
                "line 3: \"inf\" is no number"},
        BadFile{"OutOfRange", inProfile("RSRP excellent 80 good -90 fair -100 poor -120"),
                "line 3: RSRP: 80 is not from -160 to 0"},
        BadFile{"NotFalling", inProfile("RSRP excellent -80 good -90 fair -90 poor -120"),
                "line 3: RSRP: the number of fair is not worse than the one before it"},
        BadFile{"NotRising", inProfile("FER excellent 3 good 2 fair 5 poor 10"),
                "line 3: FER: the number of good is not worse than the one before it"},
        BadFile{"TooMuch", inProfile("RSRP excellent -80 good -90 fair -100 poor -120 dBm"),
                "line 3: \"dBm\" stands after the number of poor"},
        BadFile{"MeasureTwice",
                inProfile(
                    "RSRP excellent -80 good -90 fair -100 poor -120\nRSRP excellent -80 good -90 fair -100 poor -12"),
                "line 4: the profile \"ours\" already has RSRP"},
        BadFile{"ProfileTwice", inProfile("profile ours"), "line 3: there is already a profile \"ours\""},
        BadFile{"ProfileOfTheProgram", "profile drive-test", "line 1: there is already a profile \"drive-test\""},
        BadFile{"NoName", "profile", kNaming}, BadFile{"BadName", "profile Ours", kNaming},
        BadFile{"LongName", "profile " + std::string(33, 'x'), kNaming},
        BadFile{"TwoNames", "profile ours too", kNaming},
        BadFile{"NoSource", "#\nprofile ours\n\n", "line 2: the profile has no source"},
        BadFile{"NoSourceBeforeTheNext", "profile ours\nprofile theirs\nsource x",
                "line 2: the profile of line 1 has no source"},
        BadFile{"EmptySource", "profile ours\nsource  ", "line 2: after source comes a text of at most 200 bytes"},
        BadFile{"LongSource", "profile ours\nsource " + std::string(201, 'x'),
                "line 2: after source comes a text of at most 200 bytes"},
        BadFile{"SourceTwice", inProfile("source x"), "line 3: the profile \"ours\" already has a source"},
        BadFile{"SourceWithControlCharacters", "profile ours\nsource a\x1b[31m",
                "line 2: the source has a control character, or is not in UTF-8"},
        BadFile{"SourceInLatin1",
                "profile ours\nsource Stra\xdf"
                "e",
                "line 2: the source has a control character, or is not in UTF-8"},
        BadFile{"UseOfNothing", "use", "line 1: after use comes the name of one profile"},
        BadFile{"UseOfTwo", "use coverage drive-test", "line 1: after use comes the name of one profile"},
        BadFile{"UseTwice", "use coverage\nuse drive-test", "line 2: line 1 already says which profile to use"},
        BadFile{"UseOfAnUnknownProfile", "\nuse theirs\n" + inProfile("#"), "line 2: there is no profile \"theirs\""},
        BadFile{"TooManyProfiles", manyProfiles(40), "line 61: there are more than 32 profiles"},
        BadFile{"TooLarge", std::string(65537, '\n'), "the file has more than 65536 bytes"}),
    [](const auto& each) { return std::string(each.param.name); });

// After a problem the thresholds are as before, also when a profile before it was good.
TEST(Thresholds, OfABadFileChangeNothing)
{
    Thresholds thresholds;
    ASSERT_EQ(thresholds.read(kFile), std::nullopt);
    const auto problem = thresholds.read("use more\nprofile more\nsource s\nRSRP");
    ASSERT_TRUE(problem);
    EXPECT_EQ(thresholds.used().name, "ours");
    EXPECT_EQ(thresholds.profiles().size(), Thresholds().profiles().size() + 2);
}

/// A file of words that the format knows, in any order, with noise between them.
rc::Gen<std::string> anyFile()
{
    const auto words = rc::gen::element<std::string>(
        "profile", "source", "use", "RSRP", "RSRQ", "FER", "excellent", "good", "fair", "poor", "-80", "-90.5", "-100",
        "-120", "1e99", "-", "a", "b", "#", "\n", "\n", "\n", "\r\n", "\t", std::string(1, '\0'), "\xff",
        "RSRP excellent -80 good -90 fair -100 poor -120", "profile a\nsource us\n");
    return rc::gen::map(rc::gen::container<std::vector<std::string>>(words), [](const std::vector<std::string>& all) {
        std::string text;
        for (const auto& each : all)
            text += each + (each.ends_with('\n') ? "" : " ");
        return text;
    });
}

void checkAfterReading(const std::string& text)
{
    Thresholds thresholds;
    const auto problem = thresholds.read(text);
    if (problem) {
        RC_ASSERT((problem->text.starts_with("line ") || text.size() > 65536));
        RC_ASSERT(problem->text.size() < 200);
        RC_ASSERT((std::ranges::all_of(problem->text, [](char c) { return c >= ' ' && c <= '~'; })));
        RC_ASSERT(thresholds.profiles().size() == Thresholds().profiles().size());
    }
    RC_ASSERT(thresholds.profiles().size() <= 32);
    for (const auto& profile : thresholds.profiles()) {
        RC_ASSERT(!profile.source.empty());
        // A better number never has a worse grade.
        for (const auto& limits : profile.limits) {
            const bool lessIsBetter = limits.excellent < limits.poor;
            for (int number = -160; number < 100; ++number) {
                const auto less = *limits.grade(number), more = *limits.grade(number + 1);
                RC_ASSERT((lessIsBetter ? less >= more : less <= more));
            }
        }
    }
}

RC_GTEST_PROP(Thresholds, OfAnyFileAreSoundOrRefused, ())
{
    checkAfterReading(*anyFile());
}

RC_GTEST_PROP(Thresholds, OfAnyBytesAreSoundOrRefused, (const std::string& bytes))
{
    checkAfterReading(bytes);
}

} // namespace
} // namespace kestrum
