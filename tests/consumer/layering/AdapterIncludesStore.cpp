// Source control knows neither managers nor stores.
#include "project/stores/TreeMetadataManager.hpp"
