// Runs a fuzzer over files, or over the files of folders, where there is no fuzzing engine. Exit
// status 1 if there was no file at all: a seed corpus that got lost must not pass for a green test.
#include "fuzz/fuzz.h"

#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

namespace {

void replay(const std::filesystem::path& path) {
    std::ifstream file(path, std::ios::binary);
    const std::vector<char> bytes{std::istreambuf_iterator<char>(file), {}};
    // A block of its own size, so that reading past its end shows.
    const std::vector<std::uint8_t> input(bytes.begin(), bytes.end());
    std::printf("%s\n", path.filename().c_str());
    std::fflush(stdout); // the name of the input that crashes is the last one
    LLVMFuzzerTestOneInput(input.data(), input.size());
}

} // namespace

int main(int argc, char** argv) {
    // Listed before the first one runs: a fuzzer may change the working folder.
    std::vector<std::filesystem::path> inputs;
    for (int i = 1; i < argc; ++i) {
        const auto path = std::filesystem::absolute(argv[i]);
        if (!std::filesystem::is_directory(path))
            inputs.push_back(path);
        else
            for (const auto& entry : std::filesystem::directory_iterator(path))
                inputs.push_back(entry.path());
    }
    for (const auto& path : inputs)
        replay(path);
    std::printf("%zu inputs\n", inputs.size());
    return inputs.empty() ? 1 : 0;
}
