#include "live/Motions.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <type_traits>

#include "live/Maths.h"
#include "model/Chassis.h"

namespace simulator {

namespace {

bool holds(const Property* condition) {
    return condition == nullptr || std::get<List<std::uint8_t>>(condition->value).front() != 0;
}

bool isThere(const Resource* owner) {
    return owner == nullptr || owner->device->absence != Absence::Removed;
}

double targetOf(const Follows& follows, double source) {
    return isThere(follows.owner) && holds(follows.condition)
               ? finite(follows.factor * source + follows.offset)
               : 0.0;
}

double lagTarget(const Follows& follows) {
    return targetOf(follows, firstNumber(follows.source->value));
}

// The nearest number of the type.
template <typename Number>
Number nearest(double number) {
    if constexpr (std::is_floating_point_v<Number>) {
        return number;
    } else {
        using Limits = std::numeric_limits<Number>;
        const double top = std::ldexp(1.0, Limits::digits);
        const double whole = std::round(number);
        if (whole >= top) {
            return Limits::max();
        }
        return whole <= static_cast<double>(Limits::min()) ? Limits::min()
                                                           : static_cast<Number>(whole);
    }
}

// Calls fill(list) for the elements of a new value of the property, and brings each of them
// between the limits.
template <typename Fill>
Elements limitedValue(const PropertyDefinition& definition, Fill fill) {
    Elements value = noElements(definition.type);
    std::visit(
        [&](auto& list) {
            using Items = std::decay_t<decltype(list)>;
            if constexpr (!std::is_same_v<Items, List<std::string>>) {
                fill(list);
            }
        },
        value);
    definition.limit(value);
    return value;
}

Elements countedValue(const Property& property, std::uint64_t count) {
    return limitedValue(*property.definition, [&](auto& list) {
        using Number = typename std::decay_t<decltype(list)>::value_type;
        if constexpr (std::is_integral_v<Number>) {
            const Number first = std::get<std::decay_t<decltype(list)>>(property.value).front();
            list.push_back(static_cast<Number>(static_cast<std::uint64_t>(first) + count));
        }
    });
}

}  // namespace

void Motions::add(const Resource& owner, const Property& property, const Motion& motion,
                  const Resource* followed) {
    Motion& added = motions.emplace(&property, motion).first->second;
    owned[&owner].push_back(&added);
    if (added.follows) {
        added.follows->owner = followed;
    }
    if (followed != nullptr && added.follows && added.follows->timeConstant > 0.0) {
        followers[followed].push_back(&added);
    }
}

const Motion* Motions::find(const Property& property) const {
    const auto found = motions.find(&property);
    return found == motions.end() ? nullptr : &found->second;
}

RandomStream Motions::randomOf(const Motion& motion, std::int64_t now) const {
    return {mixed(seed) ^ motion.key, now - motion.since};
}

double Motions::numberAt(const Property& property, const Motion& motion, std::int64_t now) const {
    double number = 0.0;
    if (!motion.follows) {
        number = firstNumber(property.value);
    } else if (motion.follows->timeConstant > 0.0) {
        number = laggedAt(*motion.follows, now);
    } else {
        number = targetOf(*motion.follows, firstNumber(valueAt(*motion.follows->source, now)));
    }
    const RandomStream random = randomOf(motion, now);
    if (motion.drift) {
        number = finite(number + driftAt(*motion.drift, random));
    }
    return finite(number + noiseAt(motion.noise, random, 0));
}

Elements Motions::recordAt(const Property& property, const Motion& motion, std::int64_t now) const {
    const RandomStream random = randomOf(motion, now);
    const double rate = numberOf(motion.waveform->sampleRate);
    const auto count = static_cast<std::uint32_t>(
        std::clamp(numberOf(motion.waveform->samples), 0.0, static_cast<double>(mostSamples)));
    return limitedValue(*property.definition, [&](auto& list) {
        using Number = typename std::decay_t<decltype(list)>::value_type;
        list.reserve(count);
        for (std::uint32_t i = 0; i < count; ++i) {
            const double sample = sampleAt(*motion.waveform, rate, random, i);
            list.push_back(nearest<Number>(finite(sample + noiseAt(motion.noise, random, i))));
        }
    });
}

Elements Motions::valueAt(const Property& property, std::int64_t now) const {
    const Motion* motion = find(property);
    if (motion == nullptr) {
        return property.value;
    }
    if (motion->waveform) {
        return recordAt(property, *motion, now);
    }
    if (motion->counts) {
        return countedValue(property, countAt(*motion->counts, now - motion->since));
    }
    const double number = numberAt(property, *motion, now);
    return limitedValue(*property.definition, [&](auto& list) {
        using Number = typename std::decay_t<decltype(list)>::value_type;
        list.push_back(nearest<Number>(number));
    });
}

void Motions::noteChange(const Resource& resource, std::int64_t now) noexcept {
    const auto found = followers.find(&resource);
    if (found == followers.end()) {
        return;
    }
    for (Motion* motion : found->second) {
        Follows& follows = *motion->follows;
        const double target = lagTarget(follows);
        if (target != follows.target) {
            follows.start = laggedAt(follows, now);
            follows.target = target;
            follows.changedAt = now;
        }
    }
}

void Motions::restart(const Resource& resource, std::int64_t now) noexcept {
    const auto found = owned.find(&resource);
    if (found != owned.end()) {
        for (Motion* motion : found->second) {
            motion->since = now;
        }
    }
    noteChange(resource, now);
}

void Motions::settle() noexcept {
    for (auto& [property, motion] : motions) {
        if (motion.follows && motion.follows->timeConstant > 0.0) {
            motion.follows->target = lagTarget(*motion.follows);
            motion.follows->start = motion.follows->target;
        }
    }
}

}  // namespace simulator
