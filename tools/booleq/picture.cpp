#include "picture.h"

namespace booleq {

namespace {

constexpr size_t kMaxInputs = 6;

std::string XmlText(const std::string& text)
{
    std::string xml;
    for (const char character : text) {
        if (character == '<')
            xml += "&lt;";
        else if (character == '>')
            xml += "&gt;";
        else if (character == '&')
            xml += "&amp;";
        else
            xml += character;
    }
    return xml;
}

std::string Attribute(const char* name, size_t value)
{
    return std::string(" ") + name + "=\"" + std::to_string(value) + "\"";
}

std::string TextElement(size_t x, size_t y, const std::string& attributes, const std::string& text)
{
    return "<text" + Attribute("x", x) + Attribute("y", y) + " " + attributes + ">" +
           XmlText(text) + "</text>\n";
}

} // namespace

bool HasPicture(const kq_logic::Function& function, const std::string& what, const Text& text,
                const Request& request, Output& output)
{
    if (function.NumInputs() > 0 && function.NumInputs() <= kMaxInputs)
        return true;
    Refuse(text, request, output,
           what + " has 1 to 6 inputs, and this equation has " +
               (function.NumInputs() == 0
                    ? "none: it is always " + std::string(function.At(0) ? "1" : "0")
                    : std::to_string(function.NumInputs())));
    return false;
}

std::string SvgHead(size_t width, size_t height)
{
    return "<svg xmlns=\"http://www.w3.org/2000/svg\"" + Attribute("width", width) +
           Attribute("height", height) + " font-family=\"monospace\" font-size=\"15\">\n" +
           "<rect width=\"100%\" height=\"100%\" fill=\"white\"/>\n";
}

std::string SvgTail()
{
    return "</svg>\n";
}

std::string SvgText(size_t x, size_t y, const char* anchor, const std::string& text)
{
    return TextElement(x, y, "text-anchor=\"" + std::string(anchor) + "\"", text);
}

std::string SvgNote(size_t x, size_t y, const char* anchor, const std::string& text)
{
    return TextElement(x, y, "text-anchor=\"" + std::string(anchor) + "\" fill=\"#666666\"", text);
}

std::string SvgBox(size_t x, size_t y, size_t width, size_t height, bool isOne,
                   const std::string& text)
{
    return "<rect" + Attribute("x", x) + Attribute("y", y) + Attribute("width", width) +
           Attribute("height", height) + " stroke=\"black\" fill=\"" +
           (isOne ? "#cde8ff" : "white") + "\"/>\n" +
           SvgText(x + width / 2, y + height / 2 + 5, "middle", text);
}

std::string SvgArrow(size_t x, size_t y, size_t toX, size_t toY, bool isOne)
{
    return "<path d=\"M" + std::to_string(x) + " " + std::to_string(y) + " H" +
           std::to_string(toX) + " V" + std::to_string(toY) + " m-4 -7 l4 7 l4 -7\" fill=\"none\"" +
           (isOne ? " stroke=\"#1f6fb2\" stroke-width=\"2\"/>\n" : " stroke=\"#aaaaaa\"/>\n");
}

} // namespace booleq
