#pragma once

#include <cstdint>
#include <optional>

#include "model/Properties.h"

// How the value of a property moves. Times are in microseconds of the simulated time unless a
// comment says otherwise.
namespace simulator {

struct Resource;

// The maximum number of samples of a waveform, whatever a property asks for: 8 MiB of numbers, of
// which a small controller must hold some copies.
constexpr std::uint32_t mostSamples = 1u << 20;

// The number is that of another property instead of the stored value.
struct Follows {
    const Property* source = nullptr;
    // The resource of the source. While its device is not in its slot the number is 0.
    const Resource* owner = nullptr;
    // A Bool; while it is false the number is 0. May be null.
    const Property* condition = nullptr;
    double factor = 1.0;
    double offset = 0.0;
    // In seconds. Above 0 the number approaches each new target exponentially.
    double timeConstant = 0.0;

    // With a time constant: the target, and the number when it became the target.
    double target = 0.0;
    double start = 0.0;
    std::int64_t changedAt = 0;
};

// Wanders smoothly, at most `amplitude` away. Every `period` seconds it takes a new direction.
struct Drift {
    double amplitude = 0.0;
    double period = 1.0;
};

// Counts events since the property's restart.
struct Counts {
    double perSecond = 0.0;
};

// A fixed number, or the stored value of a property.
struct Quantity {
    double constant = 0.0;
    const Property* property = nullptr;
};

// A record of samples, the first of them at the beginning of a period.
struct Waveform {
    enum class Shape { Dc, Noise, Sawtooth, Sine, Square, Triangle };

    Shape shape = Shape::Dc;
    // In Hz.
    double frequency = 0.0;
    double amplitude = 0.0;
    double offset = 0.0;
    Quantity samples;
    // In samples a second.
    Quantity sampleRate;
};

// How one property moves. Counts exclude everything else, a waveform everything but noise.
struct Motion {
    // Determines the random numbers, together with the seed.
    std::uint64_t key = 0;
    // When the property was powered on or reset.
    std::int64_t since = 0;
    std::optional<Follows> follows;
    std::optional<Drift> drift;
    // A standard deviation. There is a new random number each millisecond.
    double noise = 0.0;
    std::optional<Counts> counts;
    std::optional<Waveform> waveform;
};

// Random numbers of one motion at one time.
struct RandomStream {
    std::uint64_t stream;
    // Since the restart.
    std::int64_t elapsed;
};

// The parts of a value, from what belongs to one motion alone.
double driftAt(const Drift& drift, const RandomStream& random);
// `index` is that of a sample in a record.
double noiseAt(double deviation, const RandomStream& random, std::uint64_t index);
// Modulo 2^64.
std::uint64_t countAt(const Counts& counts, std::int64_t elapsed);
// Before noise is added. A rate that is not above 0 leaves all samples at the first one.
double sampleAt(const Waveform& waveform, double rate, const RandomStream& random,
                std::uint64_t index);
// The number on its way to the target, for a time constant above 0.
double laggedAt(const Follows& follows, std::int64_t now);

// The first element as a number. The value is of a type of numbers.
double firstNumber(const Elements& value);
double numberOf(const Quantity& quantity);

}  // namespace simulator
