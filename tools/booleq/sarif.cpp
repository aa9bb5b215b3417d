#include "sarif.h"

#include <cassert>
#include <cerrno>
#include <utility>

#include "answer.h"
#include "text.h"

namespace booleq {

namespace {

constexpr char kSchema[] = "https://json.schemastore.org/sarif-2.1.0.json";

std::FILE* OpenToWrite(const std::string& name)
{
    std::FILE* const stream = std::fopen(name.c_str(), "wb");
    if (!stream)
        throw IoError("cannot write " + Visible(name), errno);
    return stream;
}

// A path as a URI reference: anything other than a letter, digit or "-._~/" is written as %XX.
std::string UriOf(const std::string& path)
{
    static constexpr char kDigits[] = "0123456789ABCDEF";
    std::string uri;
    for (const char character : path) {
        const bool isPlain = (character >= 'a' && character <= 'z') ||
                             (character >= 'A' && character <= 'Z') ||
                             (character >= '0' && character <= '9') ||
                             std::string("-._~/").find(character) != std::string::npos;
        const auto byte = static_cast<unsigned char>(character);
        if (isPlain)
            uri += character;
        else
            uri += std::string("%") + kDigits[byte >> 4] + kDigits[byte & 15];
    }
    return uri;
}

Json Log(const std::vector<SarifRule>& rules)
{
    Json driver;
    driver["name"] = "booleq";
    driver["version"] = BOOLEQ_VERSION;
    driver["rules"] = Json::array();
    for (const SarifRule& rule : rules)
        driver["rules"].push_back({{"id", rule.id},
                                   {"shortDescription", {{"text", rule.sentence}}},
                                   {"defaultConfiguration", {{"level", rule.level}}}});
    Json run;
    run["tool"]["driver"] = driver;
    run["columnKind"] = "utf16CodeUnits";
    run["results"] = Json::array();
    Json log;
    log["$schema"] = kSchema;
    log["version"] = "2.1.0";
    log["runs"] = Json::array({run});
    return log;
}

} // namespace

SarifFile::SarifFile(const std::string& file, std::vector<SarifRule> rules)
    : m_name(file), m_rules(std::move(rules)), m_stream(OpenToWrite(file)),
      m_output(m_stream, Visible(file))
{
    const std::string text = JsonLine(Log(m_rules)) + "\n";
    // Only the ends of the objects around them come after the results.
    const size_t middle = text.rfind("[]") + 1;
    assert(middle != 0);
    m_output.Put(text.substr(0, middle));
    m_tail = text.substr(middle);
}

SarifFile::~SarifFile()
{
    if (m_stream)
        std::fclose(m_stream);
}

void SarifFile::Put(const SarifResult& result)
{
    assert(result.rule < m_rules.size());
    const SarifRule& rule = m_rules[result.rule];
    Json location;
    location["physicalLocation"]["artifactLocation"]["uri"] = UriOf(result.file);
    if (result.line > 0)
        location["physicalLocation"]["region"]["startLine"] = result.line;
    location["logicalLocations"] =
        Json::array({{{"fullyQualifiedName", result.path}, {"kind", "element"}}});
    Json json;
    json["ruleId"] = rule.id;
    json["ruleIndex"] = result.rule;
    json["level"] = rule.level;
    json["message"]["text"] = result.path + ": " + result.message;
    json["locations"] = Json::array({location});
    m_output.Put((m_is_first ? "\n" : ",\n") + JsonLine(json));
    m_is_first = false;
}

void SarifFile::Finish()
{
    m_output.Put(m_tail);
    m_output.Flush();
    std::FILE* const stream = std::exchange(m_stream, nullptr);
    if (std::fclose(stream) != 0)
        throw IoError("cannot write " + Visible(m_name), errno);
}

} // namespace booleq
