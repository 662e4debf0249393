#include "exchange/ImportTableCommand.hpp"

#include "cli/StandardInput.hpp"

namespace projectctl {

CLI::App* ImportTableCommand::declare(CLI::App& group) {
    auto* const app = declareForm(group, form_);
    declareFile(*app);
    return app;
}

std::string ImportTableCommand::source(OpenProject& /*project*/) const {
    return file().value_or("-");
}

std::string ImportTableCommand::load(OpenProject& /*project*/) const {
    return readFileOrInput(file());
}

} // namespace projectctl
