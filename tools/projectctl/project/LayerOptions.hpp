#pragma once

#include <optional>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include "project/LabelLayer.hpp"

namespace projectctl {

/// A category with its layer.
struct LayerCategory {
    LabelLayer layer;
    project::management::CategoryIdentifier category;
};

/// The options --personal and --no-personal of a verb for categories and labels.
///
/// Without them, a search finds the categories of both layers, and a change concerns the project. A name that
/// both layers have is refused then, and so is a change of a category that only the personal layer has: the
/// shared text never gets or loses a label by mistake.
class LayerOptions {
public:
    /// Declares both options.
    void declare(CLI::App& app);

    /// Declares --personal only, for a verb that creates a category.
    void declarePersonal(CLI::App& app);

    /// The labels that a search concerns.
    project::session::Layers layers() const noexcept;

    /// The layers that a search concerns, that of the project first.
    std::vector<LabelLayer> searched(OpenProject& project) const;

    /// Read guards of these layers, so that several questions are about one state.
    std::vector<cmlink::ReentrantReadWriteLock::LockGuard> readGuards(OpenProject& project) const;

    /// The categories of these layers by name; those of the project come before personal ones of the same
    /// name.
    std::vector<LayerCategory> categories(OpenProject& project) const;

    /// The layer in which a new category is created.
    LabelLayer forNew(OpenProject& project) const { return {project, isPersonal_}; }

    /// The layer that a change concerns.
    /// @param category that the change names.
    /// @throws Failure if neither option is given and the personal layer has the category.
    LabelLayer forChange(OpenProject& project, std::string const& category) const;

    /// The layer of a category that a search names: the project's if no layer has it.
    /// @throws Failure if neither option is given and both layers have the category.
    LabelLayer ofCategory(OpenProject& project, std::string const& category) const;

    /// A label, or any label of a category, as a condition of a search.
    /// @throws as ofCategory, and as LabelNames::choice.
    project::session::LabelChoice choice(OpenProject& project, std::string const& category,
                                         std::optional<std::string> const& label) const;

private:
    bool isPersonal_ = false;
    bool isProject_ = false;
};

} // namespace projectctl
