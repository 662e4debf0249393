#include "line/Line.hpp"
