// A template file. The first byte chooses the technology; the rest is the property list, XML or binary. The display
// shows records of all codes of the technology.
//
// Equal templates give equal displays. The template is not changed. Every path of the tree leads to its node. A
// generator that takes over a display continues in the same display.
#include "FuzzedRoles.h"
#include "LogGenerator/LogGenerator.h"
#include "Require.h"
#include "core/KestrumModelNode.h"
#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "support/Record.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

constexpr std::string_view kTechnologies[] = {kVoxLogChannelTechnology_Zephra_GSM, kVoxLogChannelTechnology_Zephra_CDMA,
                                              kVoxLogChannelTechnology_Zephra_LTE,
                                              kVoxLogChannelTechnology_Zephra_UTRAN2};

/// A record with small counts and different fields.
std::vector<std::byte> patterned(LogCode code)
{
    constexpr std::size_t kLength = 160;
    std::vector<std::byte> record(kLength);
    for (std::size_t i = 0; i < kLength; ++i)
        record[i] = static_cast<std::byte>(i < 25 ? 2 + i % 5 : i * 37);
    record[0] = std::byte{1};
    record[3] = static_cast<std::byte>(code & 0xFF);
    record[4] = static_cast<std::byte>(code >> 8);
    return record;
}

class Run : public FuzzedRoles {
public:
    Run(std::string_view technology, const Value& templateNode) : _technology(technology)
    {
        state.set("Template", templateNode);
        restart();
        const auto codes = _generator->getStartCommand()->at("SetZephraLogCodes").array();
        require(codes != nullptr, "a start command without log codes");
        for (const auto& each : *codes)
            _codes.push_back(static_cast<LogCode>(each.int32().value_or(0)));
    }

    /// Creates a new generator on the old state, as after a reconnection.
    void restart() { _generator = LogGenerator::generatorFromTechnology(Value(_technology), roles); }

    void receiveAll()
    {
        for (const LogCode code : _codes)
            _generator->updateState(state, patterned(code));
        _generator->generateLogUsingState(state);
    }

    State state;

private:
    std::string_view _technology;
    std::vector<LogCode> _codes;
    std::unique_ptr<LogGenerator> _generator;
};

void checkPaths(const KestrumModelNode& node, const std::string& path, const PathDictionary& paths)
{
    require(paths.find(path) != nullptr, "a path that leads nowhere");
    if (node.childNodes() != nullptr)
        for (const auto& child : *node.childNodes())
            checkPaths(*child, joinPath(path, child->displayName()), paths);
}

void checkTree(const Value& display)
{
    PathDictionary paths;
    const auto tree = KestrumModelNode::makeTreeFromObject(display, paths);
    require(paths.find(kRootPath) == tree, "a tree without a root");
    checkPaths(*tree, std::string(kRootPath), paths);
}

void show(Bytes input)
{
    if (input.empty())
        return;
    const auto technology = kTechnologies[std::to_integer<std::size_t>(input.front()) % std::size(kTechnologies)];
    const Value templateNode = PropertyListCodec().parse(input.subspan(1));
    // Everything else is refused when the template is loaded.
    if (!templateNode.dictionary())
        return;
    const std::string before = describe(templateNode);

    Run once(technology, templateNode), again(technology, templateNode);
    once.receiveAll();
    again.receiveAll();
    require(describe(once.state.at("Display")) == describe(again.state.at("Display")),
            "equal templates, other display");
    require(once.log.lines == again.log.lines, "equal templates, other log");
    checkTree(once.state.at("Display"));

    const auto display = once.state.at("Display").dictionary();
    once.restart();
    once.receiveAll();
    require(once.state.at("Display").dictionary() == display, "the display was replaced");
    checkTree(once.state.at("Display"));
    require(describe(templateNode) == before, "the template was changed");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::show(std::as_bytes(std::span(data, size)));
    return 0;
}
