#include "Charts/SvgCanvas.h"

#include <QString>
#include <QXmlStreamReader>

#include <gmock/gmock.h>

#include <array>
#include <cmath>

namespace ventrik
{

namespace
{

using testing::HasSubstr;

// What is wrong with the document, and nothing where it is well-formed.
std::string problemOf(const std::string& document)
{
    QXmlStreamReader reader(QByteArray::fromStdString(document));
    while (!reader.atEnd())
        reader.readNext();
    return reader.errorString().toStdString();
}

class SvgCanvasTest : public testing::Test
{
  protected:
    SvgCanvas canvas{300, 200.5};
};

} // namespace

TEST_F(SvgCanvasTest, ADocumentStandsByItself)
{
    EXPECT_EQ(canvas.document(),
              "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"300\" height=\"200.5\" "
              "viewBox=\"0 0 300 200.5\" font-family=\"sans-serif\" role=\"img\">\n</svg>\n");
}

TEST_F(SvgCanvasTest, TextsAreEscaped)
{
    canvas.text({10, 20}, "<&\" \x01\xff>", {.color = rgb(0x102030), .size = 11});
    EXPECT_THAT(canvas.document(),
                HasSubstr("<text x=\"10\" y=\"20\" font-size=\"11\" "
                          "fill=\"#102030\">&lt;&amp;\" \uFFFD\uFFFD&gt;</text>"));
    EXPECT_EQ(problemOf(canvas.document()), "");
}

TEST_F(SvgCanvasTest, TheTitleIsEscapedToo)
{
    const SvgCanvas titled(10, 10, "a<b");
    EXPECT_THAT(titled.document(), HasSubstr("<title>a&lt;b</title>"));
    EXPECT_EQ(problemOf(titled.document()), "");
}

TEST_F(SvgCanvasTest, NumbersHaveAtMostTwoDecimals)
{
    canvas.line({1.0 / 3, -0.001}, {2, NAN}, {rgb(0)});
    EXPECT_THAT(canvas.document(),
                HasSubstr("<line x1=\"0.33\" y1=\"0\" x2=\"2\" y2=\"0\" stroke=\"#000000\"/>"));
}

TEST_F(SvgCanvasTest, StrokesHaveWidthDashesAndOpacity)
{
    const std::array points{Point{1, 2}, Point{3, 4.5}};
    canvas.polyline(points, {{255, 0, 0, 51}, 2, Dash::Dashed});
    EXPECT_THAT(canvas.document(),
                HasSubstr("<polyline fill=\"none\" stroke=\"#ff0000\" stroke-opacity=\"0.2\" "
                          "stroke-width=\"2\" stroke-dasharray=\"10 6\" points=\"1,2 3,4.5\"/>"));
}

TEST_F(SvgCanvasTest, TextsAreAnchoredAndTurned)
{
    canvas.text({5, 6}, "dBm",
                {.size = 10, .anchor = Anchor::Middle, .isBold = true, .rotation = -90});
    EXPECT_THAT(canvas.document(), HasSubstr("text-anchor=\"middle\" font-weight=\"bold\" "
                                             "transform=\"rotate(-90 5 6)\">dBm</text>"));
}

TEST_F(SvgCanvasTest, AClipIsNamedByItsPlace)
{
    canvas.pushClip({1, 2, 3, 4});
    canvas.fillRect({0, 0, 9, 9}, rgb(0xffffff));
    EXPECT_EQ(problemOf(canvas.document()), "") << "a clip that is open ends with the document";
    canvas.popClip();
    canvas.popClip();
    EXPECT_EQ(problemOf(canvas.document()), "");
    EXPECT_THAT(canvas.document(),
                HasSubstr("<clipPath id=\"clip-1-2-3-4\"><rect x=\"1\" y=\"2\" width=\"3\" "
                          "height=\"4\"/></clipPath>\n<g clip-path=\"url(#clip-1-2-3-4)\">"));
}

} // namespace ventrik
