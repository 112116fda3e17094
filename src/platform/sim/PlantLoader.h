#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

// Where the user names a plant file of their own: the command-line option
// (--plant FILE or --plant=FILE) or, without it, the environment variable.
inline constexpr std::string_view kPlantOption = "--plant";
inline constexpr const char* kPlantEnvironmentVariable = "CVOPCTESTCLIENT_PLANT";
// The error number of a plant file that cannot be read or used.
inline constexpr int32_t kErrPlantFile = 75;

using PlantPtr = std::shared_ptr<const PlantDescription>;

// Reads a plant from JSON text. On a fault the description names the source,
// the line (and column for bad syntax) and the problem; plant is untouched.
ErrorInfo ParsePlant(std::string_view text, const std::string& source, PlantPtr& plant);
ErrorInfo LoadPlantFile(const std::string& path, PlantPtr& plant);
// The plant shipped with the program (resources/sim/plant.json).
PlantPtr BuiltInPlant();

// The user's plant file from the program's arguments (without the program
// name) or, when they name none, from the environment variable's value
// (nullptr or empty: none).
std::optional<std::string> UserPlantFile(const std::vector<std::string>& arguments,
                                         const char* environmentValue);

struct PlantChoice {
    PlantPtr plant;       // never empty
    std::string message;  // why the user's file was not used; empty when it was or none was named
};

// The user's plant when there is one and it loads, else the built-in plant.
PlantChoice ChoosePlant(const std::optional<std::string>& userFile);

}  // namespace cv::sim
