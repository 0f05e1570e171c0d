#pragma once

#include <fstream>

#include <unistd.h>

namespace kestrum::bench {

/// The memory of this process, in MiB.
inline double resident()
{
    std::ifstream file("/proc/self/statm");
    double size = 0, pages = 0;
    file >> size >> pages;
    return pages * static_cast<double>(::sysconf(_SC_PAGESIZE)) / (1 << 20);
}

} // namespace kestrum::bench
