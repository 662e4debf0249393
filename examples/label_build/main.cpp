// Writes a source that includes all files with a label, for a build that compiles them as one (a unity
// build).
#include <exception>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include <fl/i18n/Utf8.hpp>
#include <project/session.hpp>

namespace {

using project::management::LabelManager;
using project::session::FileKind;
using project::session::FoundFile;
using project::session::LabelChoice;
using project::session::Session;

/// The label with a name of the form Category=Label.
/// @throws std::runtime_error if it does not exist.
LabelChoice labelWithName(LabelManager& labels, std::u16string_view name) {
    auto const separator = name.find(u'=');
    if (separator == std::u16string_view::npos) {
        throw std::runtime_error("a label is written Category=Label");
    }
    for (auto const& category : labels.getAllCategories()) {
        if (category.getName() != name.substr(0, separator)) {
            continue;
        }
        for (auto const& label : labels.getLabels(category)) {
            if (label.getName() == name.substr(separator + 1)) {
                return {category.getUUID(), label.getUUID()};
            }
        }
    }
    throw std::runtime_error("the project has no label " + fl::i18n::toUtf8(name));
}

/// A file name as the compiler reads it between quotes.
/// @throws std::runtime_error for a name that no include can have.
std::string quoted(std::filesystem::path const& file) {
    auto const name = file.string();
    if (name.find_first_of("\"\n") != std::string::npos) {
        throw std::runtime_error("a quote or a line end in the name of " + name);
    }
    return '"' + name + '"';
}

std::string unitySource(std::vector<FoundFile> const& files) {
    std::string source;
    for (auto const& file : files) {
        source += "#include " + quoted(fl::filesystem::toSystem(file.path)) + '\n';
    }
    return source;
}

std::string contentOf(std::filesystem::path const& file) {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), {}};
}

/// Writes a file, unless it has this content: the build then compiles nothing.
void writeIfDifferent(std::filesystem::path const& file, std::string const& content) {
    if (std::filesystem::exists(file) && contentOf(file) == content) {
        return;
    }
    std::ofstream out(file, std::ios::binary | std::ios::trunc);
    out << content;
    out.close();
    if (!out) {
        throw std::runtime_error("cannot write " + file.string());
    }
}

void generate(char const* folder, char const* label, char const* output) {
    auto session = Session::open(fl::filesystem::fromSystem(folder));
    auto const choice = labelWithName(session.project().getLabelManager(), fl::i18n::fromUtf8(label));
    writeIfDifferent(output, unitySource(session.find({.labels = {choice}, .kind = FileKind::File})));
}

} // namespace

int main(int argc, char** argv) {
    std::span const arguments(argv, static_cast<std::size_t>(argc));
    if (arguments.size() != 4) {
        std::cerr << "usage: unity_source FOLDER CATEGORY=LABEL OUTPUT\n";
        return 2;
    }
    try {
        generate(arguments[1], arguments[2], arguments[3]);
        return 0;
    } catch (std::exception const& error) {
        std::cerr << "unity_source: " << error.what() << '\n';
        return 1;
    }
}
