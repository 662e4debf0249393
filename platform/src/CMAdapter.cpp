#include "cmlink/CMAdapter.hpp"

namespace cmlink {

CMAdapter::~CMAdapter() = default;

} // namespace cmlink
