// The two layers of the host's layered tables: the stored configuration
// (what survives a restart) and the running state (what the host runs now).
// The enumerators' values are what the `layer` column holds.
#pragma once

#include <cstdint>

namespace TarnCtl::Store {

enum class Layer : int { kStored = 0, kRunning = 1 };

inline constexpr Layer kBothLayers[] = {Layer::kStored, Layer::kRunning};

// The value of the `layer` column for `layer`.
constexpr int64_t LayerValue(Layer layer) {
  return static_cast<int64_t>(layer);
}

}  // namespace TarnCtl::Store
