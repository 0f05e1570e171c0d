#pragma once

#include "doubles/CrankedQueue.h"
#include "platform/qt/QtMainQueue.h"
#include "qtplatform/EventLoop.h"

#include <gtest/gtest.h>

namespace kestrum {

/// The main loop on the hand-cranked queue.
struct CrankedLoop {
    CrankedQueue queue;

    /// Runs the queue for that time.
    void wait(std::chrono::milliseconds time) { queue.advance(time); }
    bool eventually(const std::function<bool()>& condition) { return queue.turn(std::chrono::seconds(20), condition); }
    void drop() { queue.drop(); }
};

/// The real main loop.
struct QtLoop {
    QtMainQueue queue;

    void wait(std::chrono::milliseconds time)
    {
        QEventLoop loop;
        queue.post(time, [&] { loop.quit(); });
        loop.exec();
    }
    bool eventually(const std::function<bool()>& condition) { return kestrum::eventually(condition); }
    void drop() { queue.clear(); }
};

/// Gives the names of the two sides of a contract in the tests' names.
struct DoubleOrAdapter {
    template <typename World>
    static std::string GetName(int index)
    {
        return index == 0 ? "Double" : "Adapter";
    }
};

} // namespace kestrum
