#pragma once

/// \file
/// The host's threads, and its pool for work that keeps a processor busy.
///
/// Forks: a child has of all threads the one that forked, and may use all services of the host at once. So a host holds
/// its locks over a fork (pthread_atfork), or has none. The library holds its own: that of PK_Initialize and PK_Terminate
/// first, since it calls the host under it, then the others, under which it calls nobody. Handlers that are registered
/// last run first, and the library registers its own as it is loaded, the first one without a priority: a host that has
/// handlers registers them by then, for which the bundled one has constructors of priority 101.

#include <boost/function.hpp>
#include <boost/smart_ptr/shared_ptr.hpp>
#include <cstdint>

namespace zebcore::threads {

/// The number by which the system knows the calling thread.
uint32_t GetCurrentThreadID() noexcept;

/// Keeps a pool of threads alive for as long as somebody holds it. Tasks reach the pool by
/// ExecuteCPUBoundTaskOnAllProcessors only.
class AsyncExecutor {
public:
    AsyncExecutor() = default;
    virtual ~AsyncExecutor() = default;
    AsyncExecutor(const AsyncExecutor&) = delete;
    AsyncExecutor& operator=(const AsyncExecutor&) = delete;
};

/// The executor of the process, started if nobody holds one: together with the thread that calls, it has a
/// thread for each processor that the process may use. If the system gives it fewer, it works with those.
/// Safe from all threads.
///
/// The child of a fork has the executor of its parent, as long as it is held there. Its threads are started anew at the
/// first task of the child.
/// \return never null; throws std::bad_alloc.
boost::shared_ptr<AsyncExecutor> CreateCPUBoundExecutor();

/// Calls \p function once for each index from 0 to \p count - 1, spread over the calling thread and the threads
/// of the executor, in no particular order, and returns when all calls have returned.
///
/// The calling thread takes part from the first index on, and so never waits for a thread of the pool to be
/// free, only for calls that have begun. Hence \p function may itself call this, any number of threads may call
/// it at once, and without an executor the calling thread makes all calls. It allocates nothing, but for the first task
/// of a forked child.
///
/// An exception that leaves \p function ends the task: indices that nobody has begun are skipped, those that
/// have begun are waited for, and then the first exception is thrown on the calling thread.
///
/// Every call runs in the floating-point mode (MXCSR) of the calling thread, and the exception flags that it raises
/// are the calling thread's afterwards: neither results nor flags tell which thread made the call. Before it takes
/// up something else, a thread of the executor has its own mode again. The x87 control word is not carried.
///
/// A task whose part forks goes on in the child as well, if the part ran on the thread that had called this: indices that
/// nobody had begun are called there too, those that other threads had begun are not, and nobody waits for them. If the
/// part ran on a thread of the executor, the caller does not exist in the child; when the part returns there, the child
/// ends as by exit(0). A part that forks had better leave the child by exec or _exit.
/// \param function  what to call; it is not copied.
/// \param count     number of calls; 0 and below make none.
void ExecuteCPUBoundTaskOnAllProcessors(const boost::function<void(int32_t)>& function, int32_t count);

} // namespace zebcore::threads
