#include "AssociationModel.h"
#include "Target.h"

// Sequences of calls of the gate's function tables: a call that returns OK has the effect that CIM defines, and
// survives a restart; any other call has a message and changes nothing.

namespace {

using namespace fuzz;

constexpr std::size_t mostCalls = 30;

/** Performs a call of the gate, and compares it with the models. */
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
