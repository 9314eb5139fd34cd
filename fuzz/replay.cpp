// Runs a fuzz target once over each of the given files, and over each file in the given folders: without a
// fuzzer, so that what was found once is looked at by every build.
#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace {

std::vector<std::filesystem::path> filesAt(const std::filesystem::path& path) {
    if (!std::filesystem::is_directory(path)) {
        return {path};
    }
    std::vector<std::filesystem::path> files;
    for (const auto& entry : std::filesystem::directory_iterator(path)) {
        if (entry.is_regular_file()) {
            files.push_back(entry.path());
        }
    }
    std::sort(files.begin(), files.end());
    return files;
}

std::vector<std::uint8_t> bytesOf(const std::filesystem::path& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

} // namespace

int main(int argc, char** argv) {
    std::size_t count = 0;
    for (const std::string& argument : std::vector<std::string>(argv + 1, argv + argc)) {
        for (const std::filesystem::path& path : filesAt(argument)) {
            std::cerr << path.string() << '\n';
            const std::vector<std::uint8_t> bytes = bytesOf(path);
            LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
            ++count;
        }
    }
    std::cerr << count << " inputs replayed\n";
    return count == 0 ? 1 : 0;
}
