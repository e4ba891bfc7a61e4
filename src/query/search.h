// Key lookup and element search: linear scans from index 0 that stop at the first hit
// and answer its index, or -1. Nothing here allocates.
#pragma once

#include <cstdint>
#include <string_view>

#include "array/element.h"
#include "array/element_array.h"

namespace quorrel {

// First element whose key compares equal to the probe by compareWithElement (the
// probe as operand, the key as element: in wildcard mode the key is the pattern).
// Keyless elements are passed over.
int32_t indexOfKey(const ElementArray& array, const ElementValue& probe);
// Borrowed text of the element found by key: owned by the array, valid until its next
// text read or edit; the caller copies it and never frees it. Null when not found.
const char* stringWithKey(ElementArray& array, const ElementValue& probe);
// Numeric value of the element found by key; 0 when not found.
int32_t valueWithKey(const ElementArray& array, const ElementValue& probe);

// First element whose text form equals the probe (literal) or is matched by it
// (wildcard: the probe is the pattern). The second argument has no effect.
int32_t findString(const ElementArray& array, const char* probe, int32_t ignored = 0);
// First element whose numeric value equals the number.
int32_t findValue(const ElementArray& array, int32_t number, int32_t ignored = 0);
// First element whose stored content holds the probe at some offset: a String in its
// text, a File in its bytes (a span with a zero byte never matches), a Value in its
// decimal text. The empty probe is found in the first element, whatever its type.
int32_t findContainingString(const ElementArray& array, const char* probe, int32_t ignored = 0);
// findContainingString of the number's decimal text.
int32_t findContainingValue(const ElementArray& array, int32_t number, int32_t ignored = 0);

// Whether the probe equals (literal) or matches (wildcard, the probe being the pattern)
// the L bytes at some offset of `bytes`, L the probe's length, under the array's
// settings. Zero bytes inside `bytes` are ordinary data that no non-empty probe
// matches. The empty probe is contained in everything.
bool bytesContain(const ElementArray& array, std::string_view probe, std::string_view bytes);

}  // namespace quorrel
