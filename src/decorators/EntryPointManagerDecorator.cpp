#include "project/decorators/EntryPointManagerDecorator.hpp"

#include <utility>

#include "project/entrypoints/EntryPoint.hpp"

namespace project::management {

EntryPointManagerDecorator::EntryPointManagerDecorator(EntryPointManager& inner) : inner_(inner) {
}

EntryPointManagerDecorator::~EntryPointManagerDecorator() = default;

void EntryPointManagerDecorator::setEntryPoint(EntryPoint& entryPoint) {
    inner_.setEntryPoint(entryPoint);
}

std::vector<std::unique_ptr<EntryPoint>> EntryPointManagerDecorator::getEntryPoints() {
    return inner_.getEntryPoints();
}

std::unique_ptr<EntryPoint> EntryPointManagerDecorator::getEntryPoint(Path file) {
    return inner_.getEntryPoint(std::move(file));
}

void EntryPointManagerDecorator::removeEntryPoint(Path file) {
    inner_.removeEntryPoint(std::move(file));
}

std::vector<std::unique_ptr<EntryPointGroup>> EntryPointManagerDecorator::getEntryPointGroups() {
    return inner_.getEntryPointGroups();
}

void EntryPointManagerDecorator::deleteEntryPointGroup(EntryPointGroup const& group) {
    inner_.deleteEntryPointGroup(group);
}

void EntryPointManagerDecorator::createEntryPointGroup(EntryPointGroup const& group) {
    inner_.createEntryPointGroup(group);
}

void EntryPointManagerDecorator::renameEntryPointGroup(EntryPointGroup const& group,
                                                       std::u16string const& newName) {
    inner_.renameEntryPointGroup(group, newName);
}

} // namespace project::management
