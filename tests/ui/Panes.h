#pragma once

#include "core/KestrumModelNode.h"
#include "doubles/RecordingToolkit.h"
#include "ui/KestrumPaneController.h"
#include "ui/NavigationStack.h"
#include "ui/SharedApplication.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace kestrum {

/// An application that only counts the requests of its screens.
class CountingApplication final : public SharedApplication {
public:
    bool allowSaveButton() const override { return allowed; }
    void showSaveView() override { ++shown; }
    void closeSaveView() override { ++closed; }
    void showNotice(std::string_view text) override { notices.emplace_back(text); }

    bool allowed = false;
    int shown = 0, closed = 0;
    std::vector<std::string> notices;
};

using Node = KestrumModelNodeRef;

inline Node leaf(std::string name, std::string value)
{
    return std::make_shared<KestrumModelLeafNode>(std::move(name), std::move(value));
}
inline Node inner(std::string name, std::vector<Node> children = {})
{
    return std::make_shared<KestrumModelTreeNode>(std::move(name), std::move(children));
}

/// A stack of panes without an application.
class Panes : public testing::Test {
protected:
    void TearDown() override { EXPECT_THAT(toolkit.record.faults, testing::IsEmpty()); }

    std::shared_ptr<KestrumPaneController> pane(Node node, std::string path = "/")
    {
        return std::make_shared<KestrumPaneController>(toolkit, application, std::move(node), std::move(path));
    }
    void start(Node node) { stack = std::make_unique<NavigationStack>(toolkit, pane(std::move(node))); }

    RecordingScreen& top() const { return toolkit.top(); }
    std::vector<std::string> paths() const
    {
        std::vector<std::string> paths;
        for (const auto& each : stack->viewControllers())
            paths.push_back(each->path());
        return paths;
    }

    RecordingToolkit toolkit;
    CountingApplication application;
    std::unique_ptr<NavigationStack> stack;
};

} // namespace kestrum
