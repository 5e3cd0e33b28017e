#pragma once

/// \file
/// Start and stop of the library, processor capabilities and debug switches.
///
/// All may be called from any thread at any time. Parts of a program that know nothing of each other, as two
/// plug-ins, each start and stop the library for themselves. An operation that runs while PK_Initialize detects
/// the processor, or while PK_SetDebugFlag writes, may choose some of its kernels by the old flags and some by the
/// new: where these give different results, rows of its image may differ. A flag that a setting clears is set for a
/// moment in between.
///
/// A child made by fork() may use the whole library, whatever other threads of its parent were doing in it at that
/// moment: it has the count of open calls, the flags and the settings of its parent, and a pool of its own that starts
/// its threads at its first task. What other threads were working on does not exist in the child, and what memory they
/// held is lost there. fork() waits until no thread is in the middle of a start or stop. It must not be called in a
/// handler of signals, nor in one of trace messages. Handlers given to pthread_atfork() before the library was loaded run
/// while it holds its locks, and must not call it.

#include <PixelKiln/Types.h>

extern "C" {

/// Starts the library; a child that is forked later finds it started. Calls nest: only the one that brings the count
/// of open calls to 1 does any work, which is to detect the processor (this sets capability flags and never clears
/// any), to read the host's settings "PK.disableAVX" and "PK.disableAVX2" (an entry of exactly "true" clears that
/// flag), to start the primitives, and to take the host's pool of threads, on which some operations run parts of their
/// work. For tests, the setting "PK.highestTarget" (plain, sse2, ssse3, sse41, avx, avx2, avx2fma or avx512) lets
/// everything above it count as missing in the processor, for colour spaces that have not converted yet too.
/// Every call wants a matching PK_Terminate.
/// \return always PK_Success: threads that cannot be had are done without, and a setting that there is no memory
///         to read counts as absent.
PK_API PK_Result PK_Initialize(void) noexcept;

/// Takes back one PK_Initialize; the last one stops the library and lets the pool of threads go.
/// Capability flags stay as they are. A call without an open PK_Initialize counts below 0, and the next
/// PK_Initialize then only makes good for it.
/// \return always PK_Success.
PK_API PK_Result PK_Terminate(void) noexcept;

/// Sets one of the numbered switches. A capability that the processor lacks can be switched on; nothing
/// guards against that.
/// \param which  0 blur of motion in linear light; 2 SSE, 3 SSE2, 4 SSE3, 5 SSSE3, 6 SSE4.1, 7 SSE4.2, 8
///               AVX, 9 AVX2; 10 every format has its origin at the top left. 1 and all above 10 are
///               ignored.
/// \param value  0 is off, anything else on.
/// \return always PK_Success.
PK_API PK_Result PK_SetDebugFlag(uint32_t which, int32_t value) noexcept;

/// Whether SSE4.1 code is used, as the flag stands now: after detection, settings and switches.
PK_API bool PK_hasSSE4(void) noexcept;

/// Whether AVX counts as present, as the flag stands now: after detection, settings and switches.
PK_API bool PK_hasAVX(void) noexcept;

/// Whether AVX2 code is used, as the flag stands now: after detection, settings and switches. AVX-512 code is
/// used only where this holds and the processor and the system have it; it has no flag to ask for or to set.
PK_API bool PK_hasAVX2(void) noexcept;

} // extern "C"
