#include "live/Motion.h"

#include <algorithm>
#include <cmath>

#include "live/Maths.h"

namespace simulator {

namespace {

constexpr double microseconds = 1e6;
constexpr std::int64_t noiseTick = 1000;

// The uses of one random stream; each has its own numbers.
enum class Use : std::uint64_t { Drift = 1, Noise, Samples };

std::uint64_t keyFor(Use use, const RandomStream& random, std::int64_t tick) {
    return mixed(mixed(random.stream + static_cast<std::uint64_t>(use)) ^
                 static_cast<std::uint64_t>(tick));
}

// -1 to 1.
double knotAt(const RandomStream& random, std::int64_t knot) {
    return 2.0 * uniform(keyFor(Use::Drift, random, knot)) - 1.0;
}

std::uint64_t keyOfSample(Use use, const RandomStream& random, std::uint64_t index) {
    return mixed(keyFor(use, random, random.elapsed / noiseTick) ^ index);
}

// -1 to 1, for a part of a period from 0 (inclusive) to 1 (exclusive).
double shapeAt(Waveform::Shape shape, double phase) {
    switch (shape) {
        case Waveform::Shape::Sawtooth:
            return 2.0 * phase - 1.0;
        case Waveform::Shape::Sine:
            return sineOfTurn(phase);
        case Waveform::Shape::Square:
            return phase < 0.5 ? 1.0 : -1.0;
        case Waveform::Shape::Triangle:
            return phase < 0.25   ? 4.0 * phase
                   : phase < 0.75 ? 2.0 - 4.0 * phase
                                  : 4.0 * phase - 4.0;
        default:
            return 0.0;
    }
}

}  // namespace

double driftAt(const Drift& drift, const RandomStream& random) {
    const double position = static_cast<double>(random.elapsed) / (drift.period * microseconds);
    const double knot = std::floor(position);
    const double part = position - knot;
    const double from = knotAt(random, static_cast<std::int64_t>(knot));
    const double to = knotAt(random, static_cast<std::int64_t>(knot) + 1);
    const double smooth = part * part * (3.0 - 2.0 * part);
    return drift.amplitude * std::clamp(from + (to - from) * smooth, -1.0, 1.0);
}

double noiseAt(double deviation, const RandomStream& random, std::uint64_t index) {
    return deviation == 0.0 ? 0.0 : deviation * gaussian(keyOfSample(Use::Noise, random, index));
}

std::uint64_t countAt(const Counts& counts, std::int64_t elapsed) {
    constexpr std::uint64_t million = 1000000;
    const auto whole = static_cast<std::uint64_t>(counts.perSecond);
    const double part = counts.perSecond - static_cast<double>(whole);
    const std::uint64_t seconds = static_cast<std::uint64_t>(elapsed) / million;
    const std::uint64_t rest = static_cast<std::uint64_t>(elapsed) % million * whole;
    const double broken = static_cast<double>(rest % million) / microseconds +
                          part * (static_cast<double>(elapsed) / microseconds);
    return seconds * whole + rest / million + static_cast<std::uint64_t>(broken);
}

double sampleAt(const Waveform& waveform, double rate, const RandomStream& random,
                std::uint64_t index) {
    if (waveform.shape == Waveform::Shape::Noise) {
        const double part = uniform(keyOfSample(Use::Samples, random, index));
        return waveform.offset + waveform.amplitude * (2.0 * part - 1.0);
    }
    const double periods =
        rate > 0.0 ? finite(waveform.frequency * static_cast<double>(index) / rate) : 0.0;
    return waveform.offset +
           waveform.amplitude * shapeAt(waveform.shape, periods - std::floor(periods));
}

double laggedAt(const Follows& follows, std::int64_t now) {
    const double elapsed = static_cast<double>(now - follows.changedAt) / microseconds;
    return follows.target +
           (follows.start - follows.target) * decay(elapsed / follows.timeConstant);
}

double firstNumber(const Elements& value) {
    return std::visit(
        [](const auto& list) {
            if constexpr (std::is_same_v<std::decay_t<decltype(list)>, List<std::string>>) {
                return 0.0;
            } else {
                return finite(static_cast<double>(list.front()));
            }
        },
        value);
}

double numberOf(const Quantity& quantity) {
    return quantity.property != nullptr ? firstNumber(quantity.property->value) : quantity.constant;
}

}  // namespace simulator
