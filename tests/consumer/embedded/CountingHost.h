#pragma once

// A host of a program's own, which does the least that the library asks for and counts what it is asked.

namespace host {

struct Counts {
    int allocations = 0, blocksGivenBack = 0, settings = 0, executors = 0, executorsLetGo = 0, tasks = 0,
        parts = 0;
};

Counts& Count();

} // namespace host
