// Instances driven through the routine tables: calling conventions, the setup record,
// and the routines of element edits, settings and dimensions.
#include "param_types.h"
#include "test_host.h"

namespace testhost {
namespace {

std::vector<Arg> argsFor(const char* types) {
  std::vector<Arg> args;
  for (int i = 0; i < 2; ++i) {
    if (types[i] == 'I') args.emplace_back(1);
    if (types[i] == 'T') args.emplace_back("x");
  }
  return args;
}

void expectFetchesDeclared(Instance& instance, int code) {
  const char* types = kExpressionParams[code];
  const std::size_t declared = (types[0] != '-') + (types[1] != '-');
  ASSERT_EQ(instance.fetches.size(), declared) << "expression " << code;
  for (std::size_t i = 0; i < declared; ++i) {
    EXPECT_EQ(instance.fetches[i].first, i == 0) << "expression " << code;
    EXPECT_EQ(instance.fetches[i].typeFlag, types[i] == 'T' ? kFetchText : kFetchInteger)
        << "expression " << code << " parameter " << i;
    EXPECT_EQ(instance.fetches[i].token, kToken);
  }
}

TEST(CallingConventionTest, ExpressionsFetchEveryDeclaredParameterInOrder) {
  ASSERT_TRUE(Module::get().loaded()) << Module::get().error();
  Instance instance;
  instance.action(9, 4);  // a few elements, so that reads find something
  instance.action(8, "x");
  for (int code = 0; code < 60; ++code) {
    instance.expression(code, argsFor(kExpressionParams[code]));
    expectFetchesDeclared(instance, code);
  }
}

TEST(CallingConventionTest, WithoutAnArrayActionsDoNothingAndExpressionsAnswerZero) {
  ASSERT_TRUE(Module::get().loaded()) << Module::get().error();
  Instance instance(SetupRecord(), false);
  ASSERT_EQ(instance.elementArray(), nullptr);
  for (int code = 0; code < 79; ++code) {
    const char* types = kActionParams[code];
    Arg p1 = types[0] == 'T' ? Arg("nothing") : Arg(1);
    Arg p2 = types[1] == 'T' ? Arg("nothing") : Arg(1);
    EXPECT_EQ(instance.action(code, p1, p2), 0) << "action " << code;
  }
  for (int code = 0; code < 60; ++code) {
    instance.setFlags(0x0101);
    EXPECT_EQ(instance.expression(code, argsFor(kExpressionParams[code])), 0) << code;
    EXPECT_EQ(instance.flags(), 0x0101);
    EXPECT_TRUE(instance.allocations.empty());
    expectFetchesDeclared(instance, code);
  }
}

TEST(SetupRecordTest, DimensionsAndBoundaries) {
  for (int32_t count : {0, 4, -1, 7, 1}) {
    Instance instance(SetupRecord().set(kSetupDimensionCount, count).set(kSetupYBoundary, 6));
    EXPECT_EQ(instance.number(26), 1) << count;  // dim(
    EXPECT_EQ(instance.number(28), 0) << count;  // boundaryX(
    EXPECT_EQ(instance.number(29), 0) << count;  // boundaryY(
  }
  Instance zeroX(SetupRecord().set(kSetupXBoundary, 0));
  EXPECT_EQ(zeroX.number(26), 2);
  EXPECT_EQ(zeroX.number(28), 0);

  Instance twoD(SetupRecord().set(kSetupXBoundary, 6).set(kSetupYBoundary, 9));
  EXPECT_EQ(twoD.number(26), 2);
  EXPECT_EQ(twoD.number(28), 6);
  EXPECT_EQ(twoD.number(29), 0);  // the last dimension has no boundary

  Instance threeD(
      SetupRecord().set(kSetupDimensionCount, 3).set(kSetupXBoundary, 4).set(kSetupYBoundary, 5));
  EXPECT_EQ(threeD.number(26), 3);
  EXPECT_EQ(threeD.number(28), 4);
  EXPECT_EQ(threeD.number(29), 5);
  EXPECT_EQ(threeD.number(27, {2}), 5);

  Instance negative(
      SetupRecord().set(kSetupDimensionCount, 3).set(kSetupXBoundary, -2).set(kSetupYBoundary, 0));
  EXPECT_EQ(negative.number(28), 0);
  EXPECT_EQ(negative.number(29), 0);
}

TEST(SetupRecordTest, DelimiterModesAndBetweenColumn) {
  Instance empty(SetupRecord().delimiter(""));
  EXPECT_EQ(empty.text(51), ",");  // delimiter$(
  Instance semicolons(SetupRecord().delimiter(";;"));
  EXPECT_EQ(semicolons.text(51), ";;");
  SetupRecord unterminated;
  std::memset(unterminated.bytes.data() + kSetupListDelimiter, 'x', kSetupListDelimiterSize);
  Instance full(unterminated);
  EXPECT_EQ(full.text(51), std::string(kSetupListDelimiterSize, 'x'));

  // caseSensitive 7 means case sensitive; 0 insensitive.
  Instance sensitive(SetupRecord().set(kSetupCaseSensitive, 7));
  sensitive.action(8, "Abc");
  EXPECT_EQ(sensitive.number(12, {"abc", 0}), -1);  // findStr(
  EXPECT_EQ(sensitive.number(12, {"Abc", 0}), 0);
  Instance insensitive;
  insensitive.action(8, "Abc");
  EXPECT_EQ(insensitive.number(12, {"abc", 0}), 0);

  Instance wildcard(SetupRecord().set(kSetupWildcardSearch, -3));
  wildcard.action(8, "abc");
  EXPECT_EQ(wildcard.number(12, {"a*", 0}), 0);
  Instance literal;
  literal.action(8, "abc");
  EXPECT_EQ(literal.number(12, {"a*", 0}), -1);

  Instance between(SetupRecord(), false);
  writeAt<int32_t>(between.record(), kRunBetweenColumn, 77);
  between.create();
  EXPECT_EQ(between.betweenColumn(), 0);
  EXPECT_NE(between.elementArray(), nullptr);
}

TEST(ArrayRoutinesTest, EditsAndTextHandover) {
  Instance instance;
  EXPECT_EQ(instance.number(1), 25);  // capacity( of a new instance
  EXPECT_EQ(instance.number(0), 0);
  EXPECT_TRUE(instance.noText(2, {0}));  // get$( at size

  EXPECT_EQ(instance.action(9, 12), 0);  // Append value
  EXPECT_EQ(instance.text(2, {0}), "12");
  EXPECT_EQ(instance.number(3, {0}), 12);
  instance.action(9, 0);  // stored as None: the empty text, the number 0
  EXPECT_EQ(instance.text(2, {1}), "");
  EXPECT_EQ(instance.number(3, {1}), 0);
  instance.action(8, "hello");  // Append string
  EXPECT_EQ(instance.number(0), 3);
  EXPECT_EQ(instance.text(2, {2}), "hello");
  EXPECT_TRUE(instance.noText(2, {3}));
  EXPECT_TRUE(instance.noText(2, {-1}));

  instance.action(6, "first", 0);  // Insert string at
  instance.action(7, 5, 1);        // Insert value at
  EXPECT_EQ(instance.text(2, {0}), "first");
  EXPECT_EQ(instance.number(3, {1}), 5);
  EXPECT_EQ(instance.text(2, {2}), "12");
  EXPECT_EQ(instance.number(0), 5);
  instance.action(8, "sixth");  // on five elements it becomes element 5
  EXPECT_EQ(instance.text(2, {5}), "sixth");

  instance.action(13, "set", 2);  // Set string at
  instance.action(14, -7, 3);     // Set value at
  EXPECT_EQ(instance.text(2, {2}), "set");
  EXPECT_EQ(instance.number(3, {3}), -7);
  EXPECT_EQ(instance.text(2, {3}), "-7");

  instance.action(20, "key", 0);  // Set key string at
  instance.action(21, 42, 1);     // Set key value at
  EXPECT_EQ(instance.text(4, {0}), "key");
  EXPECT_EQ(instance.number(5, {1}), 42);
  EXPECT_EQ(instance.text(4, {1}), "42");
  EXPECT_EQ(instance.text(2, {0}), "first");  // the key read left the element alone

  instance.action(16, 0);  // Delete at
  EXPECT_EQ(instance.number(0), 5);
  EXPECT_EQ(instance.number(3, {0}), 5);
  instance.action(17);  // Delete all
  EXPECT_EQ(instance.number(0), 0);
  EXPECT_TRUE(instance.noText(2, {0}));
}

TEST(ArrayRoutinesTest, SettingsAndDimensions) {
  Instance instance(SetupRecord().set(kSetupDimensionCount, 1));
  instance.action(8, "Abc");
  instance.action(51);  // Case Sensitive
  EXPECT_EQ(instance.number(12, {"abc", 0}), -1);
  instance.action(50);  // Case Insensitive
  EXPECT_EQ(instance.number(12, {"abc", 0}), 0);
  instance.action(56);  // Wildcard
  EXPECT_EQ(instance.number(12, {"?bc", 0}), 0);
  instance.action(55);  // Literal
  EXPECT_EQ(instance.number(12, {"?bc", 0}), -1);
  instance.action(57, ";");  // Set list delimiter
  EXPECT_EQ(instance.text(51), ";");

  instance.action(28);  // Use 2D array
  EXPECT_EQ(instance.number(26), 2);
  instance.action(30, 1, 10);  // Set dimension boundary
  EXPECT_EQ(instance.number(28), 10);
  EXPECT_EQ(instance.number(31), 10);  // boundaryCol( is boundaryX(
  EXPECT_EQ(instance.number(27, {1}), 10);
  EXPECT_EQ(instance.number(35, {23}), 3);      // XOfIndex(
  EXPECT_EQ(instance.number(36, {23}), 2);      // YOfIndex(
  EXPECT_EQ(instance.number(34, {1, 23}), 3);   // dimIndexOfIndex$(
  EXPECT_EQ(instance.number(39, {3, 2}), 23);   // indexOfXY(
  EXPECT_EQ(instance.number(38, {"3;2"}), 23);  // indexOfDimIndex( with ";"
  EXPECT_EQ(instance.number(38, {"3,2"}), 3);

  instance.action(29);  // Use 3D array
  instance.action(30, 2, 4);
  EXPECT_EQ(instance.number(26), 3);
  EXPECT_EQ(instance.number(29), 4);
  EXPECT_EQ(instance.number(32), 4);  // boundaryRow(
  EXPECT_EQ(instance.number(30), instance.number(33));
  EXPECT_EQ(instance.number(37, {85}), 2);  // ZOfIndex( of 85 with X 10, Y 4

  instance.action(27, 2);  // Set array dimension
  instance.action(17);
  for (int32_t v = 1; v <= 4; ++v) instance.action(9, v);  // two rows of two
  instance.action(30, 1, 2);
  instance.action(31, 1, 3);  // Resize dimension boundary: rows keep their cells
  EXPECT_EQ(instance.number(0), 6);
  EXPECT_EQ(instance.number(3, {3}), 3);
  EXPECT_EQ(instance.number(3, {4}), 4);
  EXPECT_EQ(instance.number(3, {2}), 0);
}

}  // namespace
}  // namespace testhost
