// What nearly every test of the library needs: the library, files in memory, and what the memory hooks saw.
#pragma once

#include <algorithm>
#include <array>
#include <bit>
#include <climits>
#include <cmath>
#include <cstring>
#include <functional>
#include <limits>
#include <map>
#include <memory>
#include <optional>
#include <random>
#include <set>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "support/byte_writer.h"
#include "support/counting_memory.h"
#include "support/every_failed_allocation.h"
#include "support/memory_file.h"
#include "support/node_bytes.h"
#include "support/record_samples.h"
#include "support/reports.h"
#include "support/scene_bytes.h"
#include "support/temp_folder.h"
#include "support/text.h"
#include "torvane/torvane.h"

using namespace _torvane_;

using ObjectPtr = Owned<BaseObject>;
