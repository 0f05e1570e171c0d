// A moment of the display that was kept is what kestrum-decode shows of the messages up to then.
#include "LogGenerator/State.h"
#include "Tool.h"
#include "core/KestrumModelNode.h"
#include "doubles/VirtualClock.h"
#include "insight/Moments.h"
#include "platform/posix/LinuxBundle.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "tools/Decoding.h"

#include <gtest/gtest.h>

namespace kestrum::tools {
namespace {

std::string treeOf(const KestrumModelNode& parent, std::size_t depth = 0)
{
    std::string lines;
    for (const auto& node : *parent.childNodes()) {
        lines += std::string(2 * depth, ' ') + node->displayName();
        if (const auto* value = node->value())
            lines += value->empty() ? ":" : ": " + *value;
        else if (node->childNodes()->empty())
            lines += " (empty)";
        lines += '\n';
        if (node->childNodes() != nullptr)
            lines += treeOf(*node, depth + 1);
    }
    return lines;
}

class Frozen : public testing::TestWithParam<const char*> {};

TEST_P(Frozen, IsWhatTheDecoderShowsAtThatMessage)
{
    const std::string capture = contentsOf(inCheckout(std::string("captures/") + GetParam() + ".kcap"));
    const std::size_t interval = capture.size() / 8;
    LinuxBundle bundle{{inCheckout("resources")}};
    PropertyListCodec codec;
    VirtualClock clock;
    Moments moments(clock);
    Decoding decoding({}, bundle, codec, [](Priority, std::string_view) {}, {});

    std::vector<std::size_t> ends; // of the messages that each moment has seen
    for (std::size_t at = 0; at < capture.size();) {
        std::size_t length = 0;
        for (std::size_t byte = 0; byte < 4; ++byte)
            length |= std::size_t{static_cast<unsigned char>(capture[at + byte])} << 8 * byte;
        decoding.take(bytesOf(std::string_view(capture).substr(at + 4, length)));
        at += 4 + length;
        if (!decoding.display() || at < (ends.size() + 1) * interval)
            continue;
        ends.push_back(at);
        moments.displayMade(*makeDictionary({{StateKey::kDisplay, shallowCopy(decoding.display())}}));
    }
    ASSERT_GT(ends.size(), 4u);

    auto moment = moments.newest();
    for (auto end = ends.rbegin(); end != ends.rend(); ++end) {
        ASSERT_TRUE(moment);
        PathDictionary paths;
        const auto root = KestrumModelNode::makeTreeFromObject(moment->display(), paths);
        EXPECT_EQ(treeOf(*root), run({"-"}, std::string_view(capture).substr(0, *end)).output);
        moment = moments.before(*moment);
    }
}

INSTANTIATE_TEST_SUITE_P(Captures, Frozen, testing::Values("cdma", "gsm", "ifx", "lte", "utran"),
                         [](const auto& each) { return std::string(each.param); });

} // namespace
} // namespace kestrum::tools
