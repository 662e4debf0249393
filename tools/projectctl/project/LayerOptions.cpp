#include "project/LayerOptions.hpp"

#include <algorithm>
#include <utility>

#include "output/Failure.hpp"
#include "project/LabelNames.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using project::session::LabelChoice;
using project::session::Layers;

void LayerOptions::declare(CLI::App& app) {
    auto* const personal = app.add_flag("--personal", isPersonal_);
    app.add_flag("--no-personal", isProject_)->excludes(personal);
}

void LayerOptions::declarePersonal(CLI::App& app) {
    app.add_flag("--personal", isPersonal_);
}

Layers LayerOptions::layers() const noexcept {
    return isPersonal_ ? Layers::Personal : isProject_ ? Layers::Project : Layers::Both;
}

std::vector<LabelLayer> LayerOptions::searched(OpenProject& project) const {
    std::vector<LabelLayer> result;
    if (!isPersonal_) {
        result.emplace_back(project, false);
    }
    if (!isProject_) {
        result.emplace_back(project, true);
    }
    return result;
}

std::vector<cmlink::ReentrantReadWriteLock::LockGuard> LayerOptions::readGuards(OpenProject& project) const {
    std::vector<cmlink::ReentrantReadWriteLock::LockGuard> result;
    result.push_back(project.store().acquireReadLock());
    if (!isProject_) {
        result.push_back(project.access().personalStore().acquireReadLock());
    }
    return result;
}

std::vector<LayerCategory> LayerOptions::categories(OpenProject& project) const {
    std::vector<LayerCategory> result;
    for (auto const& layer : searched(project)) {
        for (auto& category : layer.labels().getAllCategories()) {
            result.push_back({layer, std::move(category)});
        }
    }
    std::ranges::stable_sort(result, {}, [](LayerCategory const& each) { return each.category.getName(); });
    return result;
}

LabelLayer LayerOptions::forChange(OpenProject& project, std::string const& category) const {
    auto const found = ofCategory(project, category);
    if (found.isPersonal() && !isPersonal_) {
        throw Failure(Message("CategoryIsPersonal", category));
    }
    return found;
}

LabelLayer LayerOptions::ofCategory(OpenProject& project, std::string const& category) const {
    LabelLayer const shared(project, false);
    LabelLayer const personal(project, true);
    if (isPersonal_ || isProject_) {
        return isPersonal_ ? personal : shared;
    }
    if (!personal.hasCategory(category)) {
        return shared;
    }
    if (shared.hasCategory(category)) {
        throw Failure(Message("CategoryInBothLayers", category));
    }
    return personal;
}

LabelChoice LayerOptions::choice(OpenProject& project, std::string const& category,
                                 std::optional<std::string> const& label) const {
    return LabelNames(ofCategory(project, category).labels()).choice(category, label);
}

} // namespace projectctl
