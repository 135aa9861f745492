#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/config/DeferredErrorReporter.h>
#include <kelcore/config/Errors.h>
#include <kelcore/config/LocalizedError.h>
#include <kelcore/utility/ZString.h>

#include <limits>

#include "ConfigTestSupport.h"

namespace kelcore::config::testing {
namespace {

class ErrorsTest : public ConfigTest {
 protected:
  void Install() {
    Localizer::Set(&localizer_);
    ErrorManager::Set(&manager_);
  }
  DefaultLocalizer localizer_;
  DefaultErrorManager manager_;
};

template <class Function>
std::string LogicErrorText(Function function) {
  try {
    function();
  } catch (const std::logic_error& error) {
    return error.what();
  }
  return "no std::logic_error";
}

constexpr const char* kNoManager =
    "kel::config::ErrorManager not initialized. Check kel/config/Errors.";
constexpr const char* kNoLocalizer =
    "kelcore::config::Localizer not initialized. Check kelcore/config/Localizer.";

TEST_F(ErrorsTest, WithoutManagerOrLocalizerTheFixedLogicErrorsAreThrown) {
  EXPECT_EQ(LogicErrorText([] { TestThrowError(false); }), kNoManager);
  EXPECT_EQ(LogicErrorText([] { ErrorManager::Get(false); }), kNoManager);
  EXPECT_EQ(LogicErrorText([] { DeferredErrorReporter reporter(true); }), kNoManager);
  EXPECT_EQ(LogicErrorText([] { Localizer::Get(); }), kNoLocalizer);
  EXPECT_EQ(LogicErrorText([] { ZString("$$$/a/b=x"); }), kNoLocalizer);
  EXPECT_EQ(LogicErrorText([] { SubstituteErrorMessage("$$$/a/b=x", {}, {}, {}, {}); }),
            kNoLocalizer);
}

TEST_F(ErrorsTest, SelfTestsRaiseTheirErrorsThroughTheDefaultManager) {
  Install();
  try {
    TestThrowError(false);
    FAIL() << "no exception";
  } catch (const LocalizedError& error) {
    EXPECT_STREQ(error.what(),
                 "This is a non-fatal exception. int:-2147483648, uint:4294967295, double:29.2334");
    EXPECT_EQ(error.GetLevel(), kErrorLevelNonFatal);
    EXPECT_EQ(error.GetComponent(), 100u);
    EXPECT_EQ(error.GetErrorNumber(), 20);
    EXPECT_EQ(error.GetKey().rfind("$$$/kelcore/config/Error/test/nonfataltest=", 0), 0u);
  }
  try {
    TestThrowError(true);
    FAIL() << "no exception";
  } catch (const LocalizedError& error) {
    EXPECT_EQ(error.GetLocalizedMessage(), U16("This is a fatal exception."));
    EXPECT_EQ(error.GetLevel(), kErrorLevelFatal);
    EXPECT_EQ(error.GetErrorNumber(), 21);
  }
}

TEST_F(ErrorsTest, DefaultManagerDefersWhileAReporterLivesAndFinishRaises) {
  Install();
  DeferredErrorReporter reporter(true);
  EXPECT_NO_THROW(TestThrowError(true));
  EXPECT_THROW(ThrowError(kErrorLevelNonFatal, "$$$/t/now=Now", 100, 1, false), LocalizedError);
  EXPECT_EQ(reporter.GetErrorCount(), 1u);
  try {
    reporter.Finish();
    FAIL() << "Finish did not raise";
  } catch (const LocalizedError& error) {
    EXPECT_STREQ(error.what(), "This is a fatal exception.");
  }
}

// Substitution vectors: the first four from the error model's edge cases.
TEST_F(ErrorsTest, SubstitutionFillsFirstOccurrencesInOrder) {
  Localizer::Set(&localizer_);
  struct Case {
    const char* key;
    ReplacementValue v1, v2, v3, v4;
    const char* expected;
  };
  const Case cases[] = {
      {"$$$/t/twice=^1 and ^1", 5, {}, {}, {}, "5 and ^1"},
      {"$$$/t/chain=[^1]", U16("^2"), 7, {}, {}, "[7]"},
      {"$$$/t/chainlater=^2 ^1", U16("^3"), U16("x"), U16("y"), {}, "x y"},
      {"$$$/t/none=^1 ^2", {}, U16("b"), {}, {}, "^1 b"},
      {"$$$/t/missing=no placeholders", 1, 2, 3, 4, "no placeholders"},
      {"$$$/t/order=^4^3^2^1", 1, 2, 3, 4, "4321"},
      {"$$$/t/caret=^^1^", 9, {}, {}, {}, "^9^"},
      {"$$$/t/numbers=^1|^2|^3|^4", std::numeric_limits<long long>::min(),
       std::numeric_limits<unsigned long long>::max(), 1e20, 0.1 + 0.2,
       "-9223372036854775808|18446744073709551615|1e+20|0.3"},
      {"$$$/t/utf8=caf\xC3\xA9 ^1", U16("\xE2\x82\xAC"), {}, {}, {}, "caf\xC3\xA9 \xE2\x82\xAC"},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(U8(SubstituteErrorMessage(c.key, c.v1, c.v2, c.v3, c.v4)), c.expected) << c.key;
  }
}

TEST_F(ErrorsTest, ZStringFillsEveryAtPlaceholderFromItsArguments) {
  Localizer::Set(&localizer_);
  EXPECT_EQ(ZString("$$$/t/z=@1 @0 @1 @9", U16("a"), U16("b")), U16("b a b "));
}

TEST(ReplacementValueTest, CopiesOwnTheirStrings) {
  ReplacementValue original(U16("text"));
  ReplacementValue copy(original);
  ReplacementValue assigned(5);
  assigned = original;
  original = ReplacementValue(2.5);
  EXPECT_EQ(copy.GetKind(), kReplacementString);
  EXPECT_EQ(copy.GetString(), U16("text"));
  EXPECT_EQ(assigned.GetString(), U16("text"));
  EXPECT_EQ(assigned.GetSigned(), 0);
  EXPECT_EQ(original.GetString(), UTF16String());
  EXPECT_EQ(original.GetDouble(), 2.5);

  ReplacementValue& self = copy;
  copy = self;
  EXPECT_EQ(copy.GetString(), U16("text"));

  ReplacementValue moved(std::move(copy));
  EXPECT_EQ(moved.GetString(), U16("text"));
  EXPECT_EQ(copy.GetKind(), kReplacementNone);  // NOLINT(bugprone-use-after-move)
}

TEST(ReplacementValueTest, ConstructorsPickTheKindAndFormatPlainly) {
  EXPECT_EQ(ReplacementValue(-1L).GetSigned(), -1);
  EXPECT_EQ(ReplacementValue(-1L).GetKind(), kReplacementSigned);
  EXPECT_EQ(ReplacementValue(4294967295UL).GetKind(), kReplacementUnsigned);
  EXPECT_EQ(ReplacementValue(1234567).Format(), U16("1234567"));
  EXPECT_EQ(ReplacementValue(29.2334).Format(), U16("29.2334"));
  EXPECT_EQ(ReplacementValue(1234567.0).Format(), U16("1.23457e+06"));
  EXPECT_EQ(ReplacementValue().Format(), UTF16String());
  EXPECT_EQ(ReplacementValue(static_cast<const UTF16Char*>(nullptr)).GetString(), UTF16String());

  ReplacementValue fresh;
  fresh.Init();
  EXPECT_EQ(fresh.GetKind(), kReplacementNone);
}

}  // namespace
}  // namespace kelcore::config::testing
