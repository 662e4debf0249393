#include "renames/SimilarityOption.hpp"

#include "output/Failure.hpp"

namespace projectctl {

CLI::Option* declareSimilarity(CLI::App& app, int& similarity) {
    return app.add_option("--similarity", similarity)->check([](std::string const& text) -> std::string {
        bool const isNumber =
            !text.empty() && text.size() <= 3 && text.find_first_not_of("0123456789") == text.npos;
        int const number = isNumber ? std::stoi(text) : 0;
        return number >= 1 && number <= 100 ? "" : Message("SimilarityWrong", text).text();
    });
}

} // namespace projectctl
