#include "support/AgentEnvironment.h"

// The agent of the fuzzers of providers.

const char* const agentNodes = agentEnvironment::oneComputer;
extern const bool agentHasNoLog = true;
