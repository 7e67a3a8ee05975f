// Why the store of this process did not carry out a command. The answer of a method does not
// tell; the line in the log does.
#pragma once

#include "../CommandContext.h"

namespace qelo::cli {

// Begins to overhear what the calling thread logs, for the rest of the process. The result
// gives the reason of the last refused command; empty when none was refused here, or when the
// logging library cannot be overheard. Where the log goes makes no difference.
RefusalReason overhearRefusals();

} // namespace qelo::cli
