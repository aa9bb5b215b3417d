// The model's message log and the few printf conversions that the dumps need.
#include "reference/message.h"

namespace reference {

namespace {

const char* const kMessageId = "Kq";
const char* const kEnginePath = "../s/Kq_BoolEquationImp.cpp";
const char* const kFacadePath = "../s/Kq_BoolEquation.cpp";
const char* const kNodePath = "../s/Kq_BoolEquationImpNode.cpp";
const char* const kEngineRevision = "$Revision: 1.35 $";
const char* const kFacadeRevision = "$Revision: 1.10 $";
const char* const kNodeRevision = "$Revision: 1.10 $";

bool g_debug_mode = false;

} // namespace

std::vector<Message>& Log()
{
    static std::vector<Message> log;
    return log;
}

bool DebugMode()
{
    return g_debug_mode;
}

void SetDebugMode(bool on)
{
    g_debug_mode = on;
}

void Emit(Module module, int line, const std::string& text)
{
    const char* path = kEnginePath;
    const char* revision = kEngineRevision;
    if (module == Module::Facade) {
        path = kFacadePath;
        revision = kFacadeRevision;
    } else if (module == Module::Node) {
        path = kNodePath;
        revision = kNodeRevision;
    }
    Log().push_back(Message{kMessageId, path, line, revision, text, false});
}

const char* NodeModulePath()
{
    return kNodePath;
}

std::string CText(const std::string& text)
{
    return text.substr(0, text.find('\0'));
}

std::string Decimal(unsigned int value)
{
    // printf reads the 32 bits as a signed number.
    return std::to_string(static_cast<int>(value));
}

std::string PadLeft(const std::string& text, size_t width)
{
    return text.size() < width ? std::string(width - text.size(), ' ') + text : text;
}

std::string PadRight(const std::string& text, size_t width)
{
    return text.size() < width ? text + std::string(width - text.size(), ' ') : text;
}

std::string ThreeDigits(size_t value)
{
    const std::string digits = std::to_string(value);
    return digits.size() < 3 ? std::string(3 - digits.size(), '0') + digits : digits;
}

} // namespace reference
