#pragma once

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <functional>
#include <string>
#include <vector>

// Measuring for the benchmarks: two pieces of work in turn, round by round, so that a machine whose
// speed drifts slows both; the median of the rounds' ratios is what counts.
namespace bench {

using Work = std::function<void()>;

inline double seconds(const Work &work)
{
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

inline double median(std::vector<double> values)
{
    std::sort(values.begin(), values.end());
    return values.empty() ? 0 : values[values.size() / 2];
}

struct Comparison
{
    double ratio;     // ours / reference, median of the rounds
    double ours;      // seconds, median
    double reference; // seconds, median
};

// One round is not counted: it warms both up.
inline Comparison compare(int rounds, const Work &ours, const Work &reference)
{
    std::vector<double> ratios, first, second;
    for (int round = -1; round < rounds; ++round) {
        const double a = seconds(ours);
        const double b = seconds(reference);
        if (round < 0)
            continue;
        ratios.push_back(a / b);
        first.push_back(a);
        second.push_back(b);
    }
    return {median(ratios), median(first), median(second)};
}

// One row of the table that bench/run prints: what was measured, the ratio, the goal (0: none) and
// the figures behind it. Tab-separated.
inline void row(const std::string &what, double ratio, double goal, const std::string &note)
{
    std::printf("%s\t%.2f\t%.2f\t%s\n", what.c_str(), ratio, goal, note.c_str());
    std::fflush(stdout);
}

inline std::string milliseconds(const Comparison &c)
{
    char text[96];
    std::snprintf(text, sizeof text, "%.3f ms against %.3f ms", c.ours * 1e3, c.reference * 1e3);
    return text;
}

} // namespace bench
