#pragma once

#include "support/Bytes.h"

#include <cstdint>
#include <functional>
#include <ostream>

namespace kestrum {

/// Appends bytes to a capture.
using ByteSink = std::function<void(Bytes)>;
/// The stream outlives the sink; whether it took the bytes is for the caller to ask.
ByteSink sinkTo(std::ostream& stream);

/// Appends a message to a channel capture.
void writeKcap(const ByteSink& to, Bytes message);
/// Notes in a channel capture that so many messages are missing here.
void writeKcapGap(const ByteSink& to, std::uint64_t messages);

/// Appends a channel message to a DLF stream. False, and nothing is written, when the stream cannot hold it: it is no
/// ordinary record, or longer than 65,535 bytes.
bool writeDlf(const ByteSink& to, Bytes message);

} // namespace kestrum
