#include "platform/qt/TerminationSignals.h"

#include "platform/posix/SignalPipe.h"

#include <QSocketNotifier>

#include <utility>

namespace kestrum {

struct TerminationSignals::Watch {
    explicit Watch(std::function<void()> action)
    {
        QObject::connect(&notifier, &QSocketNotifier::activated, &notifier, [this, run = std::move(action)] {
            pipe.taken();
            run();
        });
    }

    SignalPipe pipe{{SIGTERM, SIGINT, SIGHUP}};
    QSocketNotifier notifier{pipe.descriptor(), QSocketNotifier::Read};
};

TerminationSignals::TerminationSignals(std::function<void()> action)
    : _watch(std::make_unique<Watch>(std::move(action)))
{}

TerminationSignals::~TerminationSignals() = default;

} // namespace kestrum
