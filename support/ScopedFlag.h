#pragma once

namespace kestrum {

/// Sets a flag, and clears it when the scope ends, also by an exception. The flag must outlive this object.
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
