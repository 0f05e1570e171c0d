#pragma once

#include "voxd/Source.h"
#include "voxd/capture/Capture.h"

#include <fstream>
#include <string>

namespace kestrum {

/// A capture as a source. Messages come in the rhythm of their time stamps, those without at the nominal spacing.
class ReplaySource final : public Source {
public:
    /// Between messages that have no time of their own.
    static constexpr std::chrono::milliseconds kNominalSpacing{500};
    /// A longer gap between two time stamps is a clock that was set, and counts as none.
    static constexpr std::chrono::hours kLongestGap{1};

    /// Opens the capture and finds its technology. Throws std::runtime_error, with what is wrong, when it cannot be
    /// read, is empty, or has nothing that tells its technology (then `technology`, when given, is taken).
    ReplaySource(const std::string& path, bool loop, std::string_view technology = {});

    std::optional<Message> next() override;
    std::string_view technology() const override { return _technology; }

    /// Why the capture ended before its end, with file and offset; empty otherwise.
    std::string fault() const;

private:
    void rewind();
    std::chrono::microseconds gapBefore(Bytes message);

    std::string _path;
    std::ifstream _file;
    CaptureReader _reader;
    bool _loop;
    std::string_view _technology;
    std::optional<std::chrono::microseconds> _last; // offset of the message given last
    std::optional<std::uint64_t> _lastStamp;
};

} // namespace kestrum
