#pragma once

#include "core/KestrumModel.h"
#include "platform/Roles.h"

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
    /// Writes to `out` after each of that many refreshes. The roles and the stream outlive it.
    TextDisplay(ApplicationRoles& roles, std::ostream& out, int refreshes);
    ~TextDisplay() override;

    /// Connects, and runs the main loop until all has been written: the program's exit status, 0. Says on standard error
    /// why it is 1 when that takes longer than half a minute.
    int run();

private:
    void updateViewControllerFromModel() override;
    void updateStatus() override {}
    void messagesLost() override;
    void displayReplaced() override {}

    ApplicationRoles& _roles;
    std::ostream& _out;
    int _refreshes;
    std::shared_ptr<KestrumModel> _model;
};

} // namespace kestrum
