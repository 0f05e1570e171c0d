#pragma once

#include "platform/MainQueue.h"
#include "voxd/Source.h"
#include "voxd/modem/ModemTree.h"

#include <memory>

namespace kestrum {

class Clock;
class ModemManager;
class PropertyLists;

/// The machine's modems as a live source of the technology IFX, whatever their access technology is, and before any
/// modem is there too. It gives a tree when a client starts to stream, after every change, and every 2 s.
class ModemSource final : public Source {
public:
    /// All arguments must outlive the source.
    ModemSource(ModemManager& modems, ModemTreeSetting setting, MainQueue& queue, const Clock& clock,
                PropertyLists& lists);
    ModemSource(const ModemSource&) = delete;
    ModemSource& operator=(const ModemSource&) = delete;
    ~ModemSource() override;

    std::optional<Message> next() override;
    bool isLive() const override { return true; }
    void streamedTo(std::size_t clients) override;
    std::string_view technology() const override;

private:
    void noteChange();
    void offer();

    ModemManager& _modems;
    ModemTreeSetting _setting;
    MainQueue& _queue;
    const Clock& _clock;
    PropertyLists& _lists;
    std::size_t _clients = 0;
    bool _due = false;
    std::unique_ptr<Timer> _pulse;    ///< while a client streams
    std::unique_ptr<Timer> _settling; ///< until the changes that come together have come
};

} // namespace kestrum
