#include "apps/kestrum-terminal/TextDisplay.h"

#include "frontends/terminal/Text.h"
#include "platform/Clock.h"
#include "platform/MainQueue.h"
#include "support/Format.h"

#include <cerrno>
#include <chrono>
#include <cstring>
#include <iostream>
#include <utility>

namespace kestrum {

namespace {

using namespace std::chrono_literals;

constexpr std::chrono::duration<int> kPatience = 30s;

void append(std::string& text, const KestrumModelNode& node, std::size_t depth)
{
    text.append(2 * depth, ' ').append(terminal::harmless(node.displayName()));
    if (const auto* value = node.value())
        text.append(": ").append(terminal::harmless(*value));
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

TextDisplay::TextDisplay(MonitorRoles& roles, std::ostream& out, int refreshes, End end)
    : _roles(roles),
      _out(out),
      _refreshes(refreshes),
      _end(std::move(end)),
      _model(std::make_shared<KestrumModel>(roles))
{
    _model->setObserver(this);
}

TextDisplay::~TextDisplay()
{
    _model->setObserver(nullptr);
    _model->destroyPorts();
}

void TextDisplay::start()
{
    awaitData();
    _roles.queue.post([model = _model] { model->restartMonitor(); });
}

void TextDisplay::awaitData()
{
    _patience = _roles.queue.repeat(kPatience, [this] {
        const auto& problem = _model->connectionProblem();
        end(1, formatted("the telephony service sent nothing for %d s%s", kPatience.count(),
                         problem ? ": " + problem->text : ""));
    });
}

void TextDisplay::end(int status, const std::string& why)
{
    _refreshes = 0;
    if (const auto tell = std::exchange(_end, nullptr))
        tell(status, why);
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
    awaitData();
    errno = 0;
    _out << _roles.clock.localText(_roles.clock.now(), "'Updated' yyyy-MM-dd 'at' HH:mm:ss") << '\n'
         << treeText(*root) << std::endl;
    if (!_out && errno != EPIPE)
        end(1, formatted("standard output: %s", std::strerror(errno)));
    else if (!_out || --_refreshes == 0) // also ends when the reader has closed the pipe
        end(0);
}

} // namespace kestrum
