#pragma once

namespace kestrum::bench {

/// Runs the registered benchmarks with the command line's options; returns the exit status.
int runAll(int argc, char** argv);

} // namespace kestrum::bench
