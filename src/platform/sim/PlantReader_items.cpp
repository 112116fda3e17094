#include <cfloat>
#include <cmath>
#include <limits>
#include <optional>
#include <string_view>

#include "platform/OleDate.h"
#include "platform/sim/Generator.h"
#include "platform/sim/PlantReader.h"
#include "platform/sim/QualityNames.h"

namespace cv::sim {

namespace {

struct TypeName {
    const char* name;
    uint16_t type;
};

constexpr TypeName kTypes[] = {{"I2", VT_I2},    {"I4", VT_I4},     {"R4", VT_R4},
                               {"R8", VT_R8},    {"BOOL", VT_BOOL}, {"BSTR", VT_BSTR},
                               {"DATE", VT_DATE}};

const char* NameOfType(uint16_t type) {
    for (const TypeName& entry : kTypes) {
        if (entry.type == type) {
            return entry.name;
        }
    }
    return "?";
}

// The number written with count digits at position at of the text.
bool Digits(std::string_view text, size_t at, size_t count, int32_t& value) {
    if (at + count > text.size()) {
        return false;
    }
    value = 0;
    for (size_t i = at; i < at + count; ++i) {
        if (text[i] < '0' || text[i] > '9') {
            return false;
        }
        value = value * 10 + (text[i] - '0');
    }
    return true;
}

// "2024-05-01" or "2024-05-01 13:45:00" (a T may stand for the blank).
std::optional<double> DateFromText(std::string_view text) {
    OleDateParts parts;
    const bool day = (text.size() == 10 || text.size() == 19) && Digits(text, 0, 4, parts.year) &&
                     text[4] == '-' && Digits(text, 5, 2, parts.month) && text[7] == '-' &&
                     Digits(text, 8, 2, parts.day);
    const bool time =
        day && (text.size() == 10 ||
                ((text[10] == ' ' || text[10] == 'T') && Digits(text, 11, 2, parts.hour) &&
                 text[13] == ':' && Digits(text, 14, 2, parts.minute) && text[16] == ':' &&
                 Digits(text, 17, 2, parts.second)));
    if (!time) {
        return std::nullopt;
    }
    return OleDateFromParts(parts);
}

std::optional<double> FloatFromText(const std::string& text) {
    if (text == "NaN") {
        return std::numeric_limits<double>::quiet_NaN();
    }
    if (text == "Infinity" || text == "-Infinity") {
        const double infinity = std::numeric_limits<double>::infinity();
        return text == "Infinity" ? infinity : -infinity;
    }
    return std::nullopt;
}

std::optional<GeneratorKind> KindByName(const std::string& name) {
    static const std::pair<const char*, GeneratorKind> kinds[] = {
        {"constant", GeneratorKind::Constant}, {"ramp", GeneratorKind::Ramp},
        {"sine", GeneratorKind::Sine},         {"random", GeneratorKind::Random},
        {"square", GeneratorKind::Square},     {"step", GeneratorKind::Step}};
    for (const auto& [word, kind] : kinds) {
        if (name == word) {
            return kind;
        }
    }
    return std::nullopt;
}

}  // namespace

ItemSpec PlantReader::ReadItem(const Node& node, const std::string& prefix) {
    ExpectObject(node, {"name", "type", "value", "size", "quality", "writable", "generator",
                        "accessPaths", "pathRequired"});
    ItemSpec item;
    item.name = Name(node, "name");
    item.itemId = prefix + item.name;
    if (!Has(node, "type")) {
        Fail(node, "the key \"type\" is missing");
    }
    item.type = ReadType(node.Key("type"));
    item.value = ReadValue(node, item.type);
    if (Has(node, "quality")) {
        item.quality = ReadQuality(node.Key("quality"));
    }
    if (Has(node, "generator")) {
        item.generator = ReadGenerator(node.Key("generator"), item.type);
    }
    item.writable = Flag(node, "writable", item.generator.kind == GeneratorKind::Memory);
    item.accessPaths = Names(node, "accessPaths");
    item.pathRequired = Flag(node, "pathRequired", false);
    if (item.pathRequired && item.accessPaths.empty()) {
        Fail(node.Key("pathRequired"), "an item that requires an access path needs accessPaths");
    }
    return item;
}

uint16_t PlantReader::ReadType(const Node& node) {
    const std::string text = node->is_string() ? node->get<std::string>() : std::string();
    const bool array = text.size() > 2 && text.ends_with("[]");
    const std::string scalar = array ? text.substr(0, text.size() - 2) : text;
    for (const TypeName& entry : kTypes) {
        if (scalar == entry.name) {
            return array ? static_cast<uint16_t>(VT_ARRAY | entry.type) : entry.type;
        }
    }
    Fail(node, "unknown type " + node->dump() +
                   "; use I2, I4, R4, R8, BOOL, BSTR or DATE, with [] after it for an array");
}

Variant PlantReader::ReadValue(const Node& node, uint16_t type) {
    const Node value = node.Key("value");
    const Node size = node.Key("size");
    if ((type & VT_ARRAY) == 0) {
        if (size.value != nullptr) {
            Fail(size, "only arrays have a size");
        }
        return value.value == nullptr ? DefaultScalar(type) : ReadScalar(value, type);
    }
    const auto element = static_cast<uint16_t>(type & ~VT_ARRAY);
    std::vector<Variant> elements;
    if (size.value != nullptr) {
        const uint32_t count = Millis(node, "size", 0, 0);
        if (count > kMaxArrayElements - arrayElements_) {
            Fail(size, "the plant's arrays hold more than " + std::to_string(kMaxArrayElements) +
                           " elements");
        }
        const Variant fill =
            value.value == nullptr ? DefaultScalar(element) : ReadScalar(value, element);
        elements.assign(count, fill);
    } else if (value.value != nullptr) {
        ExpectArray(value);
        if (value->size() > kMaxArrayElements - arrayElements_) {
            Fail(value, "the plant's arrays hold more than " + std::to_string(kMaxArrayElements) +
                            " elements");
        }
        for (size_t i = 0; i < value->size(); ++i) {
            elements.push_back(ReadScalar(value.At(i), element));
        }
    }
    arrayElements_ += elements.size();
    return Variant::Array(element, std::move(elements));
}

Variant PlantReader::ReadScalar(const Node& node, uint16_t type) {
    const json& value = *node;
    switch (type) {
        case VT_I2:
        case VT_I4: {
            const double low = type == VT_I2 ? -32768.0 : -2147483648.0;
            const double high = type == VT_I2 ? 32767.0 : 2147483647.0;
            if (!value.is_number_integer() || value.get<double>() < low ||
                value.get<double>() > high) {
                Fail(node, std::string("needs a whole number that fits ") + NameOfType(type) +
                               " (" + std::to_string(static_cast<int64_t>(low)) + " to " +
                               std::to_string(static_cast<int64_t>(high)) + ")");
            }
            const auto number = value.get<int32_t>();
            return type == VT_I2 ? Variant::I2(static_cast<int16_t>(number)) : Variant::I4(number);
        }
        case VT_R4:
        case VT_R8: {
            const std::optional<double> number =
                value.is_number()   ? std::optional(value.get<double>())
                : value.is_string() ? FloatFromText(value.get<std::string>())
                                    : std::nullopt;
            if (!number ||
                (type == VT_R4 && std::isfinite(*number) && std::fabs(*number) > FLT_MAX)) {
                Fail(node, std::string("needs a number that fits ") + NameOfType(type) +
                               ", or \"NaN\", \"Infinity\" or \"-Infinity\"");
            }
            return type == VT_R4 ? Variant::R4(static_cast<float>(*number)) : Variant::R8(*number);
        }
        case VT_BOOL:
            if (!value.is_boolean()) {
                Fail(node, "needs true or false");
            }
            return Variant::Bool(value.get<bool>());
        case VT_BSTR:
            if (!value.is_string()) {
                Fail(node, "needs a text in double quotes");
            }
            return Variant::Str(value.get<std::string>());
        default: {
            const std::optional<double> date =
                value.is_number()   ? std::optional(value.get<double>())
                : value.is_string() ? DateFromText(value.get<std::string>())
                                    : std::nullopt;
            if (!date || !OleDateInRange(*date)) {
                Fail(node,
                     "needs a date from 0100-01-01 to 9999-12-31, as \"YYYY-MM-DD\", "
                     "\"YYYY-MM-DD hh:mm:ss\" or a day number");
            }
            return Variant::Date(*date);
        }
    }
}

Variant PlantReader::DefaultScalar(uint16_t type) {
    switch (type) {
        case VT_I2:
            return Variant::I2(0);
        case VT_I4:
            return Variant::I4(0);
        case VT_R4:
            return Variant::R4(0.0f);
        case VT_BOOL:
            return Variant::Bool(false);
        case VT_BSTR:
            return Variant::Str({});
        case VT_DATE:
            return Variant::Date(0.0);
        default:
            return Variant::R8(0.0);
    }
}

uint16_t PlantReader::ReadQuality(const Node& node) {
    if (node->is_number_unsigned() && node->get<uint64_t>() <= 0xFFFF) {
        return static_cast<uint16_t>(node->get<uint64_t>());
    }
    if (node->is_string()) {
        if (const auto quality = QualityByName(node->get<std::string>())) {
            return *quality;
        }
    }
    Fail(node, "unknown quality " + node->dump() + "; use a number from 0 to 65535 or one of " +
                   QualityNameList());
}

GeneratorSpec PlantReader::ReadGenerator(const Node& node, uint16_t type) {
    if (!node->is_object()) {
        Fail(node, "needs an object ({...})");
    }
    const std::string name = RequiredText(node, "kind");
    const std::optional<GeneratorKind> kind = KindByName(name);
    if (!kind) {
        Fail(node.Key("kind"), "unknown generator \"" + name +
                                   "\"; use constant, ramp, sine, random, square or step");
    }
    if ((type & VT_ARRAY) != 0 && *kind != GeneratorKind::Constant) {
        Fail(node.Key("kind"), "an array item can only be constant");
    }
    GeneratorSpec generator;
    generator.kind = *kind;
    switch (*kind) {
        case GeneratorKind::Constant:
            ExpectObject(node, {"kind"});
            return generator;
        case GeneratorKind::Step:
            ExpectObject(node, {"kind", "values", "qualities", "periodMs", "phaseMs"});
            break;
        case GeneratorKind::Random:
            ExpectObject(node, {"kind", "min", "max", "periodMs", "phaseMs", "seed"});
            break;
        default:
            ExpectObject(node, {"kind", "min", "max", "periodMs", "phaseMs"});
            break;
    }
    generator.periodMs = Millis(node, "periodMs", generator.periodMs, 1);
    generator.phaseMs = Millis(node, "phaseMs", 0, 0);
    if (*kind != GeneratorKind::Step) {
        generator.min = GeneratorBound(node, "min", 0.0, type);
        generator.max = GeneratorBound(node, "max", 100.0, type);
        const Node seed = node.Key("seed");
        if (seed.value != nullptr && !seed->is_number_unsigned()) {
            Fail(seed, "needs a whole number from 0 up");
        }
        generator.seed = seed.value == nullptr ? 1 : seed->get<uint64_t>();
        return generator;
    }
    const Node values = node.Key("values");
    if (values.value == nullptr || !values->is_array() || values->empty()) {
        Fail(values.value == nullptr ? node : values, "a step generator needs a list of values");
    }
    for (size_t i = 0; i < values->size(); ++i) {
        generator.values.push_back(ReadScalar(values.At(i), type));
    }
    const Node qualities = node.Key("qualities");
    if (qualities.value != nullptr) {
        if (!qualities->is_array() || qualities->empty()) {
            Fail(qualities, "needs a list of qualities");
        }
        for (size_t i = 0; i < qualities->size(); ++i) {
            generator.qualities.push_back(ReadQuality(qualities.At(i)));
        }
    }
    return generator;
}

double PlantReader::GeneratorBound(const Node& node, const char* key, double fallback,
                                   uint16_t type) {
    const Node bound = node.Key(key);
    if (bound.value == nullptr) {
        return fallback;
    }
    Variant converted;
    if (!bound->is_number() || !NumberAsType(bound->get<double>(), type, converted)) {
        Fail(bound, std::string("needs a number that fits ") + NameOfType(type));
    }
    return bound->get<double>();
}

}  // namespace cv::sim
