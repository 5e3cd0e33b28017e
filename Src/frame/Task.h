#pragma once

// Work of the size of a frame, cut into parts that run on all processors while the calling thread takes part.

#include <cstdint>

namespace PK::Threading {

/// Work in independent parts. A concrete task holds copies of its parameters, is built on the caller's stack for
/// one call and writes a region of its own in each part; each part takes its own scratch. All failures are
/// decided before the task runs; where a part may fail, RunInBands (Bands.h) brings its result back.
class Task {
public:
    virtual int32_t GetPartCount() const = 0;

    /// Does one part, on any thread, in the floating-point mode of the thread that runs the task.
    /// \param partIndex  0 to the part count less one.
    virtual void RunPart(int32_t partIndex) const = 0;

    virtual ~Task() = default;
};

/// Runs every part of a task once and returns when all have ended. Safe from all threads, from within a part
/// too. Allocates nothing.
void RunTaskOnAllProcessors(const Task& task);

/// Holds the host's executor from now on. Where the host cannot give one there is none, and what tasks run on
/// is the host's affair. Not while tasks run, like start and stop.
void CreateTaskExecutor() noexcept;

/// Lets the host's executor go. Not while tasks run.
void ReleaseTaskExecutor() noexcept;

} // namespace PK::Threading
