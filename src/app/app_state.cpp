#include "app/app_state.h"

#include "app/identity.h"

namespace zx917 {

void InitDefaults(AppState& app, const std::string& programFolder) {
    app.PortSettings = std::string("9600") + "," + "n" + "," + "8" + "," + "1";
    app.Terminator = kDefaultTerminator;
    app.HexFolder = JoinPath(programFolder, kHexFolderName);
    app.ScriptStep = kNoRun;
}

}  // namespace zx917
