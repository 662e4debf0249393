// A store that knows a manager's type would tie the two layers together: it links project::metadata alone.
#include "files/FileManagerBase.hpp"
