#include "insight/Thresholds.h"

#include "support/Format.h"
#include "support/Utf8.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace kestrum {
namespace {

constexpr std::size_t kLongestFile = 65536, kLongestName = 32, kLongestSource = 200; // bytes
constexpr std::size_t kMostProfiles = 32;
constexpr std::string_view kBlanks = " \t";

// No standard of 3GPP or 3GPP2 says what is good. The standards give ranges and, for some measures, a limit: a cell
// with Srxlev of 0 is not suitable (3GPP TS 36.304, 5.2.3.2), and a frame error rate of 1 to 2 % is the usual target of
// power control.
// clang-format off
constexpr Limits kDriveTest[] = {
    {Measure::Rsrp,                   -80,  -90, -100, -120},
    {Measure::Rsrq,                   -10,  -13,  -16,  -20},
    {Measure::Srxlev,                  30,   20,   10,    1},
    {Measure::Sinr,                    20,   13,    0,   -6},
    {Measure::Rscp,                   -75,  -85,  -95, -110},
    {Measure::EcNo,                    -6,  -10,  -14,  -20},
    {Measure::RxLev,                  -70,  -85,  -95, -105},
    {Measure::RxQual,                   1,    3,    5,    7},
    {Measure::PilotStrength,           -7,  -10,  -13,  -16},
    {Measure::CarrierToInterference,   10,    5,    0,  -11},
    {Measure::CdmaPower,              -70,  -85,  -95, -105},
    {Measure::FrameErrors,              1,    2,    5,   10},
};
constexpr Limits kCoverage[] = {
    {Measure::Rsrp,                   -95, -105, -115, -124},
    {Measure::Rsrq,                   -12,  -15,  -18,  -20},
    {Measure::Rscp,                   -85,  -95, -105, -115},
    {Measure::EcNo,                    -8,  -12,  -16,  -20},
    {Measure::RxLev,                  -80,  -90, -100, -108},
    {Measure::CdmaPower,              -80,  -90, -100, -108},
};
// clang-format on

struct BuiltIn {
    std::string_view name, source;
    std::span<const Limits> limits;
};
constexpr BuiltIn kBuiltIn[] = {
    {"drive-test", "Common practice in drive tests; no public standard grades levels.", kDriveTest},
    {"coverage", "Common practice for coverage maps outdoors: a cell is usable at lower levels than in a drive test.",
     kCoverage},
};

struct GradeWord {
    std::string_view word;
    double Limits::*limit;
};
constexpr GradeWord kGradeWords[] = {
    {"excellent", &Limits::excellent}, {"good", &Limits::good}, {"fair", &Limits::fair}, {"poor", &Limits::poor}};

const MeasureTraits* traitsOf(std::string_view name)
{
    const auto found = std::ranges::find(measures(), name, &MeasureTraits::name);
    return found != measures().end() ? &*found : nullptr;
}

/// For an error's text: a part of the file, short and printable.
std::string inQuotes(std::string_view text)
{
    constexpr std::size_t kLongest = 40;
    std::string shown = "\"";
    for (const char c : text.substr(0, kLongest))
        shown += c >= ' ' && c <= '~' ? c : '?';
    return shown + (text.size() > kLongest ? "...\"" : "\"");
}

/// Removes and returns the next word of a line; empty at its end.
std::string_view takeWord(std::string_view& line)
{
    line.remove_prefix(std::min(line.find_first_not_of(kBlanks), line.size()));
    const auto word = line.substr(0, line.find_first_of(kBlanks));
    line.remove_prefix(word.size());
    return word;
}

std::string_view trimmed(std::string_view text)
{
    text.remove_prefix(std::min(text.find_first_not_of(kBlanks), text.size()));
    return text.substr(0, text.find_last_not_of(kBlanks) + 1);
}

std::optional<double> numberIn(std::string_view text)
{
    double number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, std::chars_format::fixed);
    const bool complete = error == std::errc() && end == text.data() + text.size() && std::isfinite(number);
    return complete ? std::optional(number) : std::nullopt;
}

std::string shortest(double number)
{
    char digits[32];
    const auto end = std::to_chars(std::begin(digits), std::end(digits), number).ptr;
    return {digits, end};
}

bool isName(std::string_view text)
{
    return !text.empty() && text.size() <= kLongestName && std::ranges::all_of(text, [](char c) {
        return (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || c == '-';
    });
}

/// Whether it is UTF-8 without control characters.
bool isPrintable(std::string_view text)
{
    for (std::size_t at = 0; at < text.size();) {
        const auto character = nextCharacter(text, at);
        if (!character || *character < ' ' || (*character >= 0x7F && *character < 0xA0))
            return false;
    }
    return true;
}

/// Reads a file into profiles. Every operation returns what is wrong with the line, or an empty text.
class Reader {
public:
    explicit Reader(std::vector<ThresholdProfile>& profiles) : _profiles(profiles) {}

    std::optional<Problem> read(std::string_view text)
    {
        if (text.size() > kLongestFile)
            return Problem{formatted("the file has more than %lu bytes", kLongestFile)};
        std::size_t number = 0;
        while (!text.empty()) {
            const auto end = std::min(text.find('\n'), text.size());
            const auto wrong = readLine(text.substr(0, end), ++number);
            if (!wrong.empty())
                return at(number, wrong);
            text.remove_prefix(std::min(end + 1, text.size()));
        }
        if (const auto wrong = endProfile(); !wrong.empty())
            return at(_profileLine, wrong);
        if (_useLine != 0 && std::ranges::find(_profiles, _used, &ThresholdProfile::name) == _profiles.end())
            return at(_useLine, "there is no profile " + inQuotes(_used));
        return std::nullopt;
    }

    /// The profile that the file chooses; empty when it chooses none.
    const std::string& used() const { return _used; }

private:
    static Problem at(std::size_t line, const std::string& what) { return {formatted("line %lu: %s", line, what)}; }

    std::string readLine(std::string_view line, std::size_t number)
    {
        if (line.ends_with('\r'))
            line.remove_suffix(1);
        const auto word = takeWord(line);
        if (word.empty() || word.starts_with('#'))
            return {};
        if (word == "use")
            return readUse(line, number);
        if (word == "profile")
            return beginProfile(line, number);
        if (word == "source")
            return readSource(trimmed(line));
        const auto* measure = traitsOf(word);
        if (measure == nullptr)
            return inQuotes(word) + " is neither use, profile, source nor a measure such as RSRP";
        return readLimits(*measure, line);
    }

    std::string readUse(std::string_view rest, std::size_t number)
    {
        const auto name = takeWord(rest);
        if (name.empty() || !trimmed(rest).empty())
            return "after use comes the name of one profile";
        if (_useLine != 0)
            return formatted("line %lu already says which profile to use", _useLine);
        _used = name;
        _useLine = number;
        return {};
    }

    std::string beginProfile(std::string_view rest, std::size_t number)
    {
        // A profile that ends here without a source is told at its own line, after the last line.
        if (_profileLine != 0 && _profiles.back().source.empty())
            return formatted("the profile of line %lu has no source", _profileLine);
        const auto name = takeWord(rest);
        if (!isName(name) || !trimmed(rest).empty())
            return formatted("after profile comes a name of at most %lu small letters, digits and hyphens",
                             kLongestName);
        if (std::ranges::find(_profiles, name, &ThresholdProfile::name) != _profiles.end())
            return "there is already a profile " + inQuotes(name);
        if (_profiles.size() == kMostProfiles)
            return formatted("there are more than %lu profiles", kMostProfiles);
        _profiles.push_back({std::string(name), {}, {}});
        _profileLine = number;
        return {};
    }

    std::string readSource(std::string_view source)
    {
        if (_profileLine == 0)
            return "source stands before the first profile";
        auto& profile = _profiles.back();
        if (!profile.source.empty())
            return "the profile " + inQuotes(profile.name) + " already has a source";
        if (source.empty() || source.size() > kLongestSource)
            return formatted("after source comes a text of at most %lu bytes", kLongestSource);
        if (!isPrintable(source))
            return "the source has a control character, or is not in UTF-8";
        profile.source = source;
        return {};
    }

    std::string readLimits(const MeasureTraits& measure, std::string_view rest)
    {
        if (_profileLine == 0)
            return formatted("%s stands before the first profile", measure.name);
        auto& profile = _profiles.back();
        if (std::ranges::find(profile.limits, measure.measure, &Limits::measure) != profile.limits.end())
            return formatted("the profile %s already has %s", inQuotes(profile.name), measure.name);
        Limits limits{measure.measure, 0, 0, 0, 0};
        const double* previous = nullptr;
        for (const auto& [word, limit] : kGradeWords) {
            const bool isInOrder = takeWord(rest) == word;
            const auto text = takeWord(rest);
            if (!isInOrder || text.empty())
                return formatted("after %s come excellent, good, fair and poor, each with a number", measure.name);
            const auto number = numberIn(text);
            if (!number)
                return inQuotes(text) + " is no number";
            if (*number < measure.least || *number > measure.greatest)
                return formatted("%s: %s is not from %s to %s", measure.name, text, shortest(measure.least),
                                 shortest(measure.greatest));
            limits.*limit = *number;
            if (previous != nullptr && (measure.lessIsBetter ? *number <= *previous : *number >= *previous))
                return formatted("%s: the number of %s is not worse than the one before it", measure.name, word);
            previous = &(limits.*limit);
        }
        if (!trimmed(rest).empty())
            return inQuotes(trimmed(rest)) + " stands after the number of poor";
        profile.limits.push_back(limits);
        return {};
    }

    std::string endProfile() const
    {
        return _profileLine != 0 && _profiles.back().source.empty() ? "the profile has no source" : "";
    }

    std::vector<ThresholdProfile>& _profiles;
    std::size_t _profileLine = 0; ///< of the last profile; 0 before the first
    std::string _used;
    std::size_t _useLine = 0; ///< 0: the file chooses no profile
};

} // namespace

std::string_view word(Grade grade)
{
    constexpr std::string_view kWords[] = {"no service", "poor", "fair", "good", "excellent"};
    return kWords[static_cast<std::size_t>(grade)];
}

std::optional<Grade> Limits::grade(double number) const
{
    if (std::isnan(number))
        return std::nullopt;
    const auto isAtLeast = [&](double limit) { return excellent < poor ? number <= limit : number >= limit; };
    if (isAtLeast(excellent))
        return Grade::Excellent;
    if (isAtLeast(good))
        return Grade::Good;
    if (isAtLeast(fair))
        return Grade::Fair;
    return isAtLeast(poor) ? Grade::Poor : Grade::NoService;
}

Thresholds::Thresholds()
{
    for (const auto& [name, source, limits] : kBuiltIn)
        _profiles.push_back({std::string(name), std::string(source), {limits.begin(), limits.end()}});
}

std::optional<Problem> Thresholds::read(std::string_view text)
{
    auto profiles = _profiles;
    Reader reader(profiles);
    if (auto problem = reader.read(text))
        return problem;
    _profiles = std::move(profiles);
    if (!reader.used().empty())
        use(reader.used());
    return std::nullopt;
}

bool Thresholds::use(std::string_view name)
{
    const auto found = std::ranges::find(_profiles, name, &ThresholdProfile::name);
    if (found == _profiles.end())
        return false;
    _used = static_cast<std::size_t>(found - _profiles.begin());
    return true;
}

const Limits* Thresholds::limitsOf(Measure measure) const
{
    const auto* profile = profileOf(measure);
    return profile != nullptr ? &*std::ranges::find(profile->limits, measure, &Limits::measure) : nullptr;
}

std::optional<Verdict> Thresholds::grade(Measure measure, double number) const
{
    const auto* profile = profileOf(measure);
    const auto grade = profile != nullptr ? limitsOf(measure)->grade(number) : std::nullopt;
    return grade ? std::optional(Verdict{*grade, profile->name, profile->source}) : std::nullopt;
}

const ThresholdProfile* Thresholds::profileOf(Measure measure) const
{
    for (const auto* profile : {&used(), &_profiles.front()})
        if (std::ranges::find(profile->limits, measure, &Limits::measure) != profile->limits.end())
            return profile;
    return nullptr;
}

} // namespace kestrum
