#pragma once

// Which bodies a run of the test program has run, so that several runs, held to different targets or on different
// processors, can be added up. With a file's name in the environment variable PIXELKILN_BODIES_RUN, a line for each body
// of the register is added to it at the end: "ran" or "not run", and what it is. So is one for each target that exported
// calls may choose.

#include "primitives/KernelRow.h"

#include <string>

namespace PKTest {

/// Tells that a body was called, whatever came of it.
void NoteBodyRun(const PK::KernelRow& kernel, PK::Target target);

/// Kernel and formats, for people.
std::string Describe(const PK::KernelRow& kernel);

} // namespace PKTest
