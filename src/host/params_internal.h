// Internal state of the parameter store.
#pragma once

namespace carnet_params {

// Forgets the location of the last profile write (success or reported
// failure), as at start-up, so that its next failure is reported again.
void ForgetLastLocation();

}  // namespace carnet_params
