#include "Operation.h"

#include "Help.h"

namespace appliance {

namespace {

bool same(const char* word, const std::string& value) {
    return word == nullptr ? value.empty() : value == word;
}

/// Walks the table from the option that decides most: the first value that leaves no row is the
/// one that is wrong.
const Operation& operationFor(const std::vector<Operation>& operations, const Request& request) {
    bool typeKnown = false, subtypeKnown = false;
    for (const Operation& operation : operations) {
        if (!same(operation.type, request.value("-r"))) continue;
        typeKnown = true;
        if (!same(operation.subtype, request.value("--rsubtype"))) continue;
        subtypeKnown = true;
        if (same(operation.name, request.value("-o"))) return operation;
    }
    const char* wrong = !typeKnown ? "-r" : !subtypeKnown ? "--rsubtype" : "-o";
    if (!request.has(wrong)) throw Failure(Fault::MissingOption, {wrong});
    throw Failure(Fault::BadOptionValue, {wrong, request.value(wrong)});
}

}  // namespace

std::vector<Operation> operationsOf(Tool tool) {
    std::vector<Operation> found;
    for (const auto* table :
         {&kAllocateOperations, &kConfigureOperations, &kPowerOperations, &kMoveOperations}) {
        for (const Operation& operation : *table) {
            if (operation.tool == tool) found.push_back(operation);
        }
    }
    return found;
}

std::string carryOut(Tool tool, const char* const* arguments, Language language) {
    const Request request(tool, arguments);
    if (request.has("--help")) return help(tool, language);
    const std::vector<Operation> operations = operationsOf(tool);
    const Operation& operation = operationFor(operations, request);
    operation.run(request, operation);
    return {};
}

}  // namespace appliance
