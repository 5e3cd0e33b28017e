#pragma once

// The largest error of a measurement, which is printed and entered in the test's report.

#include <gtest/gtest.h>

#include <iostream>
#include <limits>
#include <string>

namespace PKTest {

class WorstError {
public:
    explicit WorstError(std::string what) : fWhat(std::move(what)) {}

    /// A not-a-number is the worst of all.
    void Take(double error, double at) {
        if (error <= fError) return;
        fError = error == error ? error : std::numeric_limits<double>::infinity();
        fAt = at;
    }

    double Error() const { return fError; }

    void Report() const {
        std::cout << "[ MEASURED ] " << fWhat << ": " << fError << " at " << fAt << '\n';
        testing::Test::RecordProperty(fWhat, std::to_string(fError));
    }

    /// Reports, and expects an error below \p bound and something to have been measured.
    void ExpectBelow(double bound) const {
        Report();
        EXPECT_GE(fError, 0) << "nothing was measured";
        EXPECT_LT(fError, bound) << fWhat << ", worst at " << fAt;
    }

private:
    std::string fWhat;
    double fError = -1, fAt = 0;
};

} // namespace PKTest
