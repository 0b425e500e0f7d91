// identify and download need the Qt serial adapter; this build has none.
#include <iostream>

#include "download/commands.h"

namespace zx917 {

int RunIdentifyCommand(const std::vector<std::string>&) {
    std::cerr << "zx917-download: identify is not available in this build\n";
    return 2;
}

int RunDownloadCommand(const std::vector<std::string>&) {
    std::cerr << "zx917-download: download is not available in this build\n";
    return 2;
}

}  // namespace zx917
