#include "support/AgentEnvironment.h"

// The agent that the provider works with in a fuzzer.

const char* const agentNodes = agentEnvironment::oneComputer;
extern const bool agentHasNoLog = true;
