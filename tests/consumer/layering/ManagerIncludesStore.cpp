// A manager that knows a store's type would tie the two layers together.
#include "project/stores/TreeMetadataManager.hpp"
