#include <filesystem>
#include <fstream>
#include <iostream>
#include <string>

#include "Verbs.hpp"
#include "cli/DeclaredTool.hpp"
#include "cli/VerbDescription.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "manual/ManualPage.hpp"

namespace {

void write(std::filesystem::path const& folder, projectctl::VerbDescription const& verb,
           std::string const& date) {
    std::ofstream file(folder / (projectctl::manualNameOf(verb) + ".1"), std::ios::binary | std::ios::trunc);
    file << projectctl::manualPageOf(verb, date);
    file.flush();
    if (!file) {
        throw std::filesystem::filesystem_error("cannot write the manual page", folder, std::error_code());
    }
}

} // namespace

/// Writes the manual pages of the tool, one for each verb: projectctl_manual LANGUAGE FOLDER DATE
int main(int argc, char** argv) {
    if (argc != 4) {
        std::cerr << "usage: projectctl_manual LANGUAGE FOLDER DATE\n";
        return 2;
    }
    try {
        fl::i18n::MessageCatalog::setGlobalLocale(argv[1]);
        std::filesystem::create_directories(argv[2]);
        projectctl::DeclaredTool tool(projectctl::verbs());
        auto const description = projectctl::describe(tool.parser());
        write(argv[2], description, argv[3]);
        for (auto const& verb : description.members) {
            write(argv[2], verb, argv[3]);
        }
    } catch (std::exception const& error) {
        std::cerr << "projectctl_manual: " << error.what() << '\n';
        return 1;
    }
    return 0;
}
