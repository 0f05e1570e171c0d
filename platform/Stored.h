#pragma once

namespace kestrum {

/// Whether a new file was written.
enum class Stored { Written, NameTaken, Failed };

} // namespace kestrum
