#pragma once

#include "platform/SystemLog.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>

namespace kestrum {

/// syslog(3), written by a second thread, so that a daemon that stops reading never stops the program. When the queue
/// is full, lines are dropped and their count is logged, also during a long flood; lines of error priority replace
/// others. A line longer than `kLongestLine` is cut and ends in an ellipsis: a peer chooses some of the texts.
class LinuxSystemLog final : public SystemLog {
public:
    /// Writes a line, called by the thread. `level` is syslog's, 0 to 7.
    using Sink = std::function<void(int level, const std::string& text)>;
    static constexpr std::size_t kCapacity = 4096;       ///< lines
    static constexpr std::size_t kLongestLine = 8 << 10; ///< bytes

    /// Writes to syslog(3) under the program's name.
    explicit LinuxSystemLog(const std::string& program);
    explicit LinuxSystemLog(Sink sink, std::size_t capacity = kCapacity);
    /// Waits up to half a second until the thread has written the queue.
    ~LinuxSystemLog() override;

    void write(Priority priority, std::string_view text) override;

private:
    struct Shared;
    std::shared_ptr<Shared> _shared;
};

/// Writes lines "program: text" to standard error: for a service under systemd and for a program run by hand.
LinuxSystemLog::Sink standardErrorSink(const std::string& program);

} // namespace kestrum
