// The one test host of the test program, shared by every suite that drives the service.
#pragma once
#include "host.h"

namespace qortest {

// Made at the first call with the source tree's data, a fresh output folder, quiet, recording; the
// library's statics hold on to its server until the process ends, so it is never deleted.
qorhost::CHost &shared_host();

// Points the configuration, font and interface-data categories at the host's data folder again,
// wherever tests that ran before left them.
void use_host_data_folders();

} // namespace qortest
