#pragma once

#include <cstdint>
#include <string>

namespace cv {

// An OPC quality word in words: "good", "uncertain, last usable value",
// "bad, communication failure", with ", low limited", ", high limited" or
// ", constant" when the limit bits are set.
std::string QualityWords(int32_t lQuality);

enum class QualityLevel { Good, Uncertain, Bad };
// Good and uncertain by the quality's two top bits; anything else is bad.
QualityLevel LevelOf(int32_t lQuality);

// The name at the head of a server's text for a status
// ("Uncertain_SensorNotAccurate: The sensor ..." gives
// "Uncertain_SensorNotAccurate"), else the whole text; as the server's text
// is not to be trusted, only its printable characters, at most 80 of them.
std::string StatusNameOf(const std::string& sServerText);

}  // namespace cv
