#include "Operations.h"

#include <cimom/QueryText.h>

namespace {

using cimom::classOfQuery;
using operations_test::Answer;
using operations_test::Operations;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class Queries : public Operations {};

TEST_F(Queries, goToTheProviderOfTheClassAfterFrom) {
  const Answer answer = query("WQL", "select * FROM test_record where Name = 'x'");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK) << answer.outcome.status.description;
  EXPECT_TRUE(answer.outcome.done);
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Record found 1", "TEST_Single found 2"));
  EXPECT_THAT(log_.all(), ElementsAre("call: query root/test:TEST_Record in WQL: select * FROM test_record "
                                      "where Name = 'x'"));
}

// Which languages a provider understands only the provider can tell.
TEST_F(Queries, goToTheProviderInAnyLanguage) {
  const Answer answer = query("mumble", "FROM TEST_Record");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
  EXPECT_EQ(answer.outcome.status.description, "no mumbling");
}

TEST_F(Queries, withoutAClassAreTheObjectManagersToRefuse) {
  const auto expectStatus = [](const Answer& answer, CMPIrc code, const std::string& reason) {
    EXPECT_EQ(answer.outcome.status.code, code);
    EXPECT_THAT(answer.outcome.status.description, HasSubstr(reason));
    EXPECT_THAT(answer.objects, IsEmpty());
  };
  expectStatus(query("WQL", "select everything"), CMPI_RC_ERR_INVALID_QUERY, "no class");
  expectStatus(query("DMTF:CQL", "select * from TEST_None"), CMPI_RC_ERR_INVALID_QUERY,
               "the schema has no class TEST_None");
  expectStatus(query("mumble", "hm, hm"), CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED, "'mumble'");
  expectStatus(query("mumble", "hm, hm", "root/none"), CMPI_RC_ERR_INVALID_NAMESPACE, "root/none");
  expectStatus(query("WQL", "select * from TEST_Record", "root/none"), CMPI_RC_ERR_INVALID_NAMESPACE,
               "root/none");
  expectStatus(query("WQL", "select * from TEST_Unserved"), CMPI_RC_ERR_NOT_SUPPORTED, "TEST_Unserved");
  expectStatus(query("WQL", "select * from TEST_Idle"), CMPI_RC_ERR_NOT_SUPPORTED, "Idle has no function");
}

TEST(QueryText, hasItsClassAfterFrom) {
  EXPECT_EQ(classOfQuery("SELECT * FROM A_b1"), "A_b1");
  EXPECT_EQ(classOfQuery("from\n\tA,B"), "A");
  EXPECT_EQ(classOfQuery("SELECT A.FROM2, 'FROM X' , \"from \\\" Y\" FROM(Z)"), "");
  EXPECT_EQ(classOfQuery("SELECT 'it\\'s FROM X' FROM Z"), "Z");
  EXPECT_EQ(classOfQuery("SELECT * FROM"), "");
  EXPECT_EQ(classOfQuery("SELECT * FROM 'A"), "");
  EXPECT_EQ(classOfQuery("SELECT 'A\\"), "");
  EXPECT_EQ(classOfQuery(""), "");
}

}  // namespace
