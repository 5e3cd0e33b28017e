#pragma once

// How often this program has called operator new, on all threads.

namespace PKTest {

int AllocationCount();

} // namespace PKTest
