#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>

/// Compares with the bytes of the file, which stands in the data directory of the test. After a
/// wanted change, run with UPDATE_GOLDEN=1 and read the difference with care.
inline void ExpectGolden(const std::string& path, const std::string& text) {
    if (std::getenv("UPDATE_GOLDEN") != nullptr) {
        std::ofstream(path, std::ios::binary) << text;
    }
    std::ostringstream golden;
    golden << std::ifstream(path, std::ios::binary).rdbuf();
    EXPECT_EQ(text, golden.str()) << path;
}
