#include "render/Frames.h"

#include <algorithm>
#include <cmath>
#include <set>

namespace plotaid::render {

namespace {

const std::set<std::string> kFrameNames = {"labelFrame",        "graph",        "legend",
                                           "container",         "textFrame",    "key",
                                           "statisticsSummary", "controlFrame", "imageFrame"};

enum Part { Left, Right, Top, Bottom, Width, Height, Parts };

int partOf(const std::string& word) {
    static const char* const kWords[] = {"left", "right", "top", "bottom", "width", "height"};
    for (int i = 0; i < Parts; ++i)
        if (word == kWords[i])
            return i;
    return -1;
}

struct Box {
    double v[Parts];
    bool known[Parts] = {};
};

} // namespace

bool isFrame(const Element* e) {
    return e != nullptr && kFrameNames.count(nameOf(e)) != 0;
}

std::vector<const Element*> framesOf(const Element* root) {
    std::vector<const Element*> out;
    std::vector<const Element*> todo = children(root);
    for (std::size_t i = 0; i < todo.size(); ++i) {
        if (!isFrame(todo[i]))
            continue;
        out.push_back(todo[i]);
        if (nameOf(todo[i]) == "container")
            for (const Element* c : children(todo[i]))
                todo.push_back(c);
    }
    return out;
}

std::map<const Element*, Rect> layoutFrames(const std::vector<const Element*>& frames, const Rect& page,
                                            double unit, const Measure& measure) {
    std::map<const Element*, Box> boxes;
    for (const Element* f : frames)
        boxes[f];
    auto edgeOf = [&](const Element* target, int part, double& out) {
        auto it = boxes.find(target);
        if (it == boxes.end() || !it->second.known[part])
            return false;
        out = it->second.v[part];
        return true;
    };
    auto size = [&](const Element* f) -> TextSize {
        TextSize s = measure ? measure(f) : TextSize{};
        return s;
    };
    std::map<const Element*, TextSize> measured;
    // Each pass settles what its targets allow. A chain of attachments settles one frame per pass,
    // so a hostile chart with thousands of chained frames would cost passes times frames; no real
    // layout chains more than a few, and what stays open falls back to the page.
    const std::size_t passes = std::min<std::size_t>(frames.size() + 1, 64);
    for (std::size_t pass = 0; pass < passes; ++pass) {
        bool progress = false;
        for (const Element* f : frames) {
            Box& b = boxes[f];
            for (const Element* loc : children(f, "location")) {
                const int part = partOf(attr(loc, "part"));
                if (part < 0 || b.known[part])
                    continue;
                const std::string method = attr(loc, "method");
                const bool horizontal = part == Left || part == Right || part == Width;
                const double extent = horizontal ? page.w : page.h;
                const double origin = horizontal ? page.x : page.y;
                double value = 0;
                bool set = false;
                if (method == "fixed") {
                    Length l;
                    if (parseLength(attr(loc, "value"), l)) {
                        const double amount = l.percent ? l.value / 100 * extent : l.value * unit;
                        value = part == Width || part == Height ? amount : origin + amount;
                        set = true;
                    }
                } else if (method == "content") {
                    if (part == Width || part == Height) {
                        auto m = measured.find(f);
                        if (m == measured.end())
                            m = measured.emplace(f, size(f)).first;
                        value = part == Width ? m->second.w : m->second.h;
                        set = true;
                    }
                } else if (method == "sameEdge" || method == "nextTo") {
                    const Element* target = byId(f, attr(loc, "target"));
                    int from = part;
                    if (method == "nextTo")
                        from = part == Left     ? Right
                               : part == Right  ? Left
                               : part == Top    ? Bottom
                               : part == Bottom ? Top
                                                : -1;
                    if (from >= 0 && from < Width && target)
                        set = edgeOf(target, from, value);
                    Length gap;
                    if (set && method == "nextTo" && parseLength(attr(loc, "value"), gap))
                        value += (part == Left || part == Top ? 1 : -1) *
                                 (gap.percent ? gap.value / 100 * extent : gap.value * unit);
                }
                if (set && std::isfinite(value)) {
                    b.v[part] = value;
                    b.known[part] = true;
                    progress = true;
                }
            }
            // Two of an axis's three parts give the third.
            for (int axis = 0; axis < 2; ++axis) {
                const int lo = axis ? Top : Left, hi = axis ? Bottom : Right, ext = axis ? Height : Width;
                if (b.known[lo] && b.known[hi] && !b.known[ext]) {
                    b.v[ext] = b.v[hi] - b.v[lo];
                    b.known[ext] = progress = true;
                } else if (b.known[lo] && b.known[ext] && !b.known[hi]) {
                    b.v[hi] = b.v[lo] + b.v[ext];
                    b.known[hi] = progress = true;
                } else if (b.known[hi] && b.known[ext] && !b.known[lo]) {
                    b.v[lo] = b.v[hi] - b.v[ext];
                    b.known[lo] = progress = true;
                }
            }
        }
        if (!progress)
            break;
    }
    std::map<const Element*, Rect> out;
    for (const Element* f : frames) {
        Box& b = boxes[f];
        const TextSize natural = measured.count(f) ? measured[f] : size(f);
        double x0 = b.known[Left] ? b.v[Left] : page.x;
        double y0 = b.known[Top] ? b.v[Top] : page.y;
        double x1 = b.known[Right] ? b.v[Right] : b.known[Width] ? x0 + b.v[Width] : x0 + natural.w;
        double y1 = b.known[Bottom] ? b.v[Bottom] : b.known[Height] ? y0 + b.v[Height] : y0 + natural.h;
        if (!b.known[Left] && b.known[Right])
            x0 = x1 - (b.known[Width] ? b.v[Width] : natural.w);
        if (!b.known[Top] && b.known[Bottom])
            y0 = y1 - (b.known[Height] ? b.v[Height] : natural.h);
        if (x1 < x0)
            std::swap(x0, x1);
        if (y1 < y0)
            std::swap(y0, y1);
        out[f] = Rect{x0, y0, x1 - x0, y1 - y0};
    }
    return out;
}

} // namespace plotaid::render
