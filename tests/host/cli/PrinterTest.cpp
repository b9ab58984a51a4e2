// What people and programs are shown of instances, paths and single values.
#include "host/cli/Printer.h"

#include <gmock/gmock.h>
#include <stdlib.h>
#include <time.h>

#include <cmath>
#include <sstream>

#include "host/cli/ValueText.h"
#include "host/mof/MofParser.h"

namespace {

using namespace cmpihost;

const Schema& schema() {
    static const Schema instance = [] {
        Schema loaded;
        loaded.add(mof::parse(
            "class Machine { [Key] string Name;"
            " [ValueMap{\"0\", \"2\", \"36\", \"..\"}, Values{\"None\", \"OK\", \"LINUX\", "
            "\"Rest\"}] uint16 Kind; "
            "[ValueMap{\"2\", \"11\"}, Values{\"OK\", \"In Service\"}] uint16 States[];"
            "[ValueMap{\"-1\"}, Values{\"Below\"}] sint8 Level;"
            "[Units(\"KiloBytes\")] uint64 Memory; [Units(\"KiloBytes\")] uint64 Small; };"
            "class Part { [PUnit(\"meter * 10^-3\"), ValueMap{\"3\"}, Values{\"Wide\"}]"
            " uint8 Size; };",
            "x.mof"));
        return loaded;
    }();
    return instance;
}

ObjectPathValue machinePath() {
    return {"root/cimv2", "Machine", {{"Name", Value("m\"1")}}};
}

/// One property of every kind.
InstanceValue machine() {
    InstanceValue inner{{"", "Part", {}}, {{"Size", Value::fromUnsigned(3, CMPI_uint8)}}};
    return {machinePath(),
            {{"Name", Value("m\"1")},
             {"Kind", Value::fromUnsigned(36, CMPI_uint16)},
             {"States", Value::fromArray(CMPI_uint16, {Value::fromUnsigned(2, CMPI_uint16),
                                                       Value::fromUnsigned(11, CMPI_uint16),
                                                       Value::null(CMPI_uint16)})},
             {"Level", Value::fromSigned(-1, CMPI_sint8)},
             {"Memory", Value::fromUnsigned(8123456)},
             {"Small", Value::fromUnsigned(1000)},
             {"Largest", Value::fromUnsigned(18446744073709551615U)},
             {"Least", Value::fromSigned(INT64_MIN)},
             {"Started", Value::fromText("20240102030405.000000+000", CMPI_dateTime)},
             {"Spans", Value::fromArray(CMPI_dateTime, {Value::fromText("00000003040506.000000:000",
                                                                        CMPI_dateTime),
                                                        Value::null(CMPI_dateTime)})},
             {"Opened", Value::fromText("2024**********.******+000", CMPI_dateTime)},
             {"Empty", Value("")},
             {"Unset", Value::null(CMPI_string)},
             {"Raw", Value("a\n\x1b[31m\xFF")},
             {"Notes", Value::fromArray(CMPI_string, {Value("one, two"), Value("")})},
             {"NoNotes", Value::fromArray(CMPI_string, std::vector<Value>())},
             {"On", Value::fromBoolean(true)},
             {"Ratio", Value::fromReal(static_cast<double>(0.1F), CMPI_real32)},
             {"Whole", Value::fromReal(3, CMPI_real64)},
             {"Letter", Value::fromUnsigned(0xE9, CMPI_char16)},
             {"Other", Value::fromReference({"a/b", "Machine", {{"Name", Value("x")}}})},
             {"Part", Value::fromInstance(inner)}}};
}

std::string printed(Format format, const std::vector<InstanceValue>& instances,
                    const Terminal& terminal = {}) {
    std::ostringstream stream;
    makePrinter(format, stream, schema(), terminal)->print(instances);
    return stream.str();
}

std::string printed(Format format, const std::vector<ObjectPathValue>& paths) {
    std::ostringstream stream;
    makePrinter(format, stream, schema(), {})->print(paths);
    return stream.str();
}

class Printers : public testing::Test {
  protected:
    void SetUp() override { setZone("UTC0"); }
    void TearDown() override { setZone("UTC0"); }
    static void setZone(const char* zone) {
        setenv("TZ", zone, 1);
        tzset();
    }
};

TEST_F(Printers, ShowAnInstanceAsATable) {
    EXPECT_EQ(printed(Format::Table, std::vector{machine()}),
              "root/cimv2:Machine.Name=\"m\\\"1\"\n"
              "  Name     m\"1\n"
              "  Kind     36 (LINUX)\n"
              "  States   2 (OK), 11 (In Service), NULL\n"
              "  Level    -1 (Below)\n"
              "  Memory   8123456 (7.7 GiB)\n"
              "  Small    1000\n"
              "  Largest  18446744073709551615\n"
              "  Least    -9223372036854775808\n"
              "  Started  20240102030405.000000+000 (2024-01-02 03:04:05 +00:00)\n"
              "  Spans    00000003040506.000000:000 (3 days 04:05:06), NULL\n"
              "  Opened   2024**********.******+000\n"
              "  Empty    \"\"\n"
              "  Unset    NULL\n"
              "  Raw      a\\n\\x1b[31m\\xff\n"
              "  Notes    \"one, two\", \"\"\n"
              "  NoNotes  {}\n"
              "  On       TRUE\n"
              "  Ratio    0.1\n"
              "  Whole    3\n"
              "  Letter   \xC3\xA9\n"
              "  Other    a/b:Machine.Name=\"x\"\n"
              "  Part     instance of Part\n");
}

TEST_F(Printers, BreakLongTextsForTheTerminalButNoPaths) {
    const Value other = Value::fromReference({"a/b", "Machine", {{"Name", Value("x y z x y z")}}});
    const InstanceValue wide{
        machinePath(),
        {{"Text", Value("caf\u00e9 one two three four five")},
         {"Words",
          Value::fromArray(CMPI_string, {Value("one, two"), Value("three"), Value("four, five")})},
         {"Other", other},
         {"All", Value::fromArray(CMPI_ref, {other})}}};
    EXPECT_EQ(printed(Format::Table, std::vector{wide}, {32, false}),
              "root/cimv2:Machine.Name=\"m\\\"1\"\n"
              "  Text   caf\\u00e9 one two three\n"
              "         four five\n"
              "  Words  \"one, two\", \"three\",\n"
              "         \"four, five\"\n"
              "  Other  a/b:Machine.Name=\"x y z x y z\"\n"
              "  All    a/b:Machine.Name=\"x y z x y z\"\n");
}

TEST_F(Printers, ShowSizesAndNamesFromTheirBoundsOn) {
    InstanceValue machine{machinePath(), {}};
    const auto shown = [&](const char* name, std::uint64_t number) {
        machine.properties = {{name, Value::fromUnsigned(number)}};
        const std::string text = printed(Format::Table, std::vector{machine});
        return text.substr(text.find("\n  ") + 3);
    };
    EXPECT_EQ(shown("Memory", 1023), "Memory  1023\n");
    EXPECT_EQ(shown("Memory", 1024), "Memory  1024 (1.0 MiB)\n");
    EXPECT_EQ(shown("Kind", INT64_MAX), "Kind  9223372036854775807 (Rest)\n");
    EXPECT_EQ(shown("Kind", std::uint64_t{INT64_MAX} + 1), "Kind  9223372036854775808\n");
}

TEST_F(Printers, ShowAnInstanceAsMof) {
    EXPECT_EQ(printed(Format::Mof, std::vector{machine()}),
              "instance of Machine {\n"
              "    Name = \"m\\\"1\";\n"
              "    Kind = 36;\n"
              "    States = {2, 11, NULL};\n"
              "    Level = -1;\n"
              "    Memory = 8123456;\n"
              "    Small = 1000;\n"
              "    Largest = 18446744073709551615;\n"
              "    Least = -9223372036854775808;\n"
              "    Started = \"20240102030405.000000+000\";\n"
              "    Spans = {\"00000003040506.000000:000\", NULL};\n"
              "    Opened = \"2024**********.******+000\";\n"
              "    Empty = \"\";\n"
              "    Unset = NULL;\n"
              "    Raw = \"a\\n\\x001B[31m\xEF\xBF\xBD\";\n"
              "    Notes = {\"one, two\", \"\"};\n"
              "    NoNotes = {};\n"
              "    On = TRUE;\n"
              "    Ratio = 0.1;\n"
              "    Whole = 3.0;\n"
              "    Letter = '\\x00E9';\n"
              "    Other = \"a/b:Machine.Name=\\\"x\\\"\";\n"
              "    Part = \"instance of Part {\\n    Size = 3;\\n};\\n\";\n"
              "};\n");
}

TEST_F(Printers, WriteMofThatTheReaderTakes) {
    EXPECT_NO_THROW(mof::parse(printed(Format::Mof, std::vector{machine(), machine()}), "x.mof"));
}

TEST_F(Printers, ShowAnInstanceAsJson) {
    EXPECT_EQ(printed(Format::Json, std::vector{machine()}), R"json([
  {
    "class": "Machine",
    "path": "root/cimv2:Machine.Name=\"m\\\"1\"",
    "keys": {
      "Name": "m\"1"
    },
    "properties": {
      "Name": "m\"1",
      "Kind": 36,
      "States": [
        2,
        11,
        null
      ],
      "Level": -1,
      "Memory": 8123456,
      "Small": 1000,
      "Largest": 18446744073709551615,
      "Least": -9223372036854775808,
      "Started": "20240102030405.000000+000",
      "Spans": [
        "00000003040506.000000:000",
        null
      ],
      "Opened": "2024**********.******+000",
      "Empty": "",
      "Unset": null,
)json"
                                                             "      \"Raw\": \"a\\n\\u001b[31m"
                                                             "\xEF\xBF\xBD\",\n"
                                                             R"json(      "Notes": [
        "one, two",
        ""
      ],
      "NoNotes": [],
      "On": true,
      "Ratio": 0.1,
      "Whole": 3.0,
      "Letter": "é",
      "Other": {
        "class": "Machine",
        "path": "a/b:Machine.Name=\"x\"",
        "keys": {
          "Name": "x"
        }
      },
      "Part": {
        "class": "Part",
        "properties": {
          "Size": 3
        },
        "names": {
          "Size": "Wide"
        },
        "times": {},
        "units": {
          "Size": "millimeter"
        }
      }
    },
    "names": {
      "Kind": "LINUX",
      "States": [
        "OK",
        "In Service",
        null
      ],
      "Level": "Below"
    },
    "times": {
      "Started": "2024-01-02T03:04:05Z",
      "Spans": [
        "P3DT4H5M6S",
        null
      ]
    },
    "units": {
      "Memory": "KiloBytes",
      "Small": "KiloBytes"
    }
  }
]
)json");
}

TEST_F(Printers, ShowPathsOneByOne) {
    const std::vector<ObjectPathValue> paths = {machinePath(),
                                                {"root", "Machine", {{"Name", Value("a\nb")}}}};
    EXPECT_EQ(printed(Format::Table, paths),
              "root/cimv2:Machine.Name=\"m\\\"1\"\n"
              "root:Machine.Name=\"a\\nb\"\n");
    EXPECT_EQ(printed(Format::Mof, paths),
              "instance of Machine {\n"
              "    Name = \"m\\\"1\";\n"
              "};\n"
              "\n"
              "instance of Machine {\n"
              "    Name = \"a\\nb\";\n"
              "};\n");
    EXPECT_EQ(printed(Format::Json, paths), R"json([
  {
    "class": "Machine",
    "path": "root/cimv2:Machine.Name=\"m\\\"1\"",
    "keys": {
      "Name": "m\"1"
    }
  },
  {
    "class": "Machine",
    "path": "root:Machine.Name=\"a\nb\"",
    "keys": {
      "Name": "a\nb"
    }
  }
]
)json");
}

TEST_F(Printers, ShowNothingAsNothing) {
    EXPECT_EQ(printed(Format::Table, std::vector<InstanceValue>()), "");
    EXPECT_EQ(printed(Format::Mof, std::vector<ObjectPathValue>()), "");
    EXPECT_EQ(printed(Format::Json, std::vector<InstanceValue>()), "[]\n");
    EXPECT_EQ(printed(Format::Json, std::vector<ObjectPathValue>()), "[]\n");
}

TEST_F(Printers, GiveRealsThatAreNoNumbersAsNull) {
    const InstanceValue odd{{"n", "X", {}},
                            {{"A", Value::fromReal(std::nan(""), CMPI_real64)},
                             {"B", Value::fromReal(1e300, CMPI_real64)}}};
    EXPECT_EQ(printed(Format::Mof, std::vector{odd}),
              "instance of X {\n    A = NULL;\n    B = 1.0e+300;\n};\n");
    EXPECT_THAT(printed(Format::Json, std::vector{odd}), testing::HasSubstr("\"A\": null"));
}

TEST(HumanReadableSize, HasTheLargestUnitThatLeavesAtLeastOneAndRoundsIntoTheNext) {
    const std::pair<std::uint64_t, const char*> rows[] = {{0, "0 KiB"},
                                                          {1023, "1023 KiB"},
                                                          {1024, "1.0 MiB"},
                                                          {1536, "1.5 MiB"},
                                                          {1024 + 972, "1.9 MiB"},
                                                          {1024 + 973, "2.0 MiB"},
                                                          {8123456, "7.7 GiB"},
                                                          {1023 * 1024, "1023.0 MiB"},
                                                          {1024 * 1024 - 1, "1.0 GiB"},
                                                          {4294967295, "4.0 TiB"},
                                                          {18446744073709551615U, "16.0 ZiB"}};
    for (const auto& [kibibytes, text] : rows)
        EXPECT_EQ(humanReadableSize(kibibytes, SizeUnit::Kibibytes), text);
    EXPECT_EQ(humanReadableSize(1023, SizeUnit::Bytes), "1023 B");
    EXPECT_EQ(humanReadableSize(123456789, SizeUnit::Bytes), "117.7 MiB");
    EXPECT_EQ(humanReadableSize(18446744073709551615U, SizeUnit::Mebibytes), "16.0 YiB");
}

TEST(SizeUnit, IsThatOfTheWordsInWhichClassesTellIt) {
    EXPECT_EQ(sizeUnit("bytes"), SizeUnit::Bytes);
    EXPECT_EQ(sizeUnit("byte"), SizeUnit::Bytes);
    EXPECT_EQ(sizeUnit("KiloBytes"), SizeUnit::Kibibytes);
    EXPECT_EQ(sizeUnit("mebibyte"), SizeUnit::Mebibytes);
    for (const char* other : {"", "kilobyte", "Bits", "Bytes per Second"})
        EXPECT_EQ(sizeUnit(other), std::nullopt) << other;
}

TEST(IsoDateTime, IsTheTrueInstantInUtcOrADuration) {
    const std::pair<const char*, const char*> rows[] = {
        {"20240102030405.000000+000", "2024-01-02T03:04:05Z"},
        {"20240102080405.123456+300", "2024-01-02T03:04:05.123456Z"},
        {"20240101213405.000000-330", "2024-01-02T03:04:05Z"},
        {"19691231235959.000000+000", "1969-12-31T23:59:59Z"},
        {"00010101000000.000000+001", ""},
        {"99991231235959.000000-001", ""},
        {"20230229000000.000000+000", ""},
        {"2024010203****.000000+000", ""},
        {"00000003040506.000000:000", "P3DT4H5M6S"},
        {"00000010000000.000000:000", "P10D"},
        {"00000000010000.000001:000", "PT1H0.000001S"},
        {"00000000000000.000000:000", "PT0S"},
        {"000000030405**.******:000", ""},
        {"yesterday", ""}};
    for (const auto& [cimText, iso] : rows) EXPECT_EQ(isoDateTime(cimText), iso) << cimText;
}

TEST(UnitsOf, AreTheWordsOfTheSchemaElseThoseOfTheProgrammaticUnit) {
    const std::pair<const char*, const char*> rows[] = {
        {"Units(\"KiloBytes\"), PUnit(\"byte * 10^3\")", "KiloBytes"},
        {"PUnit(\"byte * 2^10\")", "kibibyte"},
        {"PUnit(\"second*10^-6\")", "microsecond"},
        {"PUnit(\"percent\")", "percent"},
        {"PUnit(\"bit / second * 10^6 * 3\")", "bit / second * 10^6 * 3"},
        {"Key", ""}};
    for (const auto& [qualifiers, units] : rows) {
        Schema declared;
        declared.add(mof::parse("class A { [" + std::string(qualifiers) +
                                    "] uint64 P; }; class B : A { [Override(\"P\")] uint64 P; };",
                                "x.mof"));
        EXPECT_EQ(unitsOf(declared, "A", "P"), units);
        EXPECT_EQ(unitsOf(declared, "B", "P"), units);
    }
}

TEST_F(Printers, ShowAnInstantInTheZoneOfTheReaderAndAnInterval) {
    const struct {
        const char* zone;
        const char* cimText;
        const char* shown;
    } rows[] = {{"UTC0", "20240102030405.000000+000", "2024-01-02 03:04:05 +00:00"},
                {"CET-1", "20240102030405.000000+000", "2024-01-02 04:04:05 +01:00"},
                {"NST3:30", "20240102030405.000000+000", "2024-01-01 23:34:05 -03:30"},
                {"UTC0", "20240102080405.000000+300", "2024-01-02 03:04:05 +00:00"},
                {"UTC0", "20240101213405.000000-330", "2024-01-02 03:04:05 +00:00"},
                {"UTC0", "21060708091011.000000+000", "2106-07-08 09:10:11 +00:00"},
                {"CET-1", "00000003040506.000000:000", "3 days 04:05:06"},
                {"UTC0", "00000001000000.000000:000", "1 day 00:00:00"},
                {"UTC0", "", ""},
                {"UTC0", "yesterday", ""},
                {"UTC0", "   00000000000.000000+000", ""},
                {"UTC0", "20241302030405.000000+000", ""},
                {"UTC0", "2024010203****.000000+000", ""},
                {"UTC0", "20240102030405.000000", ""},
                {"UTC0", "19691231235959.000000+000", ""}};
    for (const auto& row : rows) {
        setZone(row.zone);
        EXPECT_EQ(humanReadableDateTime(row.cimText), row.shown) << row.cimText;
    }
}

}  // namespace
