#include "Fixture.h"

#include <ctime>

namespace cimom {
namespace {

class DateTimeTest : public BrokerTest {
 protected:
  CMPIDateTime* fromChars(const char* text, CMPIStatus* status = nullptr) {
    return eft_->newDateTimeFromChars(mb_, text, status);
  }
  CMPIDateTime* fromBinary(CMPIUint64 microseconds, bool isInterval, CMPIStatus* status = nullptr) {
    return eft_->newDateTimeFromBinary(mb_, microseconds, isInterval ? 1 : 0, status);
  }
  static std::string textOf(const CMPIDateTime* time) {
    return BrokerTest::textOf(time->ft->getStringFormat(time, nullptr));
  }
};

class ValidDateTimeText : public DateTimeTest, public testing::WithParamInterface<const char*> {};

TEST_P(ValidDateTimeText, IsKeptAsItIs) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIDateTime* const time = fromChars(GetParam(), &status);
  ASSERT_NE(time, nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(textOf(time), GetParam());
  EXPECT_EQ(time->ft->isInterval(time, &status) != 0, std::string_view(GetParam())[21] == ':');
}

INSTANTIATE_TEST_SUITE_P(Forms, ValidDateTimeText,
                         testing::Values("20240229000000.000000+000", "20000229235959.999999-720",
                                         "00000101000000.000000+000", "99991231235959.999999+999",
                                         "202402291234**.******+060", "2024**********.******+000",
                                         "20240229123456.123***+060", "20240229123456.******+060",
                                         "00000000000000.000000:000", "99999999235959.999999:000",
                                         "00000007******.******:000", "00000007010203.4*****:000"));

class InvalidDateTimeText : public DateTimeTest, public testing::WithParamInterface<const char*> {};

TEST_P(InvalidDateTimeText, IsRefused) {
  CMPIStatus status{};
  EXPECT_EQ(fromChars(GetParam(), &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

INSTANTIATE_TEST_SUITE_P(
    Forms, InvalidDateTimeText,
    testing::Values("", "2024", "20240229000000.000000+0000", "20240229000000.000000+00",
                    "20230229000000.000000+000",                               // no leap year
                    "19000229000000.000000+000",                               // nor this
                    "20241301000000.000000+000", "20240001000000.000000+000",  // months
                    "20240431000000.000000+000", "20240400000000.000000+000",  // days
                    "20240229240000.000000+000", "20240229006000.000000+000", "20240229000060.000000+000",
                    "20240229000000,000000+000", "20240229000000.000000 000", "20240229000000.000000*000",
                    "20240229000000.000000+***", "2024022900000x.000000+000", "-0240229000000.000000+000",
                    "2024**29000000.000000+000",  // a known field after an unknown one
                    "2024022912345*.000000+000",  // half a field
                    "202402291234**.000000+000",
                    "20240229123456.12*456+000",  // known digits after unknown ones
                    "**************.******+000",  // nothing known
                    "00000000000000.000000:001", "00000000240000.000000:000", "********000000.000000:000",
                    "00000000006000.000000:000", "0000000x000000.000000:000"));

TEST_F(DateTimeTest, NoTextIsRefused) {
  CMPIStatus status{};
  EXPECT_EQ(fromChars(nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

struct BinaryForm {
  const char* text;
  CMPIUint64 microseconds;
};

TEST_F(DateTimeTest, TextsHaveBinaryForms) {
  // Computed with `date -u -d ... +%s`.
  const BinaryForm forms[] = {{"19700101000000.000000+000", 0},
                              {"19700101000001.000002+000", 1000002},
                              {"20240229123456.123456+000", 1709210096123456},
                              {"20240229133456.123456+060", 1709210096123456},
                              {"20240229113456.123456-060", 1709210096123456},
                              {"2024**********.******+000", 1704067200000000},
                              {"00000000000000.000001:000", 1},
                              {"00000001020304.000005:000", 93784000005},
                              {"00000001******.******:000", 86400000000}};
  for (const BinaryForm& form : forms) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    const CMPIDateTime* const time = fromChars(form.text);
    EXPECT_EQ(time->ft->getBinaryFormat(time, &status), form.microseconds) << form.text;
    EXPECT_EQ(status.rc, CMPI_RC_OK);
  }
}

TEST_F(DateTimeTest, ATimeBefore1970HasNoBinaryForm) {
  for (const char* text : {"19691231235959.999999+000", "19700101000000.000000+001"}) {
    CMPIStatus status{};
    const CMPIDateTime* const time = fromChars(text);
    EXPECT_EQ(time->ft->getBinaryFormat(time, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
  }
}

TEST_F(DateTimeTest, BinaryFormsHaveTexts) {
  EXPECT_EQ(textOf(fromBinary(1709210096123456, false)), "20240229123456.123456+000");
  EXPECT_EQ(textOf(fromBinary(0, false)), "19700101000000.000000+000");
  EXPECT_EQ(textOf(fromBinary(93784000005, true)), "00000001020304.000005:000");
  EXPECT_EQ(textOf(fromBinary(253402300799999999U, false)), "99991231235959.999999+000");
  EXPECT_EQ(textOf(fromBinary(8639999999999999999U, true)), "99999999235959.999999:000");
}

TEST_F(DateTimeTest, BinaryFormsBeyondTheTextsAreRefused) {
  for (const auto& [microseconds, isInterval] :
       {std::pair{253402300800000000U, false}, {8640000000000000000U, true}, {~CMPIUint64{0}, true}}) {
    CMPIStatus status{};
    EXPECT_EQ(fromBinary(microseconds, isInterval, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
  }
}

// Every day of four centuries there and back, each at another time of day.
TEST_F(DateTimeTest, BinaryAndTextAgree) {
  for (CMPIUint64 day = 0; day < 146097; ++day) {
    const CMPIUint64 microseconds = day * 86400000000U + day * 590000U;
    const CMPIDateTime* const time = fromBinary(microseconds, false);
    ASSERT_EQ(fromChars(textOf(time).c_str())->ft->getBinaryFormat(time, nullptr), microseconds);
    if (day % 1000 == 0) {
      request_.recycle();
    }
  }
}

TEST_F(DateTimeTest, NowIsNow) {
  const auto before = static_cast<CMPIUint64>(std::time(nullptr)) * 1000000;
  const CMPIDateTime* const time = eft_->newDateTime(mb_, nullptr);
  const auto after = static_cast<CMPIUint64>(std::time(nullptr) + 1) * 1000000;
  EXPECT_GE(time->ft->getBinaryFormat(time, nullptr), before);
  EXPECT_LE(time->ft->getBinaryFormat(time, nullptr), after);
  EXPECT_EQ(time->ft->isInterval(time, nullptr), 0);
}

}  // namespace
}  // namespace cimom
