// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_BENCH_BENCHTABLE_H
#define CADENZA_BENCH_BENCHTABLE_H

// Measuring helpers shared by the benchmarks: a monotonic stopwatch, medians, and one table format
// that puts every figure beside the floor or peer measured in the same run.

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>
#include <vector>

namespace CadenzaBench {

/// Seconds taken by @p work.
inline double secondsOf(const std::function<void()> &work)
{
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

/// Runs @p work @p runs times; returns each run's seconds, sorted.
inline std::vector<double> samplesOf(int runs, const std::function<void()> &work)
{
    std::vector<double> samples;
    samples.reserve(size_t(runs));
    for (int i = 0; i < runs; ++i) {
        samples.push_back(secondsOf(work));
    }
    std::sort(samples.begin(), samples.end());
    return samples;
}

inline double percentile(const std::vector<double> &sorted, double p)
{
    if (sorted.empty()) {
        return 0.0;
    }
    const size_t index = std::min(sorted.size() - 1, size_t(p * double(sorted.size() - 1) + 0.5));
    return sorted[index];
}

inline double median(const std::vector<double> &sorted)
{
    return percentile(sorted, 0.5);
}

struct Row
{
    std::string what;
    double value;
    std::string unit;
    std::string floorName;
    double floorValue;
    bool higherIsBetter = false;
};

/// Prints the rows; the ratio says how many times worse than the floor a figure is (1.0 = as good).
inline void printTable(const char *title, const std::vector<Row> &rows)
{
    std::printf("\n%s\n", title);
    std::printf(
        "%-44s %14s %-10s %-34s %14s %8s\n", "measure", "value", "unit", "floor / peer", "value", "ratio");
    for (const Row &row : rows) {
        double ratio = 0.0;
        if (row.floorValue > 0 && row.value > 0) {
            ratio = row.higherIsBetter ? row.floorValue / row.value : row.value / row.floorValue;
        }
        std::printf("%-44s %14.4g %-10s %-34s %14.4g %8.2f\n", row.what.c_str(), row.value, row.unit.c_str(),
            row.floorName.c_str(), row.floorValue, ratio);
    }
    std::fflush(stdout);
}

/// Forty locales for generated voices.
inline const char *const Locales[] = {"en_US", "en_GB", "de_DE", "fr_FR", "es_ES", "es_MX", "it_IT", "pt_BR",
    "ja_JP", "hi_IN", "nl_NL", "sv_SE", "pl_PL", "ru_RU", "tr_TR", "ko_KR", "zh_CN", "ar_SA", "fi_FI",
    "da_DK", "nb_NO", "cs_CZ", "el_GR", "he_IL", "hu_HU", "id_ID", "ms_MY", "ro_RO", "sk_SK", "th_TH",
    "uk_UA", "vi_VN", "ca_ES", "hr_HR", "bg_BG", "sl_SI", "lt_LT", "lv_LV", "et_EE", "is_IS"};

/// The sizes given on the command line, or 1,000 and 10,000.
inline std::vector<int> countsFromArguments(int argc, char *argv[])
{
    std::vector<int> counts;
    for (int i = 1; i < argc; ++i) {
        counts.push_back(std::atoi(argv[i]));
    }
    if (counts.empty()) {
        counts = {1000, 10000};
    }
    return counts;
}

} // namespace CadenzaBench

#endif
