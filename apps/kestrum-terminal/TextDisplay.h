#pragma once

#include "core/KestrumModel.h"
#include "platform/Roles.h"

#include <functional>
#include <iosfwd>
#include <memory>
#include <string>

namespace kestrum {

/// The tree under `node` as lines, two blanks deeper for each level; a leaf is "name: value".
std::string treeText(const KestrumModelNode& node);

/// Prints the display as text: the whole tree after each of the first refreshes. For scripts, and to check a connection
/// without a screen.
class TextDisplay final : private KestrumModelObserver {
public:
    /// Receives the exit status and, when it is not 0, the reason for standard error.
    using End = std::function<void(int status, const std::string& why)>;

    /// Writes to `out` after each refresh, `refreshes` times. Roles and stream are borrowed and outlive this object.
    TextDisplay(MonitorRoles& roles, std::ostream& out, int refreshes, End end);
    ~TextDisplay() override;

    /// Connects. Calls `end` once: with 0 when everything is written or the reader has closed the pipe, with 1 after
    /// 30 s without data or when the output cannot be written.
    void start();

private:
    void updateViewControllerFromModel() override;
    void updateStatus() override {}
    void messagesLost() override;
    void displayReplaced() override {}
    void awaitData();
    void end(int status, const std::string& why = {});

    MonitorRoles& _roles;
    std::ostream& _out;
    int _refreshes;
    End _end;
    std::shared_ptr<KestrumModel> _model;
    std::unique_ptr<Timer> _patience;
};

} // namespace kestrum
