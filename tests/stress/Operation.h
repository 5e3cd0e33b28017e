#pragma once

// The operations that threads run at once.
//
// A family is a file X_stress.cpp that registers its operations:
//
//     std::function<bool()> PrepareRotate() { return Repeat({...}); } // Calls.h
//     const Operation sRotate("rotate", PrepareRotate);
//
// The library is started before the first is prepared.

#include <functional>
#include <string_view>
#include <vector>

namespace PKStress {

class Operation {
public:
    /// Gets ready, on one thread, and gives what every thread then calls over and over, all at once: it does
    /// the operation and tells whether the result was right. What it captures is shared, its destinations are its
    /// own.
    using Prepare = std::function<bool()> (*)();

    Operation(const char* name, Prepare prepare);

    std::string_view Name() const { return fName; }
    std::function<bool()> Ready() const { return fPrepare(); }

    static const std::vector<const Operation*>& All();

private:
    static std::vector<const Operation*>& Register();

    const char* fName;
    Prepare fPrepare;
};

} // namespace PKStress
