#pragma once

#include "capture/CaptureReader.h"
#include "support/Date.h"
#include "voxd/Source.h"

#include <fstream>
#include <memory>
#include <string>

namespace kestrum {

class PropertyLists;

/// A capture as a source. Messages follow their times; messages without one follow at the nominal spacing.
class ReplaySource final : public Source {
public:
    /// The interval before a message without a time.
    static constexpr std::chrono::milliseconds kNominalSpacing{500};
    /// A longer gap between two times means that the clock was set. It counts as no gap.
    static constexpr std::chrono::hours kLongestGap{1};

    /// Opens the capture and detects its technology. Throws std::runtime_error with the reason when the capture
    /// cannot be read, is empty, or has no message that shows its technology. `lists` must outlive the source.
    ReplaySource(const std::string& path, bool loop, PropertyLists& lists);
    ReplaySource(const ReplaySource&) = delete;
    ReplaySource& operator=(const ReplaySource&) = delete;

    std::optional<Message> next() override;
    std::string_view technology() const override { return _technology; }

    /// The reason, with file and offset, why the capture could not be read to its end; empty otherwise.
    const std::string& fault() const { return _fault; }

private:
    void rewind();
    std::chrono::microseconds gapBefore(Bytes message);

    PropertyLists& _lists;
    std::string _path;
    CaptureFormat _format;
    std::ifstream _file;
    std::unique_ptr<ByteWindow> _window;
    std::unique_ptr<CaptureReader> _reader;
    std::string _fault;
    bool _loop;
    std::string_view _technology;
    std::optional<std::chrono::microseconds> _last; // offset of the last message given
    std::optional<Date> _lastTime;
};

} // namespace kestrum
