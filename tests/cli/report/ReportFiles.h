#pragma once

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

inline std::string textOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

inline std::size_t filesIn(const std::string& directory) {
    const std::filesystem::directory_iterator files(directory);
    return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}
