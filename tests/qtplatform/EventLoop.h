#pragma once

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QTimer>

#include <gtest/gtest.h>

#include <chrono>
#include <functional>

namespace kestrum {

/// Serves the event loop until the condition holds; false when it does not within the bound.
inline bool eventually(const std::function<bool()>& condition,
                       std::chrono::milliseconds bound = std::chrono::seconds(20))
{
    QTimer wakes; // the condition may come true by what is no event of this thread
    wakes.start(std::chrono::milliseconds(2));
    for (const QDeadlineTimer end(bound); !condition();) {
        if (end.hasExpired())
            return false;
        QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents);
    }
    return true;
}

/// The application object that Qt's event loop needs, for the whole test program.
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
