// Start-up on disk: the "HEX" folder beside the program, whatever is or is not there, else in
// the user's own data folder.
#include "app/startup.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "common/download_files.h"

namespace zx917 {
namespace {

namespace fs = std::filesystem;

TEST(Startup_HexFolder, BesideTheProgramElseTheUsersOwn) {
    struct Case {
        const char* name;
        std::function<void(const gen::TempDir&)> before;
        std::string program;  // under the scratch folder
        std::string user;     // under the scratch folder; empty: none known
        std::string chosen;   // under the scratch folder
        bool folder;          // the chosen path is a folder afterwards
    };
    auto folder = [](const char* name) {
        return [name](const gen::TempDir& d) { fs::create_directories(d.path() + "/" + name); };
    };
    const Case cases[] = {
        {"created beside the program", folder("prog"), "prog", "data", "prog/HEX", true},
        {"a folder beside the program is kept", folder("prog/HEX"), "prog", "data", "prog/HEX",
         true},
        {"a plain file named HEX is left alone",
         [](const gen::TempDir& d) { d.write("HEX", std::string("a plain file")); }, "", "data",
         "HEX", false},
        {"a program folder where nothing can be made: the user's",
         [](const gen::TempDir& d) { d.write("prog", std::string("not a folder")); }, "prog",
         "data/zx917", "data/zx917/HEX", true},
        {"a program folder that is gone: the user's", folder("x"), "gone", "data", "data/HEX",
         true},
        {"nowhere: the one beside the program, not made",
         [](const gen::TempDir& d) { d.write("data", std::string("not a folder")); }, "gone",
         "data/zx917", "gone/HEX", false},
        {"nowhere and no user folder", folder("x"), "gone", "", "gone/HEX", false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        gen::TempDir d;
        c.before(d);
        const std::string program = c.program.empty() ? d.path() : d.path() + "/" + c.program;
        const std::string chosen =
            CreateHexFolder(program, c.user.empty() ? "" : d.path() + "/" + c.user);
        EXPECT_EQ(chosen, d.path() + "/" + c.chosen);
        EXPECT_EQ(fs::is_directory(chosen), c.folder);
    }
    // The folder beside the program is created empty; files already there stay untouched.
    gen::TempDir d;
    EXPECT_TRUE(fs::is_empty(CreateHexFolder(d.path(), "")));
    d.write("HEX/A.HEX", std::string("keep"));
    CreateHexFolder(d.path(), "");
    EXPECT_EQ(fs::file_size(d.path() + "/HEX/A.HEX"), 4u);
    // A program folder nobody may write to: the user's own (root may write anywhere).
    if (::geteuid() != 0) {
        gen::TempDir r;
        fs::create_directory(r.path() + "/ro");
        ::chmod((r.path() + "/ro").c_str(), 0555);
        EXPECT_EQ(CreateHexFolder(r.path() + "/ro", r.path() + "/own"), r.path() + "/own/HEX");
        EXPECT_FALSE(fs::exists(r.path() + "/ro/HEX"));
        ::chmod((r.path() + "/ro").c_str(), 0755);
    }
}

}  // namespace
}  // namespace zx917
