#pragma once

namespace history {

// What partition_results.inventory and documents.inventory say of a
// partition's document (docs/history.md, "Inventory").
inline constexpr char gc_InventoryRead[] = "read";
inline constexpr char gc_InventoryUnreadable[] = "unreadable";
inline constexpr char gc_InventoryDefault[] = "default";
inline constexpr char gc_InventoryMissing[] = "missing";
inline constexpr char gc_InventoryNone[] = "none";

} // namespace history
