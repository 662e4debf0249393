#pragma once

#include <map>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include <rapidcheck.h>

#include "project/stores/TreeMetadataManager.hpp"
#include "support/TextStore.hpp"

namespace project::test {

// A plain map with the expected content of a store, and random writes to both.

/// Fails the case, inside of rapidcheck and outside.
void require(bool holds, std::string const& law);

/// The expected content of a store.
class TreeModel {
public:
    TreeModel() = default;

    explicit TreeModel(Content content) : content_(std::move(content)) {}

    void set(std::map<Address, stores::Node> const& nodes);
    void remove(std::vector<Address> const& addresses);
    void create(std::vector<Address> const& addresses);

    bool exists(Address const& address) const;

    Content const& content() const { return content_; }

    /// The content as a tree shows it: an address that was created without a node is not in it if there is
    /// something below.
    Content visible() const;

private:
    Content content_;
};

/// All answers of a tree to the questions that managers ask, under one read guard. Requires that they agree.
Content contentOf(stores::TreeMetadataManager& tree);

/// Requires that a tree shows the content of a model.
void requireEqual(stores::TreeMetadataManager& tree, TreeModel const& model);

/// A write, perhaps in a transaction.
struct PartialWrite {
    enum class Kind { Set, Remove, Create };

    Kind kind = Kind::Set;
    std::map<Address, stores::Node> nodes{};
    std::vector<Address> addresses{};
    bool isNested = false; ///< in a transaction of its own
    bool isKept = true;    ///< otherwise the nested transaction is rolled back
};

/// Prints the nodes or addresses of a write.
void showWrite(std::map<Address, stores::Node> const& nodes, std::vector<Address> const& addresses,
               std::ostream& out);
void showValue(PartialWrite const& write, std::ostream& out);

rc::Gen<std::map<Address, stores::Node>> anyNodes();
rc::Gen<PartialWrite> anyPartialWrite();

/// Writes to the model and then to the tree: the write may fail when it is already in the project.
void write(stores::TreeMetadataManager& tree, PartialWrite const& step, TreeModel& after);

/// The same in one transaction, which is rolled back unless it is to be committed.
void runTransaction(stores::TreeMetadataManager& tree, std::vector<PartialWrite> const& writes,
                    bool isCommitted, TreeModel& after);

} // namespace project::test
