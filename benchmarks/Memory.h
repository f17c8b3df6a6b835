#pragma once

#include <fstream>
#include <functional>
#include <string>

namespace Memory {

/// The most memory that the process has held so far.
inline long PeakKilobytes() {
    std::ifstream status("/proc/self/status");
    std::string word;
    while (status >> word && word != "VmHWM:") {
    }
    long kilobytes = 0;
    status >> kilobytes;
    return kilobytes;
}

/// By how many KiB the process grows at most while it runs this.
inline long GrowthWhile(const std::function<void()>& run) {
    std::ofstream("/proc/self/clear_refs") << 5;  // starts the record anew
    const long before = PeakKilobytes();
    run();
    return PeakKilobytes() - before;
}

}  // namespace Memory
