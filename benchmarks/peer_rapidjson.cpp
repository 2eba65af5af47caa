#include "benchmarks/contestant.h"
#include "benchmarks/plain.h"

#include <rapidjson/document.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>

#include <fstream>
#include <stdexcept>

namespace dcm::bench {
namespace {

BlockNumbers Read(const std::filesystem::path& path)
{
    const FileBytes file = ReadFile(path);
    rapidjson::Document document;
    document.Parse<rapidjson::kParseFullPrecisionFlag>(file.bytes.get(), file.size);
    if (document.HasParseError())
        throw std::runtime_error("not JSON: " + path.string());
    BlockNumbers blocks;
    for (const auto& block : document.GetArray()) {
        std::vector<double> numbers;
        for (const char* const key : {"x", "y", "values"}) {
            for (const auto& number : block[key].GetArray())
                numbers.push_back(number.GetDouble());
        }
        blocks.push_back(std::move(numbers));
    }
    return blocks;
}

void Write(const Data& data, const std::filesystem::path& path)
{
    rapidjson::StringBuffer text;
    rapidjson::Writer<rapidjson::StringBuffer> json(text);
    const auto writeText = [&](const char* key, const std::string& value) {
        json.Key(key);
        json.String(value.data(), static_cast<rapidjson::SizeType>(value.size()));
    };
    const auto writeNumbers = [&](const char* key, const std::vector<double>& numbers) {
        json.Key(key);
        json.StartArray();
        for (const double number : numbers)
            json.Double(number);
        json.EndArray();
    };
    json.StartArray();
    for (const Block& block : data.blocks) {
        json.StartObject();
        writeText("kind", block.keyword);
        writeText("name", block.name);
        writeText("langname", block.langname);
        writeText("function", block.function);
        writeText("unit_x", block.unitX);
        writeText("unit_y", block.unitY);
        writeText("unit_w", block.unitW);
        writeText("text", block.text);
        writeNumbers("x", block.x);
        writeNumbers("y", block.y);
        writeNumbers("values", block.values);
        json.EndObject();
    }
    json.EndArray();
    std::ofstream file(path, std::ios::binary);
    if (!file.write(text.GetString(), static_cast<std::streamsize>(text.GetSize())))
        throw std::runtime_error("cannot write " + path.string());
}

const TakesPart kRead("import/rapidjson", [](const Stage& stage) {
    return TimedRead([&] { return Read(stage.jsonFile); });
});

const TakesPart kWrite("export/rapidjson", [](const Stage& stage) {
    Outcome outcome;
    Timed(outcome.seconds, [&] { Write(stage.data, stage.outputFile); });
    return outcome;
});

} // namespace
} // namespace dcm::bench
