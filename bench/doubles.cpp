// Measures the conversion of a literal to the nearest double, and for comparison the JSON library's
// own conversion, which is off by one unit for about a third of the long literals.

#include <benchmark/benchmark.h>

#include <random>
#include <string>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/requestText.h"

namespace {

using namespace nQITRMCWEBSVC100;

using MakeLiteral = std::string (*)(std::mt19937_64& random);

std::string ofThreeDigits(std::mt19937_64& random) {
    return std::to_string(10 + random() % 90) + ".5";
}

std::string ofSeventeenDigits(std::mt19937_64& random) {
    return std::to_string(10000000000000000 + random() % 90000000000000000).insert(1, ".");
}

std::string arrayOf1000(MakeLiteral make) {
    std::mt19937_64 random(1);
    std::string text = "[" + make(random);
    for (int i = 1; i < 1000; ++i) {
        text += "," + make(random);
    }
    return text + "]";
}

void parseToNearest(benchmark::State& state, MakeLiteral make) {
    const std::string text = arrayOf1000(make);
    for (auto _ : state) {
        JsonDocument document;
        parseRequestText(text, document);
        benchmark::DoNotOptimize(document.Size());
    }
}

void parseRoughly(benchmark::State& state, MakeLiteral make) {
    const std::string text = arrayOf1000(make);
    for (auto _ : state) {
        JsonDocument document;
        benchmark::DoNotOptimize(document.Parse(text.c_str()).Size());
    }
}

const bool registered = [] {
    benchmark::RegisterBenchmark("doubles/nearestOf3Digits", parseToNearest, ofThreeDigits);
    benchmark::RegisterBenchmark("doubles/roughOf3Digits", parseRoughly, ofThreeDigits);
    benchmark::RegisterBenchmark("doubles/nearestOf17Digits", parseToNearest, ofSeventeenDigits);
    benchmark::RegisterBenchmark("doubles/roughOf17Digits", parseRoughly, ofSeventeenDigits);
    return true;
}();

}  // namespace
