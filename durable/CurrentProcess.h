#pragma once

#include <sys/types.h>

namespace durable {

/** The id of this process, also after a fork. Asks the kernel once per process, because each request needs the id. */
pid_t currentProcess() noexcept;

}  // namespace durable
