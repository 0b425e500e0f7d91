// zx917-mkfile: writes a download file of our own records, for the demo and the benchmarks.
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <string>

#include "common/download_files.h"

int main(int argc, char** argv) {
    std::string out;
    std::string revision = "A.02.00";
    long bytes = 60000;
    bool srec = false;
    for (int i = 1; i < argc; ++i) {
        const std::string a = argv[i];
        auto next = [&]() -> std::string { return i + 1 < argc ? argv[++i] : ""; };
        if (a == "--revision") {
            revision = next();
        } else if (a == "--bytes") {
            bytes = std::atol(next().c_str());
        } else if (a == "--srec") {
            srec = true;
        } else if (a == "--help") {
            std::cout << "usage: zx917-mkfile [--revision A.02.00] [--bytes N] [--srec] OUT\n";
            return 0;
        } else {
            out = a;
        }
    }
    if (out.empty()) {
        std::cerr << "zx917-mkfile: no output file\n";
        return 2;
    }
    constexpr std::size_t kData = 32;  // data bytes per record, as linkers commonly write
    const long perSection = std::max(1L, bytes / 4 / 39);
    zx917::gen::FileLayout layout;
    layout.header = revision + "\r\nMDSP:" + revision + "\r\nCDMA:" + revision +
                  "\r\nAMPS:" + revision + "\r\nMPU:" + revision + "\r\n";
    layout.sections = zx917::gen::StandardSections(static_cast<int>(perSection), srec, kData);
    const auto data = zx917::gen::Build(layout);
    std::ofstream f(out, std::ios::binary);
    f.write(reinterpret_cast<const char*>(data.data()), static_cast<std::streamsize>(data.size()));
    if (!f) {
        std::cerr << "zx917-mkfile: could not write " << out << "\n";
        return 1;
    }
    std::size_t records = 0;
    for (const auto& section : layout.sections) records += section.records.size();
    std::cout << out << ": " << data.size() << " bytes, " << records << " records\n";
    return 0;
}
