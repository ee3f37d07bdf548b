#include "Tests/Process/DecodeFixture.h"

#include <QXmlStreamReader>

#include <set>

namespace ventrik
{

namespace
{

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

/// What a page holds, as an XML reader sees it.
struct Page {
    std::string problem; ///< empty where it is well-formed
    std::set<std::string> elements;
    std::vector<std::string> references; ///< what it would load or lead to
};

bool canLoad(const QXmlStreamAttribute& attribute)
{
    static const std::set<QString> names{"src", "href", "data", "action", "poster", "srcset"};
    return names.contains(attribute.name().toString()) ||
           (attribute.value().contains(QStringLiteral("url(")) &&
            !attribute.value().startsWith(QStringLiteral("url(#")));
}

Page pageOf(const std::string& text)
{
    Page page;
    QXmlStreamReader reader(QByteArray::fromStdString(text));
    while (!reader.atEnd()) {
        if (reader.readNext() != QXmlStreamReader::StartElement)
            continue;
        page.elements.insert(reader.name().toString().toStdString());
        for (const QXmlStreamAttribute& attribute : reader.attributes())
            if (canLoad(attribute))
                page.references.push_back(attribute.value().toString().toStdString());
    }
    page.problem = reader.errorString().toStdString();
    return page;
}

class DecodeReport : public DecodeFixture
{
  protected:
    /// A drive of the technology with the templates that are installed, as a report.
    Result reportOf(const std::string& technology, const std::string& count) const
    {
        const std::string capture = path(technology + ".pcap");
        finish(*start("ventrik-telephony",
                      {"--technology", technology, "--write", capture, "--count", count}));
        return finish(*start("ventrik-decode", {"--format", "html", capture}));
    }
};

class DecodeReportOf : public DecodeReport, public testing::WithParamInterface<const char*>
{
};

} // namespace

TEST_P(DecodeReportOf, IsOneWellFormedPageThatLoadsNothing)
{
    const Result result = reportOf(GetParam(), "1500");
    EXPECT_EQ(result.status, 0) << result.errors;
    const Page page = pageOf(result.output);
    EXPECT_THAT(page.problem, IsEmpty());
    EXPECT_THAT(page.references, IsEmpty());
    EXPECT_THAT(page.elements, Contains("svg"));
    EXPECT_THAT(page.elements, Not(Contains("script")));
    EXPECT_THAT(result.output, HasSubstr("<h2>Cells</h2>\n<div"));
    EXPECT_THAT(result.output, Not(HasSubstr("left out")));
}

INSTANTIATE_TEST_SUITE_P(Technologies, DecodeReportOf,
                         testing::Values("lte", "gsm", "utran", "c2k", "ifx"),
                         [](const auto& tested) { return std::string(tested.param); });

TEST_F(DecodeReport, TellsTimesInTheLocalZoneAndNamesIt)
{
    environment.insert("TZ", "<+05>-5:30");
    const Result result = decode(cellCapture(), {"--format", "html"});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(result.output, HasSubstr("<td>UTC+05:30</td>"));
}

TEST_F(DecodeReport, HasWhatCameBeforeDamageAndSaysSo)
{
    auto bytes = cellCapture().bytes();
    bytes.resize(bytes.size() - 3);
    const Result result = decode({"--format", "html", writeFile("cut.pcap", std::move(bytes))});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(pageOf(result.output).problem, IsEmpty());
    EXPECT_THAT(result.output, HasSubstr("<td>301</td>"));
    EXPECT_THAT(result.output, HasSubstr("<p class=\"warning\">" + path("cut.pcap") + ": "));
}

TEST_F(DecodeReport, IsOfOneCapture)
{
    const std::string capture = writeFile("a.pcap", cellCapture().bytes());
    const Result result = decode({"--format", "html", capture, capture});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.output, IsEmpty());
    EXPECT_THAT(result.complaints, ElementsAre(StartsWith("ventrik-decode: --format html goes "
                                                          "with one capture")));
}

} // namespace ventrik
