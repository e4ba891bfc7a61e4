// Whole-array lists and totals. Every element takes part in index order; dimensions
// and the row selection are ignored, and the delimiter is the caller's, not the
// array's list delimiter.
//
// Every list is a fresh text owned by the caller, measured first and built in one
// allocation of its exact length. A null delimiter or separator writes nothing.
#pragma once

#include <cstdint>
#include <string>

#include "array/element_array.h"

namespace quorrel {

// One field per element: Value and String elements give their text, None and File
// nothing. The quoted form wraps Strings in apostrophes (nothing is escaped).
std::string elementList(const ElementArray& array, const char* delimiter);
std::string quotedElementList(const ElementArray& array, const char* delimiter);
// One field per element: the key's text when the key is a Value or a String, else
// nothing. The quoted form wraps String keys in apostrophes.
std::string keyList(const ElementArray& array, const char* delimiter);
std::string quotedKeyList(const ElementArray& array, const char* delimiter);
// key + separator + element for each keyed Value or String element only; the others
// leave no trace. The key is never quoted.
std::string pairList(const ElementArray& array, const char* separator, const char* delimiter);
std::string quotedPairList(const ElementArray& array, const char* separator, const char* delimiter);

// Totals of the elements' numeric values in signed 32 bits; 0 for an empty array.
int32_t maxValue(const ElementArray& array);
int32_t minValue(const ElementArray& array);
// Wraps modulo 2^32.
int32_t sumValue(const ElementArray& array);
// The wrapped sum divided by the count, truncated toward zero.
int32_t averageValue(const ElementArray& array);

}  // namespace quorrel
