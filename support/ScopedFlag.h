#pragma once

namespace kestrum {

/// Sets a flag for as long as this object lives, whatever ends it.
class ScopedFlag {
public:
    explicit ScopedFlag(bool& flag) : _flag(flag) { _flag = true; }
    ScopedFlag(const ScopedFlag&) = delete;
    ScopedFlag& operator=(const ScopedFlag&) = delete;
    ~ScopedFlag() { _flag = false; }

private:
    bool& _flag;
};

} // namespace kestrum
