#pragma once

#include "frontends/qt/Alert.h"
#include "frontends/qt/Navigation.h"
#include "platform/Window.h"

namespace kestrum::qt {

/// The only window: full screen on a handset, in a handset's proportions on a desktop.
class MainWindow final : public QWidget, public Window {
public:
    MainWindow();
    ~MainWindow() override;

    void setRoot(NavigationView& root) override;
    /// The icon follows once the window has its first picture.
    void makeKeyAndVisible() override;
    void orderOut() override
    {
        if (!_abandoned)
            hide();
    }
    /// Stops all changes to the window, because the display connection is gone.
    void abandon() { _abandoned = true; }

    void showAlert(std::string_view title, std::string_view message, std::string_view button);
    Alert* alert() const { return _alert; }
    Navigation* root() const { return _root; }

    bool eventFilter(QObject* watched, QEvent* event) override;

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
    std::vector<Message> _messages; ///< not shown yet; they follow `_alert`
};

/// The known facts about a screen.
struct Display {
    QSize points;
    QSizeF millimetres; ///< empty or wrong when the screen does not report it
    bool touch;
    bool bare; ///< without a desktop
};

/// Whether the screen is a handset's, judged by its physical size and not by its scaled points. Where the size is not
/// known, a small touch screen counts as a handset's.
bool isHandset(const Display& display);
/// Whether the window takes the whole screen: on a handset, or without a desktop.
bool isHandset();
/// The screen that the application sees: a handset's whole screen, or the window's area on a desktop.
QRect screenArea();

} // namespace kestrum::qt
