// Checks the files of a project, and labels those without findings. A file keeps its label until its content
// changes, and is not checked again until then.
#include <charconv>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include <project/session.hpp>

#include "ReviewLabel.hpp"
#include "TextCheck.hpp"

namespace {

using namespace review_linter;
using project::session::FileKind;
using project::session::Session;

/// The content of a file; nothing if it cannot be read, or is not a text.
std::optional<std::string> textOf(Path const& file) {
    std::ifstream in(fl::filesystem::toSystem(file), std::ios::binary);
    std::string text{std::istreambuf_iterator<char>(in), {}};
    bool const isText = text.find('\0') == std::string::npos;
    return in && isText ? std::optional(std::move(text)) : std::nullopt;
}

std::u16string hexadecimal(std::uint64_t number) {
    char digits[16];
    auto const end = std::to_chars(std::begin(digits), std::end(digits), number, 16).ptr;
    return {std::begin(digits), end};
}

void print(std::string const& file, std::vector<Finding> const& findings) {
    for (auto const& finding : findings) {
        std::cout << file << ':' << finding.line << ": " << finding.problem << '\n';
    }
}

/// The result of a run over the files of a project.
class Review {
public:
    explicit Review(Session& session) : session_(session), label_(session) {}

    /// Compares a file with its label, and checks it if it has changed since.
    void visit(Path const& file) {
        auto const before = label_.hashOn(file);
        auto const text = textOf(file);
        auto const hash = text ? hexadecimal(hashOf(*text)) : u"";
        if (before == hash) {
            return;
        }
        auto const findings = text ? check(*text) : std::vector<Finding>();
        print(nameOf(file), findings);
        hasFindings_ = hasFindings_ || !findings.empty();
        if (text && findings.empty()) {
            passed_.emplace(file, hash);
        } else if (!before.empty()) {
            outdated_.push_back(file);
        }
    }

    /// Stores the result in the project, as one change.
    void store() {
        auto transaction = session_.transaction();
        if (!outdated_.empty()) {
            label_.remove(outdated_);
        }
        if (!passed_.empty()) {
            label_.put(passed_);
        }
        transaction.commit();
    }

    void printSummary() const {
        std::cout << passed_.size() << " reviewed, " << outdated_.size() << " not reviewed any more\n";
    }

    bool hasChanges() const noexcept { return !passed_.empty() || !outdated_.empty(); }

    bool hasFindings() const noexcept { return hasFindings_; }

private:
    /// The path as people write it, relative to the root.
    std::string nameOf(Path const& file) const {
        return fl::filesystem::toSystem(file).lexically_relative(fl::filesystem::toSystem(session_.root()));
    }

    Session& session_;
    ReviewLabel label_;
    std::map<Path, std::u16string> passed_; ///< with the hashes of their contents
    std::vector<Path> outdated_;            ///< files that have the label and must lose it
    bool hasFindings_ = false;
};

/// Reviews all files of a project. @return whether there are findings.
bool review(Session& session) {
    Review result(session);
    for (auto const& file : session.find({.kind = FileKind::File})) {
        result.visit(file.path);
    }
    if (result.hasChanges()) { // others wait for a transaction, so it begins after the files were read
        result.store();
    }
    result.printSummary();
    return result.hasFindings();
}

} // namespace

int main(int argc, char** argv) {
    std::span const arguments(argv, static_cast<std::size_t>(argc));
    if (arguments.size() != 2) {
        std::cerr << "usage: review_linter FOLDER\n";
        return 2;
    }
    try {
        auto session = Session::open(fl::filesystem::fromSystem(arguments[1]));
        return review(session) ? 1 : 0;
    } catch (std::exception const& error) {
        std::cerr << "review_linter: " << error.what() << '\n';
        return 2;
    }
}
