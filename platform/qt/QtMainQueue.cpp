#include "platform/qt/QtMainQueue.h"

#include <algorithm>
#include <utility>

namespace kestrum {

using namespace std::chrono;

struct QtMainQueue::Repetition {
    milliseconds interval;
    std::function<void()> action;
    Moment due;
    bool ended = false;
};

QtMainQueue::QtMainQueue()
{
    _timer.setSingleShot(true);
    _timer.setTimerType(Qt::PreciseTimer); // a coarse timer may run early
    QObject::connect(&_timer, &QTimer::timeout, &_timer, [this] { runDue(); });
}

void QtMainQueue::post(milliseconds delay, std::function<void()> task)
{
    post(steady_clock::now() + delay, std::move(task));
}

std::unique_ptr<Timer> QtMainQueue::repeat(milliseconds interval, std::function<void()> action)
{
    // Only the queue owns the action, which often owns the timer's owner: `clear` destroys both.
    struct Handle final : Timer {
        explicit Handle(std::weak_ptr<Repetition> of) : repetition(std::move(of)) {}
        ~Handle() override
        {
            if (const auto running = repetition.lock())
                running->ended = true;
        }
        std::weak_ptr<Repetition> repetition;
    };
    auto repetition =
        std::make_shared<Repetition>(Repetition{interval, std::move(action), steady_clock::now() + interval});
    schedule(repetition);
    return std::make_unique<Handle>(repetition);
}

void QtMainQueue::schedule(const std::shared_ptr<Repetition>& repetition)
{
    post(repetition->due, [this, repetition, clearings = _clearings] {
        if (repetition->ended)
            return;
        repetition->action();
        // After the action, so that a nested loop inside the action does not run it again.
        repetition->due = std::max(repetition->due + repetition->interval, steady_clock::now());
        if (!repetition->ended && clearings == _clearings)
            schedule(repetition);
    });
}

void QtMainQueue::clear()
{
    ++_clearings;
    _timer.stop();
    // Destroyed outside of the map: a destructor may post again.
    while (!_tasks.empty())
        std::exchange(_tasks, {}).clear();
}

void QtMainQueue::post(Moment due, std::function<void()> task)
{
    const bool first = _tasks.empty() || due < _tasks.begin()->first;
    _tasks.emplace(due, std::move(task));
    if (first)
        wake();
}

void QtMainQueue::wake()
{
    if (!_tasks.empty())
        _timer.start(std::max(ceil<milliseconds>(_tasks.begin()->first - steady_clock::now()), milliseconds(0)));
}

void QtMainQueue::runDue()
{
    // Tasks that these tasks post run in the next turn of the loop: sockets and the interface come first.
    const Moment now = steady_clock::now();
    const unsigned clearings = _clearings;
    while (clearings == _clearings && !_tasks.empty() && _tasks.begin()->first <= now) {
        const auto task = _tasks.extract(_tasks.begin());
        wake(); // a nested loop inside the task serves the other tasks
        task.mapped()();
    }
}

} // namespace kestrum
