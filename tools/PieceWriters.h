#pragma once

#include "tools/OutputFile.h"
#include "tools/TemporaryFile.h"

#include <deque>
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
    /// whose output files are redirected. Throws WriterFailure, and OutputFailure also when a process cannot be started or
    /// was ended by a signal.
    bool start();
    /// Waits for all of them.
    void finish();

private:
    struct Writer {
        ::pid_t process = 0;
        TemporaryFile data = {}, remarks = {};
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
