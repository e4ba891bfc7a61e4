// The parameter types of every action and expression code, written out by hand.
#pragma once

#include <cstdint>

namespace testhost {

// Parameter types by code: T text, N number (actions); T text, I integer
// (expressions); '-' none.
inline constexpr const char* kActionParams[79] = {
    "T-", "T-", "T-", "T-", "T-", "T-", "TN", "NN", "T-", "N-",  // 0-9
    "T-", "T-", "T-", "TN", "NN", "N-", "N-", "--", "NT", "NT",  // 10-19
    "TN", "NN", "--", "--", "--", "--", "NN", "N-", "--", "--",  // 20-29
    "NN", "NN", "TN", "TN", "T-", "TN", "TN", "TN", "T-", "N-",  // 30-39
    "N-", "N-", "N-", "N-", "T-", "T-", "T-", "T-", "TN", "TT",  // 40-49
    "--", "--", "TN", "TN", "T-", "--", "--", "T-", "T-", "T-",  // 50-59
    "T-", "--", "--", "--", "--", "NT", "NT", "NN", "NN", "NN",  // 60-69
    "NN", "NN", "NN", "TT", "TT", "TN", "TN", "TN", "--"};       // 70-78
inline constexpr const char* kExpressionParams[60] = {
    "--", "--", "I-", "I-", "I-", "I-", "T-", "I-", "T-", "I-",   // 0-9
    "T-", "I-", "TI", "II", "TI", "II", "T-", "T-", "T-", "T-",   // 10-19
    "TT", "TT", "--", "--", "--", "--", "--", "I-", "--", "--",   // 20-29
    "--", "--", "--", "--", "II", "I-", "I-", "I-", "T-", "II",   // 30-39
    "--", "I-", "--", "I-", "--", "T-", "I-", "II", "II", "TI",   // 40-49
    "TI", "--", "I-", "I-", "I-", "I-", "T-", "T-", "T-", "T-"};  // 50-59

// The information entries' codes of those types.
inline uint16_t typeCode(char c) {
  return c == 'N' ? 22 : c == 'T' ? 45 : 0;
}
inline uint16_t expressionTypeCode(char c) {
  return c == 'I' ? 1 : c == 'T' ? 3 : 0;
}

}  // namespace testhost
