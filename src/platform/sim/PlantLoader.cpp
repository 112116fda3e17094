#include "platform/sim/PlantLoader.h"

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "platform/sim/BuiltInPlantText.h"
#include "platform/sim/JsonDocument.h"
#include "platform/sim/PlantReader.h"

namespace cv::sim {

namespace {

constexpr std::streamoff kMaxFileBytes = 64 * 1024 * 1024;

// A plant with only this computer, for a built-in text that fails to load.
PlantPtr EmptyPlant() {
    auto plant = std::make_shared<PlantDescription>();
    plant->source = "built-in plant";
    ComputerSpec computer;
    computer.name = "LOCALHOST";
    computer.local = true;
    plant->computers.push_back(computer);
    return plant;
}

}  // namespace

ErrorInfo ParsePlant(std::string_view text, const std::string& source, PlantPtr& plant) {
    JsonDocument document;
    JsonDocument::SyntaxError syntax;
    if (!document.Parse(text, syntax)) {
        return {kErrPlantFile, source + ", line " + std::to_string(syntax.line) + ", column " +
                                   std::to_string(syntax.column) + ": " + syntax.problem};
    }
    auto description = std::make_shared<PlantDescription>();
    PlantReader reader(document, source);
    if (!reader.Read(*description)) {
        return {kErrPlantFile, reader.Error()};
    }
    plant = std::move(description);
    return {};
}

ErrorInfo LoadPlantFile(const std::string& path, PlantPtr& plant) {
    std::error_code ignored;
    if (std::filesystem::is_directory(path, ignored)) {
        return {kErrPlantFile, path + ": this is a folder, not a plant file"};
    }
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        return {kErrPlantFile, path + ": the file cannot be read (" + std::strerror(errno) + ")"};
    }
    file.seekg(0, std::ios::end);
    const std::streamoff size = file.tellg();
    file.seekg(0, std::ios::beg);
    if (size < 0 || size > kMaxFileBytes) {
        return {kErrPlantFile, path + ": the file is not a plant description (larger than " +
                                   std::to_string(kMaxFileBytes / (1024 * 1024)) + " MiB)"};
    }
    std::ostringstream text;
    text << file.rdbuf();
    return ParsePlant(text.str(), path, plant);
}

PlantPtr BuiltInPlant() {
    static const PlantPtr builtIn = [] {
        PlantPtr plant;
        return ParsePlant(BuiltInPlantText(), "built-in plant", plant) ? EmptyPlant() : plant;
    }();
    return builtIn;
}

std::optional<std::string> UserPlantFile(const std::vector<std::string>& arguments,
                                         const char* environmentValue) {
    for (size_t i = 0; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        if (argument == kPlantOption) {
            return i + 1 < arguments.size() ? arguments[i + 1] : std::string();
        }
        if (argument.size() > kPlantOption.size() && argument.starts_with(kPlantOption) &&
            argument[kPlantOption.size()] == '=') {
            return argument.substr(kPlantOption.size() + 1);
        }
    }
    if (environmentValue != nullptr && *environmentValue != '\0') {
        return std::string(environmentValue);
    }
    return std::nullopt;
}

PlantChoice ChoosePlant(const std::optional<std::string>& userFile) {
    if (!userFile) {
        return {BuiltInPlant(), {}};
    }
    PlantPtr plant;
    const ErrorInfo error = userFile->empty()
                                ? ErrorInfo{kErrPlantFile, "The option --plant needs a file name."}
                                : LoadPlantFile(*userFile, plant);
    if (error) {
        return {BuiltInPlant(), "The simulated plant cannot be read from the file named:\r\n" +
                                    error.Description +
                                    "\r\n\r\nThe program simulates its built-in plant instead."};
    }
    return {plant, {}};
}

}  // namespace cv::sim
