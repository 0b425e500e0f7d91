// Compares what the simulated instrument received with a download file.
#pragma once

#include <string>

#include "instrument/instrument.h"

namespace zx917 {

// The report with "match" (per area) and "verdict" added: success only when the instrument
// confirmed the new revision and every area holds exactly the file's records.
std::string AddExpectation(const std::string& report, const Instrument& inst,
                           const std::string& downloadFile);

}  // namespace zx917
