// Routines of the key probes, element searches, lists, totals and element sorts.
#include "host/routine_support.h"
#include "host/routines.h"
#include "query/search.h"

namespace quorrel::host::expr {

// Key probes: the fetched parameter becomes a String or a Value operand.
QUORREL_EXPRESSION_ROUTINE(indexOfKeyString) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return indexOfKey(a, ElementValue::ofText(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(indexOfKeyValue) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return indexOfKey(a, ElementValue::ofValue(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(stringWithStringKey) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return Borrowed{stringWithKey(a, ElementValue::ofText(key))};
  });
}
QUORREL_EXPRESSION_ROUTINE(stringWithValueKey) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return Borrowed{stringWithKey(a, ElementValue::ofValue(key))};
  });
}
QUORREL_EXPRESSION_ROUTINE(valueWithStringKey) {
  return runExpression<Text>(runRecord, parameterToken, [](ElementArray& a, const char* key) {
    return valueWithKey(a, ElementValue::ofText(key));
  });
}
QUORREL_EXPRESSION_ROUTINE(valueWithValueKey) {
  return runExpression<Int>(runRecord, parameterToken, [](ElementArray& a, int32_t key) {
    return valueWithKey(a, ElementValue::ofValue(key));
  });
}

// Searches: the second parameter is fetched and handed on; it changes nothing.
QUORREL_EXPRESSION_ROUTINE(findString) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray& a, const char* text, int32_t ignored) {
                                    return quorrel::findString(a, text, ignored);
                                  });
}
QUORREL_EXPRESSION_ROUTINE(findValue) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t number, int32_t ignored) {
                                   return quorrel::findValue(a, number, ignored);
                                 });
}
QUORREL_EXPRESSION_ROUTINE(containsString) {
  return runExpression<Text, Int>(runRecord, parameterToken,
                                  [](ElementArray& a, const char* text, int32_t ignored) {
                                    return findContainingString(a, text, ignored);
                                  });
}
QUORREL_EXPRESSION_ROUTINE(containsValue) {
  return runExpression<Int, Int>(runRecord, parameterToken,
                                 [](ElementArray& a, int32_t number, int32_t ignored) {
                                   return findContainingValue(a, number, ignored);
                                 });
}

}  // namespace quorrel::host::expr
