// Start-up on disk: the "HEX" folder beside the program, whatever is or is not there.
#include "app/startup.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "common/download_files.h"

namespace zx917 {
namespace {

namespace fs = std::filesystem;

TEST(Startup_HexFolder, CreatedWhenMissingElseLeftAlone) {
    {
        gen::TempDir dir;
        CreateHexFolder(dir.path());
        EXPECT_TRUE(fs::is_directory(dir.path() + "/HEX"));
        EXPECT_TRUE(fs::is_empty(dir.path() + "/HEX"));
    }
    {
        gen::TempDir dir;
        fs::create_directory(dir.path() + "/HEX");
        dir.write("HEX/A.HEX", std::string("keep"));
        CreateHexFolder(dir.path());
        EXPECT_EQ(fs::file_size(dir.path() + "/HEX/A.HEX"), 4u);
    }
    {
        gen::TempDir dir;
        dir.write("HEX", std::string("a plain file"));
        CreateHexFolder(dir.path());
        EXPECT_TRUE(fs::is_regular_file(dir.path() + "/HEX"));
    }
    {
        // A program folder nobody may write to: start-up goes on without the folder.
        gen::TempDir dir;
        const std::string ro = dir.path() + "/ro";
        fs::create_directory(ro);
        ::chmod(ro.c_str(), 0555);
        CreateHexFolder(ro);
        if (::geteuid() != 0) {
            EXPECT_FALSE(fs::exists(ro + "/HEX"));
        }
        CreateHexFolder(dir.path() + "/missing/folder");
        EXPECT_FALSE(fs::exists(dir.path() + "/missing"));
        ::chmod(ro.c_str(), 0755);
    }
}

}  // namespace
}  // namespace zx917
