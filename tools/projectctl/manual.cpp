#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>
#include <string_view>

#include "Verbs.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/VerbDescription.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "manual/GuidePage.hpp"
#include "manual/ManualPage.hpp"

namespace {

using projectctl::VerbDescription;

void write(std::filesystem::path const& file, std::string const& page) {
    std::ofstream out(file, std::ios::binary | std::ios::trunc);
    out << page;
    out.flush();
    if (!out) {
        throw std::filesystem::filesystem_error("cannot write the page", file, std::error_code());
    }
}

void writeManual(std::filesystem::path const& folder, VerbDescription const& tool, std::string const& date) {
    std::filesystem::create_directories(folder);
    auto const writePage = [&](VerbDescription const& verb) {
        write(folder / (projectctl::manualNameOf(verb) + ".1"), projectctl::manualPageOf(verb, date));
    };
    writePage(tool);
    std::ranges::for_each(tool.members, writePage);
}

} // namespace

/// Writes the manual pages of the tool, one for each verb: projectctl_manual LANGUAGE FOLDER DATE
/// Writes the page of the guide with all verbs: projectctl_manual --guide FILE
int main(int argc, char** argv) {
    bool const isGuide = argc == 3 && std::string_view(argv[1]) == "--guide";
    if (!isGuide && argc != 4) {
        std::cerr << "usage: projectctl_manual LANGUAGE FOLDER DATE\n"
                     "       projectctl_manual --guide FILE\n";
        return 2;
    }
    try {
        fl::i18n::MessageCatalog::setGlobalLocale(isGuide ? "en" : argv[1]);
        projectctl::DeclaredTool tool(projectctl::verbs());
        auto const description = projectctl::describe(tool.parser());
        if (isGuide) {
            write(argv[2], projectctl::guidePageOf(description));
        } else {
            writeManual(argv[2], description, argv[3]);
        }
    } catch (std::exception const& error) {
        std::cerr << "projectctl_manual: " << error.what() << '\n';
        return 1;
    }
    return 0;
}
