#pragma once

#include "frontends/terminal/Text.h"
#include "platform/ApplicationDelegate.h"
#include "platform/NavigationView.h"
#include "platform/SaveInterface.h"
#include "platform/ScrollView.h"
#include "platform/TableScreen.h"
#include "platform/Toolkit.h"
#include "platform/Window.h"
#include "support/Problem.h"

#include <memory>
#include <optional>
#include <string>

namespace kestrum::terminal {

/// The UI toolkit on a terminal: standard input and output. Its main loop is the QCoreApplication's, which must
/// exist. One at a time.
class TerminalToolkit final : public Toolkit {
public:
    explicit TerminalToolkit(Charset charset);
    ~TerminalToolkit() override;

    /// The reason why the terminal cannot be used; empty when it can.
    static std::optional<Problem> problem();

    Rect mainScreenBounds() const override;
    Rect mainScreenApplicationFrame() const override;
    Size measure(std::string_view text, Font font) const override;

    std::unique_ptr<Window> makeWindow(Rect frame) override;
    std::unique_ptr<NavigationView> makeNavigationView(NavigationViewDelegate& delegate) override;
    std::unique_ptr<TableScreen> makeTableScreen(TableDataSource& source) override;
    std::unique_ptr<SaveInterface> loadSaveInterface(SaveInterfaceOwner& owner) override;
    std::shared_ptr<Label> makeLabel() override;
    std::shared_ptr<ScrollView> makeScrollView() override;

    void showAlert(std::string_view title, std::string_view message, std::string_view button) override;

    /// Ends with `q`, Ctrl-C, SIGTERM, SIGHUP, or when the terminal is gone. The terminal is then restored.
    int run(ApplicationDelegate& application) override;

private:
    struct Parts;
    std::unique_ptr<Parts> _parts;
};

} // namespace kestrum::terminal
