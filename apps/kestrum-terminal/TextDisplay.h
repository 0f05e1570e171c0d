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

/// The display without a screen: the whole tree of the first refreshes, as text. Where nobody looks at a terminal, it
/// shows that the modem is heard, and what it says.
class TextDisplay final : private KestrumModelObserver {
public:
    /// How it ended: an exit status, and for standard error why it is not 0.
    using End = std::function<void(int status, const std::string& why)>;

    /// Writes to `out` after each of that many refreshes. The roles and the stream outlive it.
    TextDisplay(MonitorRoles& roles, std::ostream& out, int refreshes, End end);
    ~TextDisplay() override;

    /// Connects. `end` is called once: with 0 when all has been written or the reader has gone, with 1 when nothing came
    /// for half a minute, or it cannot be written.
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
