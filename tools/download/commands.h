// The commands of zx917-download.
#pragma once

#include <string>
#include <vector>

namespace zx917 {

int RunCheckCommand(const std::vector<std::string>& files);
int RunIdentifyCommand(const std::vector<std::string>& args);
int RunDownloadCommand(const std::vector<std::string>& args);
int RunHistoryCommand(const std::vector<std::string>& args);

}  // namespace zx917
