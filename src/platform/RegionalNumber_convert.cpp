#include <charconv>
#include <limits>

#include "platform/RegionalNumber.h"

namespace cv {

namespace {

constexpr uint64_t k16BitLimit = 0xFFFF;
constexpr uint64_t k32BitLimit = 0xFFFF'FFFF;

int64_t PatternValue(uint64_t bits, uint64_t patternLimit) {
    if (patternLimit == k16BitLimit) {
        return static_cast<int16_t>(static_cast<uint16_t>(bits));
    }
    return static_cast<int32_t>(static_cast<uint32_t>(bits));
}

}  // namespace

int64_t RegionalNumber::Magnitude() const {
    return static_cast<int64_t>(digits_.size()) + exponent_;
}

template <typename Real>
ErrorInfo RegionalNumber::ToReal(Real& value, int64_t magnitudeLimit) const {
    Real result = 0;
    if (pattern_) {
        if (bits_ > k32BitLimit) {
            return OverflowError();
        }
        result = static_cast<Real>(PatternValue(bits_, k32BitLimit));
    } else if (!digits_.empty() && Magnitude() > magnitudeLimit) {
        return OverflowError();
    } else if (!digits_.empty() && Magnitude() >= -magnitudeLimit) {
        const std::string text = digits_ + "e" + std::to_string(exponent_);
        const auto read = std::from_chars(text.data(), text.data() + text.size(), result);
        if (read.ec == std::errc::result_out_of_range) {
            if (Magnitude() > 0) {
                return OverflowError();
            }
            result = 0;
        }
    }
    value = negative_ && result != 0 ? -result : result;
    return {};
}

ErrorInfo RegionalNumber::ToDouble(double& value) const {
    return ToReal(value, 400);
}

ErrorInfo RegionalNumber::ToSingle(float& value) const {
    return ToReal(value, 50);
}

ErrorInfo RegionalNumber::ToInteger(int64_t low, int64_t high, uint64_t patternLimit,
                                    int64_t& value) const {
    int64_t result = 0;
    if (pattern_) {
        if (bits_ > patternLimit) {
            return OverflowError();
        }
        result = PatternValue(bits_, patternLimit);
    } else if (!digits_.empty()) {
        const int64_t wholeLength = Magnitude();
        if (wholeLength > 18) {
            return OverflowError();
        }
        const auto size = static_cast<int64_t>(digits_.size());
        for (int64_t i = 0; i < wholeLength; ++i) {
            result = result * 10 + (i < size ? digits_[static_cast<size_t>(i)] - '0' : 0);
        }
        if (wholeLength >= 0 && wholeLength < size) {
            const char first = digits_[static_cast<size_t>(wholeLength)];
            const bool beyondHalf = size > wholeLength + 1;
            if (first > '5' || (first == '5' && (beyondHalf || result % 2 == 1))) {
                ++result;
            }
        }
    }
    result = negative_ ? -result : result;
    if (result < low || result > high) {
        return OverflowError();
    }
    value = result;
    return {};
}

ErrorInfo RegionalNumber::ToI2(int16_t& value) const {
    int64_t result = 0;
    ErrorInfo error = ToInteger(std::numeric_limits<int16_t>::min(),
                                std::numeric_limits<int16_t>::max(), k16BitLimit, result);
    if (!error) {
        value = static_cast<int16_t>(result);
    }
    return error;
}

ErrorInfo RegionalNumber::ToI4(int32_t& value) const {
    int64_t result = 0;
    ErrorInfo error = ToInteger(std::numeric_limits<int32_t>::min(),
                                std::numeric_limits<int32_t>::max(), k32BitLimit, result);
    if (!error) {
        value = static_cast<int32_t>(result);
    }
    return error;
}

}  // namespace cv
