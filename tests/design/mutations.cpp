// Changes small netlists at random, byte by byte and piece by piece, and reads them: each must give
// a design whose invariants hold, or a message, within the limit on items.
// usage: mutate_netlists COUNT [SEED]
// Exit status: 1 if a text is treated wrongly; the first one is printed on standard output.
#include <cstdio>
#include <cstdlib>
#include <random>

#include "design_check.h"

namespace {

const char* const kTexts[] = {
    R"({"creator":"x","modules":{"sub":{"attributes":{"blackbox":"0"},"ports":{"p":{"direction":"input",
"bits":[2,3]},"q":{"direction":"output","bits":[4]}},"cells":{"u":{"hide_name":0,"type":"LUT2",
"parameters":{"INIT":"0110"},"attributes":{},"connections":{"I0":[2],"I1":[3],"O":[4]}}},"netnames":{
"p":{"hide_name":0,"bits":[2,3]},"q":{"hide_name":1,"bits":[4],"offset":3,"upto":1}}},"top":{
"attributes":{"top":"1"},"ports":{"a":{"direction":"input","bits":[2,3]}},"cells":{"l":{"type":"$lut",
"parameters":{"LUT":"1x001010","WIDTH":"00000000000000000000000000000011"},"connections":{"A":[2,3,"1"],
"Y":[5]}},"s":{"type":"sub","connections":{"p":[5,"0"],"q":[6]}},"s2":{"type":"sub","connections":{"p":[
6,6],"q":[7]}},"f":{"type":"LUT6_2","parameters":{"INIT":"64'hcafe"},"connections":{"I0":[2],"I1":[3],
"I5":["x"],"O6":[8],"O5":[9]}},"r":{"type":"SRL16E","connections":{"D":[2]}}},"netnames":{"a":{"bits":[2,
3]},"\\b[1]":{"bits":[5,6]}}}}})",
    R"(.model top
.inputs a b c
.outputs y z
.names $undef
.names one
1
.names a b c n
11- 1
--1 1
.cname first
.attr BEL "X3"
.names n one y
0- 0
.names a z
1 1
.gate $lut A[0]=a A[1]=n A[2]=b Y=w
.param LUT 11001010
.param WIDTH 11
.subckt sub p=w q=k
.subckt CC_L2T4 I0=a I1=b I2=c I3=k O=m
.param INIT_L00 0x8
.param INIT_L01 4'b0110
.param INIT_L10 1110
.latch a q re c 2
.conn a e
.end
.model sub
.inputs p
.outputs q
.names p q
0 1
.end
)",
    R"((edif top (edifVersion 2 0 0)
 (external LIB (cell VCC (view V (interface (port P (direction OUTPUT)))))
  (cell (rename lut "$lut") (view V (interface (port (array A 3) (direction INPUT)) (port Y (direction OUTPUT)))))
  (cell LUT2 (view V (interface (port I0 (direction INPUT)) (port I1) (port O (direction OUTPUT))))))
 (library D (cell sub (view V (interface (port (array (rename p "p[1:0]") 2) (direction INPUT)) (port q))
   (contents (instance u (viewRef V (cellRef LUT2 (libraryRef LIB))) (property INIT (string "4'h6")))
    (net p0 (joined (portRef (member p 1)) (portRef I0 (instanceRef u))))
    (net q (joined (portRef q) (portRef O (instanceRef u)))))))
  (cell top (view V (interface (port a) (port y))
   (contents (instance vcc (viewRef V (cellRef VCC (libraryRef LIB))))
    (instance (rename &1s "1%34%s") (viewRef V (cellRef sub)))
    (instance g (viewRef V (cellRef lut (libraryRef LIB))) (property LUT (integer 8)) (property WIDTH (integer 2)))
    (net a (joined (portRef a) (portRef (member p 1) (instanceRef &1s)) (portRef (member A 0) (instanceRef g))))
    (net (rename n "n[0]") (joined (portRef q (instanceRef 1s)) (portRef (member A 1) (instanceRef g))))
    (net one (joined (portRef P (instanceRef vcc)) (portRef (member p 0) (instanceRef &1s))))
    (net out (joined (portRef y) (portRef Y (instanceRef g))))))))
 (design top (cellRef top (libraryRef D))))
)"};

typedef std::mt19937_64 Random;

size_t Below(Random& random, size_t end)
{
    return static_cast<size_t>(random() % end);
}

// Makes one change: a byte, a piece doubled, moved or left out, a number that is too large, or an
// early end.
void Mutate(std::string& text, Random& random)
{
    static const char* const kPieces[] = {"99999999999999999999",
                                          "-1",
                                          "4294967296",
                                          "{",
                                          "}",
                                          "[",
                                          "]",
                                          "(",
                                          ")",
                                          "\"",
                                          "\n",
                                          "\\",
                                          ",",
                                          ".end\n",
                                          "0",
                                          "x",
                                          "%",
                                          "#"};
    if (text.empty())
        text = " ";
    const size_t place = Below(random, text.size());
    const size_t length = std::min(text.size() - place, 1 + Below(random, 40));
    switch (Below(random, 7)) {
    case 0:
        text[place] = static_cast<char>(random() % 256);
        break;
    case 1:
        text.insert(place, kPieces[Below(random, sizeof kPieces / sizeof *kPieces)]);
        break;
    case 2:
        text.erase(place, length);
        break;
    case 3:
        text.insert(Below(random, text.size()), text.substr(place, length));
        break;
    case 4:
        text.replace(place, length, text.substr(Below(random, text.size()), length));
        break;
    case 5:
        text[place] = text[Below(random, text.size())];
        break;
    default:
        if (Below(random, 8) == 0)
            text.resize(place);
    }
}

} // namespace

int main(int argc, char** argv)
{
    const uint64_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 0;
    const uint64_t seed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1;
    if (count == 0) {
        std::fprintf(stderr, "usage: mutate_netlists COUNT [SEED]\n");
        return 2;
    }
    Random random(seed);
    booleq::ReadOptions options;
    options.maxItems = 10000;
    options.keyAttribute = "BEL";
    uint64_t numRead = 0;
    uint64_t numTables = 0;
    for (uint64_t file = 0; file < count; ++file) {
        std::string text = kTexts[file % 3];
        for (size_t changes = 1 + Below(random, 4); changes-- > 0;)
            Mutate(text, random);
        // A text that begins like Verilog would go to another program
        const size_t first = text.find_first_not_of(" \t\r\n");
        if (first != std::string::npos &&
            std::string("m/`(").find(text[first]) != std::string::npos &&
            text.compare(first, 5, "(edif") != 0)
            continue;
        booleq::Design design;
        std::string fault;
        const bool isRead = ReadDesignText(text, "file", options, design, fault);
        const std::string broken = isRead ? tests::BrokenInvariant(design)
                                   : fault.size() < 7 || !design.tables.empty()
                                       ? "refused without a message, or with a result"
                                       : "";
        if (!broken.empty()) {
            std::printf("%s (file %llu of seed %llu)\n%s\n", broken.c_str(),
                        static_cast<unsigned long long>(file),
                        static_cast<unsigned long long>(seed), text.c_str());
            return 1;
        }
        numRead += isRead;
        numTables += design.tables.size();
    }
    std::printf("%llu files, %llu of them read, with %llu tables\n",
                static_cast<unsigned long long>(count), static_cast<unsigned long long>(numRead),
                static_cast<unsigned long long>(numTables));
    return numRead != 0 && numRead != count ? 0 : 1;
}
