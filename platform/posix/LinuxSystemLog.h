#pragma once

#include "platform/SystemLog.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>

namespace kestrum {

/// syslog(3), written by a thread of its own: a daemon that stops reading never stops the program. What the queue
/// cannot take is counted, and the count is logged, during a lasting flood too. Lines of error priority take the places
/// of others. A longer line than `kLongestLine` is cut and ends in an ellipsis: a peer chooses some of the texts.
class LinuxSystemLog final : public SystemLog {
public:
    /// Where the thread writes a line: syslog's level (0 to 7), text.
    using Sink = std::function<void(int level, const std::string& text)>;
    static constexpr std::size_t kCapacity = 4096;
    static constexpr std::size_t kLongestLine = 8 << 10; ///< bytes

    /// To syslog(3), under the program's name.
    explicit LinuxSystemLog(const std::string& program);
    explicit LinuxSystemLog(Sink sink, std::size_t capacity = kCapacity);
    /// Gives the thread half a second to write what is queued.
    ~LinuxSystemLog() override;

    void write(Priority priority, std::string_view text) override;

private:
    struct Shared;
    std::shared_ptr<Shared> _shared;
};

/// Lines on standard error, "program: text", as a service's log under systemd and for a program run by hand.
LinuxSystemLog::Sink standardErrorSink(const std::string& program);

} // namespace kestrum
