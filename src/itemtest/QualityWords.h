#pragma once

#include <cstdint>
#include <string>

namespace cv {

// An OPC quality word in words: "good", "uncertain, last usable value",
// "bad, communication failure", with ", low limited", ", high limited" or
// ", constant" when the limit bits are set.
std::string QualityWords(int32_t lQuality);

}  // namespace cv
