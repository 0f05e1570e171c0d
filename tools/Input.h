#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>

namespace kestrum::tools {

/// A file that is read from beginning to end and, if it is followed, further while it grows.
class Input {
public:
    /// "-" is standard input. Throws std::system_error when it cannot be opened.
    Input(const std::string& path, bool follow);
    ~Input();
    Input(const Input&) = delete;
    Input& operator=(const Input&) = delete;

    /// 0 at the end. Throws std::system_error.
    std::size_t read(std::span<std::byte> into);
    /// Empty unless the input is a regular file.
    std::optional<std::uint64_t> size() const;

    /// Whether it may grow: a regular file that is followed.
    bool mayGrow() const { return _changes >= 0; }
    /// Restarted: another file has the name now, or the file was emptied; reading starts again at its beginning.
    /// Gone: the file was deleted and not replaced yet.
    enum class Woken { Changed, Restarted, Gone, TimedOut, Ended };
    /// Waits until the file has changed, or the program is asked to end (SIGINT, SIGTERM, SIGHUP).
    Woken wait(std::optional<std::chrono::milliseconds> atMost);

private:
    void watch();
    Woken whatChanged();

    std::string _path;
    bool _isGone = false, _isSeekable = false;
    int _file = -1, _changes = -1, _signals = -1;
    std::uint64_t _read = 0;
};

} // namespace kestrum::tools
