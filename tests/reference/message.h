// The messages that the library must issue according to the model, in order, and the process-wide
// debug switch. A message of the engine or the facade has the line kAnyLine, because its line is
// that of the issuing statement. The node module has fixed line numbers.
#ifndef REFERENCE_MESSAGE_H
#define REFERENCE_MESSAGE_H

#include <string>
#include <vector>

namespace reference {

const int kAnyLine = -1;

enum class Module { Engine, Facade, Node };

struct Message {
    const char* id;
    const char* file;
    int line;
    const char* revision;
    std::string text;
    // Part of a dump of a node that the library may choose freely.
    bool isFree;
};

// All messages so far; a test empties it before it starts.
std::vector<Message>& Log();

bool DebugMode();
void SetDebugMode(bool on);

// Appends a message; 'text' ends at its first NUL, as a printf argument does.
void Emit(Module module, int line, const std::string& text);

// The source path of the node module, which its evaluation trace also prints.
const char* NodeModulePath();

// The printf formats in use: %s, %d, %2d (any width), %-16s (any width), %03d.
std::string CText(const std::string& text);
std::string Decimal(unsigned int value);
std::string PadLeft(const std::string& text, size_t width);
std::string PadRight(const std::string& text, size_t width);
std::string ThreeDigits(size_t value);

} // namespace reference

#endif
