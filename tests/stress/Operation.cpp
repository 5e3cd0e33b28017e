#include "stress/Operation.h"

namespace PKStress {

std::vector<const Operation*>& Operation::Register() {
    static std::vector<const Operation*> operations;
    return operations;
}

Operation::Operation(const char* name, Prepare prepare) : fName(name), fPrepare(prepare) {
    Register().push_back(this);
}

const std::vector<const Operation*>& Operation::All() {
    return Register();
}

} // namespace PKStress
