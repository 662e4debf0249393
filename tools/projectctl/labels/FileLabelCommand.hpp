#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "changes/DryRun.hpp"
#include "cli/PathArguments.hpp"
#include "project/LayerOptions.hpp"
#include "project/ProjectCommand.hpp"
#include "project/labels/Label.hpp"
#include "texts/Message.hpp"

namespace projectctl {

/// A command that changes the labels of files: its arguments are one label and the files.
class FileLabelCommand : public ProjectCommand {
public:
    int run(OpenProject& project) override;

protected:
    /// @param paths all of them in the project. @return the confirmation of the change.
    virtual Message change(OpenProject& project, LabelLayer const& layer,
                           std::vector<Path> const& paths) const = 0;

    void declareArguments(CLI::App& app);

    std::string const& category() const { return *category_; }

    std::string const& label() const { return *label_; }

    /// How many times a file has a label. More than once is possible in a text that was merged or edited.
    static std::size_t countOn(LabelLayer const& layer, Path const& path,
                               project::management::Label const& label);

private:
    Message changeAll(OpenProject& project, LabelLayer const& layer, std::vector<Path> const& paths) const;

    std::optional<std::string> category_;
    std::optional<std::string> label_;
    PathArguments paths_;
    LayerOptions layers_;
    DryRun dryRun_;
};

} // namespace projectctl
