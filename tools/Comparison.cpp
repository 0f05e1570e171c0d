#include "tools/Comparison.h"

#include "insight/NumberIn.h"
#include "support/Format.h"
#include "tools/Changes.h"
#include "tools/Harmless.h"
#include "tools/OutputFile.h"

#include <cmath>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <unistd.h>

namespace kestrum::tools {
namespace {

constexpr int kEqual = 0, kDifferent = 1, kTrouble = 2;

/// The end of a capture.
struct End {
    Value display;
    std::string technology;
};

/// Keeps the display instead of writing it.
class KeptDisplay final : public Output {
public:
    explicit KeptDisplay(End& end) : _end(end) {}

    void logLine(Priority, std::string_view) override {}
    void snapshot(const SnapshotListing&) override {}
    void display(const Decoding& decoding) override { _end = {decoding.display(), decoding.technology()}; }

private:
    End& _end;
};

struct Shown {
    std::string text;
    std::optional<double> number = {};
    std::string unit = {};
};

Shown shown(const Changes::Change& change)
{
    if (change.value.isNull())
        return {"(absent)"};
    Shown one{change.value.isText() ? std::string(change.text) : describe(change.value)};
    if (one.text.empty())
        one.text = "(empty)";
    if (const auto number = numberIn(change.value)) {
        one.number = number->number;
        one.unit = number->unit;
    }
    return one;
}

/// " (+3.25 dB)"; empty unless both are numbers of one unit.
std::string differenceOf(const Shown& before, const Shown& now)
{
    if (!before.number || !now.number || before.unit != now.unit)
        return {};
    auto text = formatted("%+.2f", *now.number - *before.number);
    text.erase(text.find_last_not_of('0') + 1);
    if (text.ends_with('.'))
        text.pop_back();
    const std::string unit = now.unit == "dBm" ? "dB" : now.unit; // the difference of two levels is a ratio
    return unit.empty() ? formatted(" (%@)", text) : formatted(" (%@ %@)", text, unit);
}

} // namespace

int compareFiles(const DecodeOptions& options, Bundle& bundle)
{
    End ends[2];
    for (std::size_t i = 0; i < 2; ++i) {
        DecodeOptions one = options;
        one.files = {options.files[i]};
        one.jobs = 1;
        if (decodeFiles(one, bundle, std::make_unique<KeptDisplay>(ends[i])) != 0)
            return kTrouble;
    }

    OutputFile data(STDOUT_FILENO);
    int status = kEqual;
    const auto tell = [&](std::string_view what, const Shown& before, const Shown& now) {
        data.write(onOneLine(formatted("%@: %@ -> %@%@", what, before.text, now.text, differenceOf(before, now))) +
                   '\n');
        status = kDifferent;
    };
    const auto& [before, now] = ends;
    try {
        if (before.technology != now.technology)
            tell("technology", {before.technology}, {now.technology});
        std::map<std::string, Shown, std::less<>> first;
        bool isSecond = false;
        Changes changes([&](const Changes::Change& change) {
            const auto known = first.find(change.path);
            if (!isSecond)
                first.insert_or_assign(std::string(change.path), shown(change));
            else
                tell(change.path, known != first.end() ? known->second : Shown{"(absent)"}, shown(change));
        });
        changes.look(before.display);
        isSecond = true;
        changes.look(now.display);
        data.flush();
    } catch (const ClosedPipe&) { // the reader wants no more
    }
    return status;
}

} // namespace kestrum::tools
