#pragma once

#include "tools/OutputFile.h"

#include <cstdio>
#include <deque>
#include <memory>
#include <sys/types.h>

namespace kestrum::tools {

/// Processes that write the output of one piece of a log each, while this process decodes on. A forked process begins
/// with this one's display. Its output waits in unnamed files until that of the earlier pieces is written.
class PieceWriters {
public:
    /// `most`: so many at a time.
    PieceWriters(std::size_t most, OutputFile& data, OutputFile& remarks) : _most(most), _data(data), _remarks(remarks)
    {}
    /// Ends those that still run.
    ~PieceWriters();
    PieceWriters(const PieceWriters&) = delete;
    PieceWriters& operator=(const PieceWriters&) = delete;

    /// Starts the writer of the next piece; waits for the oldest one when there are too many. True in the new process,
    /// whose output files are redirected. Throws WriterFailure and what writing throws.
    bool start();
    /// Waits for all of them.
    void finish();

private:
    using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;
    struct Writer {
        ::pid_t process;
        File data, remarks;
    };

    void copyOldest();

    const std::size_t _most;
    OutputFile& _data;
    OutputFile& _remarks;
    std::deque<Writer> _writers; ///< oldest first
};

/// A writer could not write its piece, and has said why.
struct WriterFailure {};

} // namespace kestrum::tools
