#include <gtest/gtest.h>

#include "frame/frame.h"
