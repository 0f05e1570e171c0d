#include "frontends/terminal/TextDisplay.h"

#include "frontends/terminal/Text.h"
#include "platform/MainQueue.h"
#include "platform/Time.h"

#include <QCoreApplication>

#include <chrono>
#include <iostream>

namespace kestrum {

namespace {

using namespace std::chrono_literals;

constexpr auto kPatience = 30s;

void append(std::string& text, const KestrumModelNode& node, std::size_t depth)
{
    text.append(2 * depth, ' ').append(harmless(node.displayName()));
    if (const auto* value = node.value())
        text.append(": ").append(harmless(*value));
    text += '\n';
    if (const auto* children = node.childNodes())
        for (const auto& each : *children)
            append(text, *each, depth + 1);
}

} // namespace

std::string treeText(const KestrumModelNode& node)
{
    std::string text;
    append(text, node, 0);
    return text;
}

TextDisplay::TextDisplay(ApplicationRoles& roles, std::ostream& out, int refreshes)
    : _roles(roles), _out(out), _refreshes(refreshes), _model(std::make_shared<KestrumModel>(roles))
{
    _model->setObserver(this);
}

TextDisplay::~TextDisplay()
{
    _model->setObserver(nullptr);
    _model->destroyPorts();
}

int TextDisplay::run()
{
    _roles.queue.post([model = _model] { model->restartMonitor(); });
    _roles.queue.post(kPatience, [] {
        std::cerr << "kestrum-terminal: the telephony service sent too little within 30 s\n";
        QCoreApplication::exit(1);
    });
    return QCoreApplication::exec();
}

void TextDisplay::messagesLost()
{
    std::cerr << "kestrum-terminal: " << _model->lossNotice() << '\n';
}

void TextDisplay::updateViewControllerFromModel()
{
    const auto root = _model->topLevelNodes();
    if (!root || _refreshes < 1)
        return;
    _out << _roles.clock.localText(_roles.clock.now(), "'Updated' yyyy-MM-dd 'at' HH:mm:ss") << '\n'
         << treeText(*root) << std::endl;
    if (--_refreshes == 0 || !_out)
        QCoreApplication::quit();
}

} // namespace kestrum
