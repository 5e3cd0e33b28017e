#pragma once

// Children that are forked to do something, and killed if they hang.

#include <functional>
#include <sys/types.h>

namespace PKTest {

/// As fork(); the child has an alarm set that ends it if it hangs.
pid_t ForkChild();

/// Waits for a child to end.
/// \return its exit code; if a signal ended it, the signal's number as a negative one: -SIGALRM for one that hung.
int EndOf(pid_t child);

/// The end of a child that does the work and exits, without further ado, with the code which that returns.
int EndOfChild(const std::function<int()>& work);

} // namespace PKTest
