#pragma once

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QTimer>

#include <gtest/gtest.h>

#include <chrono>
#include <functional>

namespace kestrum {

/// Runs the event loop until the condition is true; false when it is not within the time limit.
inline bool eventually(const std::function<bool()>& condition,
                       std::chrono::milliseconds bound = std::chrono::seconds(20))
{
    QTimer wakes; // something other than an event of this thread may make the condition true
    wakes.start(std::chrono::milliseconds(2));
    for (const QDeadlineTimer end(bound); !condition();) {
        if (end.hasExpired())
            return false;
        QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents);
    }
    return true;
}

/// The application object that Qt's event loop needs, one for the whole test program.
class EventLoopEnvironment : public testing::Environment {
public:
    void SetUp() override { _application = std::make_unique<QCoreApplication>(_count, _arguments); }
    void TearDown() override { _application.reset(); }

private:
    int _count = 1;
    char _name[5] = "test";
    char* _arguments[2] = {_name, nullptr};
    std::unique_ptr<QCoreApplication> _application;
};

} // namespace kestrum
