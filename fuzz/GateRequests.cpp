#include "AssociationModel.h"
#include "Target.h"

// Sequences of calls to the gate's function tables: a call that returns OK has the effect that CIM defines, which
// survives a restart. Any other call returns a message and changes nothing.

namespace {

using namespace fuzz;

constexpr std::size_t mostCalls = 30;

/** Calls the gate, and compares its response and the stored data with the models. */
void performAndCompare(SystemUnderTest& gate, const Call& call, std::size_t computers) {
    const Snapshot before;
    const cimhost::ProviderResponse response = gate.perform(call);
    if (call.isChange() && response.status.rc != CMPI_RC_OK) {
        gate.perform(harmlessRead());
    }
    try {
        requireRight(call, response, before);
        requireAssociations(call, response, Snapshot(), computers);
    } catch (const Violation& violation) {
        throw Violation(violation.what() + ("\nafter " + describe(call)) + response.status.message);
    }
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Bytes bytes(data, size);
    const std::size_t computers = bytes.below(SystemUnderTest::kindsOfComputers);
    SystemUnderTest gate(computers);
    for (std::size_t calls = 0; calls < mostCalls && !bytes.isAtEnd(); ++calls) {
        performAndCompare(gate, nextCall(bytes), computers);
    }
    return 0;
}
