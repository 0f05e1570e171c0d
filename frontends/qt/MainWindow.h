#pragma once

#include "frontends/qt/Alert.h"
#include "frontends/qt/Navigation.h"
#include "platform/Window.h"

namespace kestrum::qt {

/// The one window: full screen on a handset, a handset's shape on a desktop.
class MainWindow final : public QWidget, public Window {
public:
    MainWindow();
    ~MainWindow() override;

    void setRoot(NavigationView& root) override;
    void makeKeyAndVisible() override;
    void orderOut() override
    {
        if (!_abandoned)
            hide();
    }
    /// The display is gone: the window is left as it is.
    void abandon() { _abandoned = true; }

    void showAlert(std::string_view title, std::string_view message, std::string_view button);
    Alert* alert() const { return _alert; }
    Navigation* root() const { return _root; }

protected:
    void resizeEvent(QResizeEvent*) override;

private:
    struct Message {
        QString title, text, button;
    };
    void showNextAlert();

    bool _abandoned = false;
    QPointer<Navigation> _root;
    QPointer<Alert> _alert;
    std::vector<Message> _messages; ///< waiting behind `_alert`
};

/// What is known of a screen.
struct Display {
    QSize points;
    QSizeF millimetres; ///< empty or wrong where the screen does not tell
    bool touch;
    bool bare; ///< no desktop runs on it
};

/// Whether the screen is a handset's by its real size, whatever its scale makes of its points; where that is not known,
/// a small one that is touched.
bool isHandset(const Display& display);
/// Whether the whole screen is ours: a handset's, or one without a desktop.
bool isHandset();
/// The screen as the application knows it: a handset's own, on a desktop the piece of it that the window takes.
QRect screenArea();

} // namespace kestrum::qt
