#include "platform/sim/PlantLoader.h"

#include <gtest/gtest.h>

#include <set>

#include "platform/sim/BuiltInPlantText.h"
#include "platform/sim/QualityNames.h"
#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::sim {
namespace {

// A sound plant to break in one place at a time.
std::string Plant(const std::string& item = R"({ "name": "PV", "type": "R8" })",
                  const std::string& computers = R"([ { "name": "HERE", "local": true,
                  "servers": ["S.1"] } ])") {
    return "{\n"
           "  \"servers\": [ {\n"
           "    \"id\": \"S.1\",\n"
           "    \"namespace\": { \"items\": [\n"
           "      " +
           item +
           "\n"
           "    ] }\n"
           "  } ],\n"
           "  \"computers\": " +
           computers +
           "\n"
           "}\n";
}

std::string ErrorOf(const std::string& text) {
    PlantPtr plant;
    return ParsePlant(text, "mine.json", plant).Description;
}

TEST(PlantLoader, TheBuiltInPlantHoldsWhatTheProgramPromises) {
    PlantPtr plant;
    const ErrorInfo error = ParsePlant(BuiltInPlantText(), "built-in plant", plant);
    ASSERT_FALSE(error) << error.Description;
    EXPECT_EQ(plant->LocalComputer()->servers.size(), 6u);
    const ServerSpec& server = *plant->FindServer("Sim.Plant.1");
    std::set<uint16_t> types;
    std::set<uint16_t> qualities;
    for (const ItemSpec& item : server.items) {
        types.insert(item.type);
        qualities.insert(item.quality);
        for (const uint16_t quality : item.generator.qualities) {
            qualities.insert(quality);
        }
    }
    for (const uint16_t type : {VT_I2, VT_I4, VT_R4, VT_R8, VT_BOOL, VT_BSTR, VT_DATE}) {
        EXPECT_TRUE(types.count(type) && types.count(VT_ARRAY | type)) << type;
    }
    for (const QualityName& quality : QualityNames()) {
        EXPECT_TRUE(qualities.count(quality.quality)) << quality.name;
    }
    EXPECT_EQ(server.FindItem("Special.TextWithNul")->value.AsStr(),
              std::string("before\0after", 12));
    EXPECT_TRUE(server.FindItem("Types.Arrays.Empty")->value.Elements().empty());
    EXPECT_EQ(BuiltInPlant()->servers.size(), plant->servers.size());
}

TEST(PlantLoader, AFaultNamesTheFileTheLineAndTheProblem) {
    struct Case {
        std::string text;
        std::string message;
    };
    const std::vector<Case> cases = {
        {"",
         "mine.json, line 1, column 1: syntax error while parsing value - unexpected end of "
         "input; expected '[', '{', or a literal"},
        {"{\n  \"servers\": [\n    { \"id\": \"S\" }\n    { \"id\": \"T\" }\n",
         "mine.json, line 4, column 5: syntax error while parsing array - unexpected '{'; "
         "expected ']'"},
        {"{ \"servers\": [],\n  \"servers\": [] }",
         "mine.json, line 2, column 11: the key \"servers\" appears twice in one object"},
        {std::string(100, '[') + std::string(100, ']'),
         "mine.json, line 1, column 65: values nest deeper than 64 levels"},
        {Plant(R"({ "name": "PV", "type": "R16" })"),
         "mine.json, line 5: servers[0].namespace.items[0].type: unknown type \"R16\"; use I2, "
         "I4, R4, R8, BOOL, BSTR or DATE, with [] after it for an array"},
        {Plant(R"({ "name": "PV", "tyep": "R8" })"),
         "mine.json, line 5: servers[0].namespace.items[0].tyep: unknown key \"tyep\"; this "
         "object knows name, type, value, size, quality, writable, generator, accessPaths, "
         "pathRequired"},
        {Plant(R"({ "name": "PV", "type": "R8" }, { "name": "pv", "type": "I2" })"),
         "mine.json, line 5: servers[0].namespace.items[1].name: the item \"pv\" appears twice "
         "in this branch"},
        {Plant(R"({ "name": "PV", "type": "R8", "generator": { "kind": "saw" } })"),
         "mine.json, line 5: servers[0].namespace.items[0].generator.kind: unknown generator "
         "\"saw\"; use constant, ramp, sine, random, square or step"},
        {Plant(R"({ "name": "PV", "type": "I2", "value": 40000 })"),
         "mine.json, line 5: servers[0].namespace.items[0].value: needs a whole number that fits "
         "I2 (-32768 to 32767)"},
        {Plant(R"({ "name": "D", "type": "DATE[]", "value": ["2024-02-29", "2023-02-29"] })"),
         "mine.json, line 5: servers[0].namespace.items[0].value[1]: needs a date from "
         "0100-01-01 to 9999-12-31, as \"YYYY-MM-DD\", \"YYYY-MM-DD hh:mm:ss\" or a day number"},
        {Plant(R"({ "name": "P V", "type": "R8" })"),
         "mine.json, line 5: servers[0].namespace.items[0].name: \"P V\" is not a usable name: "
         "it needs printable characters, without blanks or dots"},
        {Plant(R"({ "name": "PV", "type": "R8", "quality": "fine" })"),
         "mine.json, line 5: servers[0].namespace.items[0].quality: unknown quality \"fine\"; "
         "use a number from 0 to 65535 or one of " +
             QualityNameList()},
        {Plant(R"({ "name": "PV", "type": "R8[]", "generator": { "kind": "sine" } })"),
         "mine.json, line 5: servers[0].namespace.items[0].generator.kind: an array item can only "
         "be constant"},
        {Plant(R"({ "name": "PV", "type": "R8" })", R"([ { "name": "HERE", "local": true,
                  "servers": ["S.2"] } ])"),
         "mine.json, line 9: computers[0].servers[0]: no server is called \"S.2\" in \"servers\""},
        {Plant(R"({ "name": "PV", "type": "R8" })", "[]"),
         "mine.json, line 8: computers: no computer is marked \"local\": true (this computer)"},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(ErrorOf(c.text), c.message) << c.text;
    }
}

TEST(PlantLoader, TheUsersFileComesFromTheOptionElseTheEnvironment) {
    using Args = std::vector<std::string>;
    EXPECT_EQ(UserPlantFile(Args{"--plant", "a.json"}, "b.json"), "a.json");
    EXPECT_EQ(UserPlantFile(Args{"-x", "--plant=c.json"}, nullptr), "c.json");
    EXPECT_EQ(UserPlantFile(Args{"--plant"}, nullptr), "");
    EXPECT_EQ(UserPlantFile(Args{"--plants=x"}, "b.json"), "b.json");
    EXPECT_EQ(UserPlantFile(Args{}, ""), std::nullopt);
}

TEST(PlantLoader, ABrokenOrMissingFileFallsBackToTheBuiltInPlantWithAMessage) {
    test::TempFolder folder;
    const std::string sound = folder.File("sound.json");
    const std::string broken = folder.File("broken.json");
    test::Spill(sound, Plant());
    test::Spill(broken, Plant(R"({ "name": "PV", "type": "R16" })"));

    const PlantChoice mine = ChoosePlant(sound);
    EXPECT_EQ(mine.message, "");
    EXPECT_EQ(mine.plant->source, sound);
    EXPECT_NE(mine.plant->FindServer("S.1"), nullptr);

    const PlantChoice fallback = ChoosePlant(broken);
    EXPECT_EQ(fallback.plant, BuiltInPlant());
    EXPECT_NE(fallback.message.find(broken + ", line 5: servers[0]"), std::string::npos)
        << fallback.message;

    for (const std::string& path : {folder.File("missing.json"), folder.Path()}) {
        const PlantChoice none = ChoosePlant(path);
        EXPECT_EQ(none.plant, BuiltInPlant());
        EXPECT_NE(none.message.find(path + ": "), std::string::npos) << none.message;
    }
    EXPECT_EQ(ChoosePlant(std::nullopt).message, "");
}

}  // namespace
}  // namespace cv::sim

namespace cv::sim {
namespace {

std::string WithDde(const std::string& apps) {
    std::string text = Plant();
    return text.substr(0, text.rfind('}')) + ", \"ddeApplications\": " + apps + "\n}\n";
}

TEST(PlantLoader, DdeApplicationsAreCheckedLikeTheRest) {
    struct Case {
        std::string apps;
        std::string problem;  // empty: loads
    };
    const std::vector<Case> cases = {
        {R"([ { "name": "PLC", "topics": [ { "name": "T", "items": { "A": "1" } } ] } ])", ""},
        {R"([ { "name": "PLC", "answers": "sometimes" } ])",
         "ddeApplications[0].answers: needs \"always\", \"never\" or \"late\""},
        {R"([ { "name": "PLC", "topics": [ { "name": "T", "items": { "A": 1 } } ] } ])",
         "ddeApplications[0].topics[0].items.A: needs a text in double quotes"},
        {R"([ { "name": "PLC" }, { "name": "PLC" } ])",
         "ddeApplications[1].name: \"PLC\" appears twice"},
        {R"([ { "name": "PLC", "port": 5 } ])", "ddeApplications[0].port: unknown key"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.apps);
        const std::string error = ErrorOf(WithDde(c.apps));
        if (c.problem.empty()) {
            EXPECT_EQ(error, "");
        } else {
            EXPECT_NE(error.find(c.problem), std::string::npos) << error;
        }
    }
}

TEST(PlantLoader, TheBuiltInPlantHasEveryKindOfDdeApplication) {
    PlantPtr plant;
    ASSERT_FALSE(ParsePlant(BuiltInPlantText(), "plant.json", plant));
    std::set<DdeAnswer> answers;
    for (const DdeAppSpec& app : plant->ddeApps) {
        answers.insert(app.answer);
    }
    EXPECT_EQ(answers.size(), 3u);
}

}  // namespace
}  // namespace cv::sim
