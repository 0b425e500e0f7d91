// Runs a command line and captures its standard output and exit status.
#pragma once

#include <sys/wait.h>

#include <cstdio>
#include <string>

namespace zx917::test {

struct ToolResult {
    int status = -1;
    std::string out;
};

inline ToolResult RunTool(const std::string& commandLine) {
    ToolResult r;
    std::FILE* p = ::popen((commandLine + " 2>&1").c_str(), "r");
    if (p == nullptr) return r;
    char buf[4096];
    std::size_t n;
    while ((n = std::fread(buf, 1, sizeof buf, p)) > 0) r.out.append(buf, n);
    const int st = ::pclose(p);
    r.status = WIFEXITED(st) ? WEXITSTATUS(st) : -1;
    return r;
}

}  // namespace zx917::test
