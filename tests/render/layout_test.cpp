// What the renderer reads before it draws: colours as styles write them and frame locations
// resolved against the page and against each other.
#include "render/Frames.h"
#include "render/Style.h"

#include <plotaid/ChartTransformer.h>

#include <grx/GrxModel.h>

#include <gtest/gtest.h>

namespace {

using namespace plotaid::render;

TEST(RenderInputs, ColoursReadAsStylesWriteThem) {
    const struct {
        const char* text;
        std::optional<Rgba> colour;
    } rows[] = {
        {"#3E58AC", Rgba{0x3E / 255.0, 0x58 / 255.0, 0xAC / 255.0, 1}},
        {"#f8c", Rgba{1, 0x88 / 255.0, 0xCC / 255.0, 1}},
        {"rgb(255, 0, 0)", Rgba{1, 0, 0, 1}},
        {"Navy", Rgba{0, 0, 0x80 / 255.0, 1}},
        {"transparent", Rgba{0, 0, 0, 0}},
        {"#12345", std::nullopt},
        {"#12345g", std::nullopt},
        {"rgb(300,0,0)", std::nullopt},
        {"chartreuse-ish", std::nullopt},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.text);
        EXPECT_EQ(parseColor(row.text), row.colour);
    }
}

TEST(RenderInputs, FramesResolveAgainstThePageAndTheirTargets) {
    auto frame = [](const char* id, const std::string& locations) {
        return std::string("<labelFrame id=\"") + id + "\">" + locations + "</labelFrame>";
    };
    auto at = [](const char* part, const char* method, const char* rest) {
        return std::string("<location part=\"") + part + "\" method=\"" + method + "\" " + rest + "/>";
    };
    const std::string chart =
        R"(<visualization xmlns="http://plotaid.org/grxml" id="v">)" +
        frame("a", at("left", "fixed", R"(value="10%")") + at("right", "fixed", R"(value="50%")") +
                       at("top", "fixed", R"(value="0%")") + at("height", "content", "")) +
        frame("b", at("top", "nextTo", R"(target="a")") + at("left", "sameEdge", R"(target="a")") +
                       at("height", "fixed", R"(value="20%")")) +
        frame("c", at("top", "sameEdge", R"(target="d")")) +
        frame("d", at("top", "sameEdge", R"(target="c")")) +
        frame("e", at("bottom", "fixed", R"(value="100%")") + at("height", "fixed", R"(value="5%")") +
                       at("right", "nextTo", R"(target="b")")) +
        "</visualization>";
    ChartTransformer transformer(chart);
    ASSERT_NE(transformer.getVisualization(), nullptr);
    const auto frames = framesOf(transformer.getVisualization()->getImplementation());
    ASSERT_EQ(frames.size(), 5u);
    const auto rects = layoutFrames(frames, Rect{0, 0, 640, 480}, 1, [](const Element*) {
        return TextSize{40, 10};
    });
    const struct {
        double x, y, w, h;
    } expected[] = {
        {64, 0, 256, 10},                    // fixed sides, content height
        {64, 10, 40, 96},                    // below a, its left edge, its own width
        {0, 0, 40, 10},                      // a cycle of targets falls back to the page
        {0, 0, 40, 10},   {24, 456, 40, 24}, // right against b's left, up from the bottom
    };
    for (std::size_t i = 0; i < frames.size(); ++i) {
        SCOPED_TRACE(i);
        const Rect r = rects.at(frames[i]);
        EXPECT_DOUBLE_EQ(r.x, expected[i].x);
        EXPECT_DOUBLE_EQ(r.y, expected[i].y);
        EXPECT_DOUBLE_EQ(r.w, expected[i].w);
        EXPECT_DOUBLE_EQ(r.h, expected[i].h);
    }
}

} // namespace
