#include "RecordingPort.h"

#include <platform/ProviderUtilities.h>

namespace Tesk {

bool ProviderUtilities::ValidateInput(const std::string& value, const std::string& extra) {
    return qelo::test::RecordingPort::inputAccepted(value, extra);
}

} // namespace Tesk
