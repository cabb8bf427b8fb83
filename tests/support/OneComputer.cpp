#include "support/AgentEnvironment.h"

const char* const agentNodes = agentEnvironment::oneComputer;
