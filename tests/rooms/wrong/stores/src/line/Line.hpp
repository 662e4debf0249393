#include "text/Body.hpp"
