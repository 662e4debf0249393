#include "checks/FindingForms.hpp"

#include <algorithm>
#include <functional>
#include <vector>

#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

/// "FILE:LINE: error: TEXT [CODE]"
std::string gccLine(Finding const& finding, std::string const& file) {
    std::string const line = finding.line > 0 ? ':' + std::to_string(finding.line) : std::string();
    return file + line + (finding.isFault() ? ": error: " : ": note: ") + finding.text + " [" +
           std::string(finding.code) + ']';
}

/// The text as data of a command of a workflow, in which line ends and some more characters are escaped.
std::string escaped(std::string_view text, std::string_view special) {
    static constexpr std::string_view digits = "0123456789ABCDEF";
    std::string result;
    for (char const byte : text) {
        if (special.find(byte) == std::string_view::npos) {
            result += byte;
        } else {
            auto const value = static_cast<unsigned char>(byte);
            result += {'%', digits[value >> 4U], digits[value & 15U]};
        }
    }
    return result;
}

/// "::error file=FILE,line=LINE,title=CODE::TEXT"
std::string gitHubLine(Finding const& finding, std::string const& file) {
    std::string const line = finding.line > 0 ? ",line=" + std::to_string(finding.line) : std::string();
    return (finding.isFault() ? "::error file=" : "::notice file=") + escaped(file, "%\r\n:,") + line +
           ",title=" + std::string(finding.code) + "::" + escaped(finding.text, "%\r\n");
}

} // namespace

void placeInText(Findings& findings, OpenProject& project) {
    std::vector<project::metadata::MetadataPath> addresses;
    std::vector<Finding*> placed;
    for (auto& finding : findings) {
        if (finding.address && project.log() == nullptr) {
            addresses.push_back(*finding.address);
            placed.push_back(&finding);
        }
    }
    auto const lines = addresses.empty() ? std::vector<std::size_t>() : project.text().linesOf(addresses);
    for (std::size_t index = 0; index < lines.size(); ++index) {
        placed[index]->line = lines[index];
    }
}

void sortByWeight(Findings& findings) {
    std::stable_partition(findings.begin(), findings.end(), std::mem_fn(&Finding::isFault));
}

std::size_t countFaults(Findings const& findings) {
    return static_cast<std::size_t>(std::ranges::count_if(findings, &Finding::isFault));
}

void write(Findings const& findings, FindingForm form, std::string const& file) {
    for (auto const& finding : findings) {
        auto const line = form == FindingForm::Gcc ? gccLine(finding, file) : gitHubLine(finding, file);
        output().text() += withoutControls(line, false) + '\n';
    }
}

void addFindings(JsonObject& object, Findings const& findings) {
    object.addKey("findings");
    JsonRows rows;
    for (auto const& finding : findings) {
        rows.begin();
        rows.addText("code", std::u16string(finding.code.begin(), finding.code.end()));
        rows.addFlag("fault", finding.isFault());
        if (!finding.path.empty()) {
            rows.addText("path", finding.path);
        }
        if (finding.line > 0) {
            rows.addNumber("line", finding.line);
        }
        rows.addText("text", textOf(finding.text));
    }
    rows.finish();
}

} // namespace projectctl
