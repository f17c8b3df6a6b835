#pragma once

// What all benchmarks share. The machine is noisy, and its speed drifts while a benchmark runs: so
// the contenders take turns, A B C, C B A, A B C, and each is compared with the first of the same
// turn. The way back is for the caches, which nobody shall always find cold.
//
//     Paired::Compare("table, 100,000 rows", 11,
//                     {{"ours", PrintTable}, {"floor", PrintFloor, "at most 2"}});
//
// prints the median time of each, and the median over all turns of ours / theirs:
//
//     table, 100,000 rows                        median     ours/it
//       ours                                   20.1 ms
//       floor                                  14.3 ms        1.41  at most 2

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

namespace Paired {

struct Contender {
    std::string name;
    std::function<void()> run;
    std::string target = {};  ///< what ours/it should be, in words; printed beside what it is
    double times = 1;         ///< how often a run does the work; shown is the time of one
    std::function<void()> clear = {};  ///< what is to be done behind a run, off the clock
};

/// Makes the compiler believe that somebody looks at the value.
template <class Value>
void Keep(const Value& value) {
    asm volatile("" : : "g"(&value) : "memory");
}

inline double Seconds(const std::function<void()>& run) {
    const auto start = std::chrono::steady_clock::now();
    run();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

inline double Median(std::vector<double> values) {
    const auto middle = values.begin() + static_cast<long>(values.size() / 2);
    std::ranges::nth_element(values, middle);
    return *middle;
}

/// Three digits and a unit that suits: "1.53 ms".
inline std::string TimeText(double seconds) {
    constexpr const char* units[] = {"s", "ms", "us", "ns"};
    size_t unit = 0;
    for (; seconds < 0.9995 && unit < 3; ++unit) {
        seconds *= 1000;
    }
    char text[32];
    const int decimals = seconds < 10 ? 2 : seconds < 100 ? 1 : 0;
    std::snprintf(text, sizeof text, "%.*f %s", decimals, seconds, units[unit]);
    return text;
}

/// Runs the contenders in turn, once to warm up and `rounds` times that count, and prints the
/// result. The first is ours.
inline void Compare(const std::string& title, int rounds,
                    const std::vector<Contender>& contenders) {
    std::vector<std::vector<double>> seconds(contenders.size());
    for (int round = -1; round < rounds; ++round) {
        for (size_t place = 0; place < contenders.size(); ++place) {
            const size_t i = round % 2 == 0 ? place : contenders.size() - 1 - place;
            const double taken = Seconds(contenders[i].run) / contenders[i].times;
            if (contenders[i].clear) {
                contenders[i].clear();
            }
            if (round >= 0) {
                seconds[i].push_back(taken);
            }
        }
    }
    std::printf("%-50s %10s %10s\n", title.c_str(), "median",
                contenders.size() > 1 ? "ours/it" : "");
    for (size_t i = 0; i < contenders.size(); ++i) {
        std::printf("  %-48s %10s", contenders[i].name.c_str(),
                    TimeText(Median(seconds[i])).c_str());
        if (i > 0) {
            std::vector<double> ratios;
            std::ranges::transform(seconds[0], seconds[i], std::back_inserter(ratios),
                                   std::divides());
            std::printf(" %10.2f  %s", Median(ratios), contenders[i].target.c_str());
        }
        std::printf("\n");
    }
    std::printf("\n");
    std::fflush(stdout);
}

struct ProgramCall {
    std::vector<std::string> words;  ///< the program, looked for in PATH, and its arguments
    std::string input = "/dev/null";
    std::string output = "/dev/null";
    int status = 0;  ///< the exit status that it must end with
};

/// Runs a program to its end, with its input and output in files. Throws when it cannot be run or
/// ends otherwise than it should.
inline void RunProgram(ProgramCall call) {
    std::vector<char*> argv;
    for (std::string& word : call.words) {
        argv.push_back(word.data());
    }
    argv.push_back(nullptr);
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_addopen(&files, 0, call.input.c_str(), O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&files, 1, call.output.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0600);
    pid_t process = 0;
    const int error = posix_spawnp(&process, argv[0], &files, nullptr, argv.data(), environ);
    posix_spawn_file_actions_destroy(&files);
    int status = 0;
    if (error != 0 || waitpid(process, &status, 0) != process || !WIFEXITED(status) ||
        WEXITSTATUS(status) != call.status) {
        throw std::runtime_error("Unable to run " + call.words[0]);
    }
}

}  // namespace Paired
