#pragma once

#include "doubles/CrankedQueue.h"
#include "platform/qt/QtMainQueue.h"
#include "qtplatform/EventLoop.h"

#include <gtest/gtest.h>

namespace kestrum {

/// The hand-cranked queue, as a main loop.
struct CrankedLoop {
    CrankedQueue queue;

    /// Serves the queue for that long.
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

/// Names the sides of a contract in the tests' names.
struct DoubleOrAdapter {
    template <typename World>
    static std::string GetName(int index)
    {
        return index == 0 ? "Double" : "Adapter";
    }
};

} // namespace kestrum
