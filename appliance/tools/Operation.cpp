#include "Operation.h"

namespace appliance {

std::vector<Operation> operationsOf(Tool tool) {
    std::vector<Operation> found;
    for (const auto* table :
         {&kAllocateOperations, &kConfigureOperations, &kPowerOperations, &kMoveOperations}) {
        for (const Operation& operation : *table) {
            if (operation.tool == tool) {
                found.push_back(operation);
            }
        }
    }
    return found;
}

void carryOut(const Request& request) {
    const std::vector<Operation> operations = operationsOf(request.tool().tool);
    const Operation& operation = commandFor(operations, request);
    Change change(request);
    operation.run(change, operation);
    operation.isTest ? change.verify() : change.commit();
}

}  // namespace appliance
