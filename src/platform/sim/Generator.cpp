#include "platform/sim/Generator.h"

#include <cmath>
#include <numbers>

#include "platform/sim/PlantLocale.h"

namespace cv::sim {

namespace {

// A well-mixed 64-bit number from a seed and a counter (splitmix64).
uint64_t Mix(uint64_t seed, uint64_t counter) {
    uint64_t z = seed + (counter + 1) * 0x9E3779B97F4A7C15ULL;
    z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ULL;
    z = (z ^ (z >> 27)) * 0x94D049BB133111EBULL;
    return z ^ (z >> 31);
}

double Shape(const GeneratorSpec& generator, uint64_t elapsedMs) {
    const uint64_t period = generator.periodMs;
    const uint64_t time = elapsedMs + generator.phaseMs;
    const double fraction = static_cast<double>(time % period) / static_cast<double>(period);
    const double span = generator.max - generator.min;
    switch (generator.kind) {
        case GeneratorKind::Ramp:
            return generator.min + span * fraction;
        case GeneratorKind::Sine:
            return generator.min + span * (0.5 + 0.5 * std::sin(2.0 * std::numbers::pi * fraction));
        case GeneratorKind::Square:
            return fraction < 0.5 ? generator.min : generator.max;
        default: {
            const double unit = static_cast<double>(Mix(generator.seed, time / period) >> 11) /
                                9007199254740992.0;  // 2^53
            return generator.min + span * unit;
        }
    }
}

}  // namespace

GeneratedSample Generate(const ItemSpec& item, uint64_t elapsedMs) {
    const GeneratorSpec& generator = item.generator;
    if (generator.kind == GeneratorKind::Step) {
        const uint64_t step = (elapsedMs + generator.phaseMs) / generator.periodMs;
        const auto& qualities = generator.qualities;
        return {generator.values[step % generator.values.size()],
                qualities.empty() ? item.quality : qualities[step % qualities.size()]};
    }
    GeneratedSample sample{Variant(), item.quality};
    NumberAsType(Shape(generator, elapsedMs), item.type, sample.value);
    return sample;
}

bool NumberAsType(double number, uint16_t type, Variant& value) {
    if (type == VT_R8) {
        value = Variant::R8(number);
        return true;
    }
    return !ChangeType(value, Variant::R8(number), type, PlantLocale());
}

}  // namespace cv::sim
