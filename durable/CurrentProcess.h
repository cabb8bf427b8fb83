#pragma once

#include <sys/types.h>

namespace durable {

/** The number of this process, also after a fork. Asks the kernel only once per process, since each request needs it.
 */
pid_t currentProcess() noexcept;

}  // namespace durable
