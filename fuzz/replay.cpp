// A target without a fuzzer: checks every input in the given folders or files.
// usage: replay_TARGET [--describe] PATH...
// With --describe the inputs are described in words and not checked.
// Exit status: 1 when an input is handled wrongly, 2 when there is none to check.
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

#include "fuzz/target.h"

namespace {

std::string ReadAll(const std::filesystem::path& path)
{
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
}

std::vector<std::filesystem::path> FilesBelow(const char* path)
{
    if (!std::filesystem::is_directory(path))
        return {path};
    std::vector<std::filesystem::path> files;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(path)) {
        if (entry.is_regular_file())
            files.push_back(entry.path());
    }
    return files;
}

} // namespace

int main(int argc, char** argv)
{
    const bool describes = argc > 1 && std::strcmp(argv[1], "--describe") == 0;
    size_t numInputs = 0;
    size_t numDifferences = 0;
    for (int argument = describes ? 2 : 1; argument < argc; ++argument) {
        for (const std::filesystem::path& path : FilesBelow(argv[argument])) {
            const std::string input = ReadAll(path);
            ++numInputs;
            const std::string difference = describes ? "" : fuzz::Check(input);
            if (describes || !difference.empty())
                std::printf("%s\n%s%s\n", path.c_str(), fuzz::Describe(input).c_str(),
                            difference.c_str());
            numDifferences += difference.empty() ? 0 : 1;
        }
    }
    std::printf("%zu inputs, %zu treated wrongly\n", numInputs, numDifferences);
    if (numInputs == 0)
        return 2;
    return numDifferences == 0 ? 0 : 1;
}
