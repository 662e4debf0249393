#include "HostileTexts.hpp"

#include <functional>

#include "support/ProjectTextSamples.hpp"

namespace project::test {

namespace {

using stores::samples::bodyOf;
using stores::samples::closingOf;
using stores::samples::sumOf;

std::string repeated(std::string_view part, std::size_t count) {
    std::string text;
    text.reserve(part.size() * count);
    for (std::size_t i = 0; i < count; ++i) {
        text += part;
    }
    return text;
}

std::string numbered(std::size_t count, std::function<std::string(std::string const&)> const& line) {
    constexpr std::size_t digits = 7;
    std::string text;
    for (std::size_t i = 0; i < count; ++i) {
        std::string const number = std::to_string(i);
        text += line(std::string(digits - number.size(), '0') + number);
    }
    return text;
}

/// A body of lines with their ends.
std::string body(std::string_view lines) {
    return bodyOf({lines.substr(0, lines.size() - 1)});
}

/// A body of some lines, with a tail of these batches of one line each.
std::string withBatches(std::size_t count, std::string const& start, std::string const& line, bool chain) {
    std::string text = body(start);
    std::string preceding = sumOf(text);
    for (std::size_t i = 0; i < count; ++i) {
        std::string const closing = closingOf({line}, chain ? preceding : std::string(preceding.size(), '0'));
        preceding = closing.substr(closing.size() - preceding.size() - 3, preceding.size());
        text += line + "\n" + closing + "\n";
    }
    return text;
}

std::string files(std::size_t count) {
    return numbered(count, [](auto const& i) { return "\"f/" + i + "\"\n"; });
}

std::string nested(std::string const& start, std::string const& part, std::string const& end,
                   std::size_t count) {
    return body(start + repeated(part, count) + end + "\n");
}

/// Some more steps than an address can have.
std::size_t tooMany(std::size_t count) {
    return count + 5000;
}

/// Files below more folders than a system can open.
std::string deepFiles(std::size_t count) {
    constexpr std::size_t steps = 1000;
    std::string const folders = repeated("d/", steps);
    return numbered(count, [&](auto const& i) { return "\"" + i + "/" + folders + "\"\n"; });
}

std::vector<HostileText> const bodies = {
    {"emptyLines", [](std::size_t n) { return body(repeated("\n", n)); }},
    {"linesThatSayNothing", [](std::size_t n) { return body(repeated("x\n", n)); }},
    {"shortFiles", [](std::size_t n) { return body(files(n)); }},
    {"theSameFileAgainAndAgain", [](std::size_t n) { return body(repeated("\"a\"\n", n)); }},
    {"filesInTheWrongOrder", [](std::size_t n) { return body("\"z\"\n" + files(n)); }},
    {"foldersInTheWrongOrder",
     [](std::size_t n) {
         return body("\"z\"\n" + numbered(n, [](auto const& i) { return "\"" + i + "/f/g/h\"\n"; }));
     }},
    {"oneNodeInManyLines",
     [](std::size_t n) {
         return body(numbered(n, [](auto const& i) {
             return R"({"file":"a","children":[{"type":"T","keys":{"UUID":")" + i + "\"}}]}\n";
         }));
     }},
    {"oneKeyInManyLines",
     [](std::size_t n) {
         return body(
             numbered(n, [](auto const& i) { return R"({"file":"a","keys":{"k)" + i + "\":\"\"}}\n"; }));
     }},
    {"oneNestedNodeInManyLines",
     [](std::size_t n) {
         return body(numbered(n, [](auto const& i) {
             return R"({"file":"a","children":[{"type":"T","keys":{"Name":"x"},"children":[{"type":")" + i +
                    "\"}]}]}\n";
         }));
     }},
    {"manyNestedNodes",
     [](std::size_t n) {
         return body(R"({"file":"a","children":[{"type":"T"})" + repeated(R"(,{"type":"T"})", n) + "]}\n");
     }},
    {"manyKeys",
     [](std::size_t n) {
         return body(R"({"file":"a","keys":{)" +
                     numbered(n, [](auto const& i) { return "\"" + i + R"(":"",)"; }) + "\"x\":\"\"}}\n");
     }},
    {"aNodeAtTheBottomOfAHundredLevels",
     [](std::size_t n) {
         constexpr std::size_t levels = 99;
         return body(R"({"file":"a")" + repeated(R"(,"children":[{"type":"")", levels) + R"(,"keys":{"k":")" +
                     std::string(n, 'v') + "\"}" + repeated("}]", levels) + "}\n" + R"({"file":"a")" +
                     repeated(R"(,"children":[{"type":"")", levels) + repeated("}]", levels) + "}\n");
     }},
    {"nodesNestedWithoutEnd",
     [](std::size_t n) { return nested(R"({"file":"a")", R"(,"children":[{"type":"")", "}", n); }},
    {"listsNestedWithoutEnd", [](std::size_t n) { return nested("{\"at\":", "[", "]", n); }},
    {"objectsNestedInShortLines",
     [](std::size_t n) { return body(repeated("{\"file\":{\"file\":[[[[\n", n)); }},
    {"oneLongName", [](std::size_t n) { return nested("\"", "name", "\"", n); }},
    {"oneLongNameInEscapes", [](std::size_t n) { return nested("\"", "\\u0061", "\"", n); }},
    {"oneLineWithoutEnd", [](std::size_t n) { return body("\"" + std::string(n, 'a') + "\n"); }},
    {"tooManySteps", [](std::size_t n) { return nested("{\"at\":[\"\"", ",\"\"", "]}", tooMany(n)); }},
    {"tooManyNames", [](std::size_t n) { return nested("\"a", "/a", "\"", tooMany(n)); }},
    {"aMemberManyTimes", [](std::size_t n) { return nested(R"({"file":"a")", R"(,"type":"")", "}", n); }},
    {"deepFiles", [](std::size_t n) { return body(deepFiles(n / 150 + 1)); }},
    {"oneAddressMadeManyTimes",
     [](std::size_t n) {
         return body(repeated(R"({"at":["a","b"],"node":false})"
                              "\n",
                              n));
     }},
};

std::vector<HostileText> const tails = {
    {"manyBatches", [](std::size_t n) { return withBatches(n, "\"a\"\n", "\"b\"", true); }},
    {"manyBatchesThatDoNotChain",
     [](std::size_t n) { return withBatches(n, "\"a\"\n", R"({"file":"b","keys":{"k":"v"}})", false); }},
    {"manyRemovalsOfOneFolder",
     [](std::size_t n) { return withBatches(n, files(n), R"({"remove":"f"})", true); }},
    {"manyRemovalsThatDoNotChain",
     [](std::size_t n) { return withBatches(n, files(n), R"({"remove":"f"})", false); }},
    {"batchesWithoutTheirChecksums",
     [](std::size_t n) {
         return body("\"a\"\n") + repeated("\"b\"\n" + closingOf({"\"c\""}, std::string(32, '0')) + "\n", n);
     }},
    {"batchesThatClaimAllLinesThereAre",
     [](std::size_t n) {
         std::string const sums =
             R"(,"after":")" + std::string(32, '0') + R"(","sum":")" + std::string(32, '0') + "\"}}\n";
         return body("\"a\"\n") + repeated("\"b\"\n{\"batch\":{\"lines\":18446744073709551615" + sums, n);
     }},
    {"emptyLinesBehindTheBody", [](std::size_t n) { return body("\"a\"\n") + repeated("\n", n); }},
    {"closingLinesAlone",
     [](std::size_t n) { return body("\"a\"\n") + repeated(closingOf({}, std::string(32, '0')) + "\n", n); }},
    {"aRemovalBehindDeepFiles",
     [](std::size_t n) { return withBatches(1, deepFiles(n / 150 + 1), R"({"remove":"a"})", true); }},
    {"removalsEachOfItsOwnFile",
     [](std::size_t n) {
         std::string const start = body(files(n));
         std::vector<std::string> lines;
         std::string text;
         for (std::size_t i = 0; i < n; ++i) {
             std::string const number = std::to_string(i);
             lines.push_back("{\"remove\":\"f/" + std::string(7 - number.size(), '0') + number + "\"}");
             text += lines.back() + "\n";
         }
         return start + text + closingOf(lines, sumOf(start)) + "\n";
     }},
};

std::vector<HostileText> const conflicts = {
    {"markersAlone", [](std::size_t n) { return body(repeated("<<<<<<<\n=======\n>>>>>>>\n", n)); }},
    {"markersThatOnlyOpen", [](std::size_t n) { return body(repeated("<<<<<<< \"a\n", n)); }},
    {"markersInTheWrongOrder",
     [](std::size_t n) { return body(repeated(">>>>>>>\n|||||||\n\"a\"\n=======\n", n)); }},
    {"oneNodeOnBothSidesInManyLines",
     [](std::size_t n) {
         std::string const lines = numbered(n, [](auto const& i) {
             return R"({"file":"a","children":[{"type":"T","keys":{"UUID":")" + i + "\"}}]}\n";
         });
         return body("<<<<<<<\n" + lines + "=======\n" + lines + ">>>>>>>\n");
     }},
    {"emptyLinesBetweenMarkers",
     [](std::size_t n) { return body("<<<<<<<\n" + repeated("\n", n) + ">>>>>>>\n"); }},
};

} // namespace

std::vector<HostileText> const& hostileTexts() {
    static std::vector<HostileText> const all = [] {
        std::vector<HostileText> texts = bodies;
        texts.insert(texts.end(), tails.begin(), tails.end());
        texts.insert(texts.end(), conflicts.begin(), conflicts.end());
        return texts;
    }();
    return all;
}

} // namespace project::test
