#include "histogram.h"

#include <algorithm>

#include "picture.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMargin = 20;
constexpr size_t kLine = 26; // from one bar to the next
constexpr size_t kBarHeight = 18;
constexpr size_t kBarLength = 320; // length of the longest
constexpr size_t kNumberWidth = 110;
constexpr size_t kMaxLabel = 60; // characters

std::string Label(const Bar& bar)
{
    const std::string label = Visible(bar.label);
    return label.size() <= kMaxLabel ? label : label.substr(0, kMaxLabel - 3) + "...";
}

size_t LabelWidth(const std::vector<Histogram>& histograms)
{
    size_t width = 0;
    for (const Histogram& histogram : histograms)
        for (const Bar& bar : histogram.bars)
            width = std::max(width, Width(Label(bar)) * kCharacterWidth);
    return width;
}

} // namespace

void PutHistograms(const std::vector<Histogram>& histograms, Output& output)
{
    const size_t left = kMargin + LabelWidth(histograms) + kCharacterWidth;
    size_t numLines = 0;
    for (const Histogram& histogram : histograms)
        numLines += histogram.bars.size() + 2;
    output.Put(SvgHead(left + kBarLength + kNumberWidth + kMargin, numLines * kLine + kMargin));
    size_t y = kMargin;
    for (const Histogram& histogram : histograms) {
        uint64_t most = 1;
        for (const Bar& bar : histogram.bars)
            most = std::max(most, bar.number);
        output.Put(SvgText(kMargin, y + kBarHeight - 4, "start", histogram.title));
        y += kLine;
        for (const Bar& bar : histogram.bars) {
            // A number that is not 0 is always visible.
            const auto length = static_cast<size_t>(static_cast<double>(bar.number) * kBarLength /
                                                    static_cast<double>(most));
            output.Put(SvgNote(left - kCharacterWidth, y + kBarHeight - 4, "end", Label(bar)));
            output.Put(SvgBox(left, y, std::max<size_t>(length, bar.number > 0 ? 1 : 0), kBarHeight,
                              true, ""));
            output.Put(SvgText(left + length + kCharacterWidth, y + kBarHeight - 4, "start",
                               std::to_string(bar.number)));
            y += kLine;
        }
        y += kLine;
    }
    output.Put(SvgTail());
}

} // namespace booleq
