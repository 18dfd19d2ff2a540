// Writes a library of real MP3 files to try things on.

#include "samples/SampleLibrary.h"
#include <cstdio>
#include <cstdlib>
#include <string>

int main(int argc, char** argv) {
    char* end = nullptr;
    const unsigned long long count = argc == 3 ? std::strtoull(argv[2], &end, 10) : 0;
    if (argc < 2 || argc > 3 || (argc == 3 && (count == 0 || *end != '\0'))) {
        std::fprintf(stderr, "usage: sample-library FOLDER [COUNT]\n"
                             "Writes MP3 files below FOLDER: a small collection of every style of name,\n"
                             "or COUNT songs in album folders.\n");
        return 2;
    }
    const std::string problem = argc == 3
                                    ? samples::WriteLargeLibrary(argv[1], static_cast<std::size_t>(count))
                                    : samples::WriteSmallLibrary(argv[1]);
    if (!problem.empty()) {
        std::fprintf(stderr, "sample-library: %s\n", problem.c_str());
        return 1;
    }
    return 0;
}
