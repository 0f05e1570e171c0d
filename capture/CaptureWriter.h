#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <functional>
#include <ostream>

namespace kestrum {

/// Appends bytes to a capture.
using ByteSink = std::function<void(Bytes)>;
/// A sink that writes to the stream. The stream outlives the sink; the caller checks the stream for errors.
ByteSink sinkTo(std::ostream& stream);

/// Appends a message to a channel capture.
void writeKcap(const ByteSink& to, Bytes message);
/// Appends a note to a channel capture: `messages` messages are missing here.
void writeKcapGap(const ByteSink& to, std::uint64_t messages);

/// Appends a channel message to a DLF stream. False, with nothing written, when it is no ordinary record or its record
/// is longer than 65,535 bytes.
bool writeDlf(const ByteSink& to, Bytes message);

} // namespace kestrum
