// The service record as an engineer reads it: an aligned table, newest first, and CSV
// (RFC 4180) and JSON for service reports. All three are UTF-8: the identity is the
// instrument's single-byte text, names and paths are shown as the file system holds them.
#pragma once

#include <string>
#include <vector>

#include "history/service_record.h"

namespace zx917 {

std::string HistoryTable(const std::vector<Attempt>& attempts);
std::string HistoryCsv(const std::vector<Attempt>& attempts);
std::string HistoryJson(const std::vector<Attempt>& attempts);

}  // namespace zx917
