#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

/// Runs a fuzzer's code over every file of the folders given, and over all their beginnings.
int main(int count, char** arguments) {
    int files = 0;
    for (int i = 1; i < count; ++i) {
        for (const auto& entry : std::filesystem::directory_iterator(arguments[i])) {
            std::ifstream file(entry.path(), std::ios::binary);
            const std::string content(std::istreambuf_iterator<char>(file), {});
            for (std::size_t size = 0; size <= content.size(); ++size) {
                // A copy of just that size, so that the sanitizer sees a step past its end.
                const std::string part(content.data(), size);
                LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(part.data()), part.size());
            }
            ++files;
        }
    }
    std::printf("%d files\n", files);
    return files > 0 ? 0 : 1;
}
