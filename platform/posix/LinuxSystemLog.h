#pragma once

#include "platform/SystemLog.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>

#include <syslog.h>

namespace kestrum {

/// The system's log, written by a second thread, so that a daemon that stops reading never stops the program. When the
/// queue is full, lines are dropped and their count is logged, also during a long flood; lines of error priority replace
/// others. A line longer than `kLongestLine` is cut and ends in an ellipsis: a peer chooses some of the texts. Priority 16
/// counts as notice.
class LinuxSystemLog final : public SystemLog {
public:
    /// Writes a line, called by the thread. `level` is syslog's, 0 to 7. False when the line is lost.
    using Sink = std::function<bool(int level, const std::string& text)>;
    static constexpr std::size_t kCapacity = 4096;       ///< lines
    static constexpr std::size_t kLongestLine = 8 << 10; ///< bytes

    /// Writes to the log daemon under the program's name. KESTRUM_LOG chooses the lines: errors alone, unless it is set.
    explicit LinuxSystemLog(const std::string& program);
    /// `level`: lines of this level and of more urgent ones pass.
    explicit LinuxSystemLog(Sink sink, int level = LOG_INFO, std::size_t capacity = kCapacity);
    /// Waits up to half a second until the thread has written the queue.
    ~LinuxSystemLog() override;

    using SystemLog::write;
    void write(Priority priority, std::string_view text) override;
    bool passes(Priority priority) const override;

private:
    struct Shared;
    std::shared_ptr<Shared> _shared;
    const int _level;
};

/// The level that KESTRUM_LOG names: error, warning, notice or info; `unset` when it is not set or empty. Any other
/// value is reported on standard error and counts as not set.
int logLevel(const std::string& program, int unset);

/// Writes lines "program: text" to standard error: for a service under systemd and for a program run by hand.
LinuxSystemLog::Sink standardErrorSink(const std::string& program);

} // namespace kestrum
