#include "PropertyList/PropertyListWriter.h"
#include "Tests/PropertyList/PlistText.h"
#include "Tests/Support/TemporaryFile.h"

#include <array>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <limits>
#include <numeric>

#include <gtest/gtest.h>

namespace ventrik
{

namespace
{

constexpr auto largest = std::numeric_limits<std::uint64_t>::max();
constexpr auto largestSigned = std::numeric_limits<std::int64_t>::max();
constexpr auto least = std::numeric_limits<std::int64_t>::min();

class ExchangedFile : public TemporaryFile
{
  public:
    using TemporaryFile::TemporaryFile;

    void write(std::string_view text) const { std::ofstream(path(), std::ios::binary) << text; }

    Bytes content() const
    {
        std::ifstream file(path(), std::ios::binary);
        return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    }
};

// Standard output of the bridge with those arguments.
std::string runBridge(const std::string& arguments)
{
    const std::string command =
        std::string(VENTRIK_PYTHON) + " \"" + VENTRIK_PYTHON_BRIDGE + "\" " + arguments;
    FILE* pipe = popen(command.c_str(), "r");
    if (pipe == nullptr)
        return "python did not start";
    std::string output;
    std::array<char, 4096> buffer{};
    while (const std::size_t count = std::fread(buffer.data(), 1, buffer.size(), pipe))
        output.append(buffer.data(), count);
    EXPECT_EQ(pclose(pipe), 0) << command;
    return output;
}

std::string dumpOf(const PlistValue& value, const std::string& name)
{
    const PropertyListWriting writing = writeXmlPropertyList(value);
    EXPECT_TRUE(writing) << writing.error;
    const ExchangedFile file(name);
    file.write(writing.text.value_or(""));
    return runBridge("dump \"" + file.path() + "\"");
}

// What the bridge writes in either form.
PlistDictionary expectedDocument()
{
    Bytes counting(100);
    std::iota(counting.begin(), counting.end(), std::uint8_t{0});
    return {{"Text", "tab\there\nline \xc3\xa9\xe2\x82\xac\xf0\x9f\x98\x80 <&>"},
            {"Numbers", PlistArray{0, -1, largestSigned, largest, least, 300, 70000}},
            {"Reals", PlistArray{0.1, -1.5, std::numeric_limits<double>::infinity()}},
            {"Flags", PlistArray{true, false}},
            {"Date", PlistDate{1794809428}},
            {"Early", PlistDate{-1}},
            {"Data", counting},
            {"Empty", PlistArray{PlistDictionary(), PlistArray(), "", Bytes()}},
            {"\xc3\xa9", "key"}};
}

void expectWritten(const PlistDictionary& expected, const std::string& form)
{
    const ExchangedFile file("ventrik-plistlib-" + form + ".plist");
    runBridge("write " + form + " \"" + file.path() + "\"");
    const PropertyListReading reading = readPropertyList(file.content());
    ASSERT_TRUE(reading) << reading.error;
    EXPECT_EQ(*reading.value, PlistValue(expected));
}

} // namespace

TEST(PythonInterchange, PythonReadsTextAsItWasWritten)
{
    EXPECT_EQ(
        dumpOf(PlistArray{"", " \t", "a\r\nb\rc\n", "\xc3\xa9<&>\"'", "]]>"}, "ventrik-text.plist"),
        "[\"\", \" \\t\", \"a\\r\\nb\\rc\\n\", \"\\u00e9<&>\\\"'\", \"]]>\"]\n");
}

TEST(PythonInterchange, PythonReadsNumbersAsTheyWereWritten)
{
    const double infinity = std::numeric_limits<double>::infinity();
    EXPECT_EQ(dumpOf(PlistArray{largestSigned, largest, least, 0.1, -0.0, 1e300, infinity,
                                -infinity, std::numeric_limits<double>::quiet_NaN(), true, false},
                     "ventrik-numbers.plist"),
              "[9223372036854775807, 18446744073709551615, -9223372036854775808, 0.1, -0.0, "
              "1e+300, Infinity, -Infinity, NaN, true, false]\n");
}

TEST(PythonInterchange, PythonReadsOtherKindsAsTheyWereWritten)
{
    const PlistDictionary value{{"b", PlistDate{951782401.75}},
                                {"a", Bytes(60, 0xff)},
                                {"\xc3\xa9", PlistArray{PlistDictionary(), PlistArray(), Bytes()}}};
    EXPECT_EQ(dumpOf(value, "ventrik-kinds.plist"),
              "{\"b\": {\"date\": \"2000-02-29T00:00:01\"}, \"a\": {\"data\": \"" +
                  repeated("f", 120) + "\"}, \"\\u00e9\": [{}, [], {\"data\": \"\"}]}\n");
}

TEST(PythonInterchange, PythonsXmlIsRead)
{
    expectWritten(expectedDocument(), "xml");
}

TEST(PythonInterchange, PythonsBinaryIsRead)
{
    PlistDictionary expected = expectedDocument();
    expected.set("Return", "a\r\nb\rc");
    expectWritten(expected, "binary");
}

} // namespace ventrik
