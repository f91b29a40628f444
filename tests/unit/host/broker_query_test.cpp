// Select expressions: what is parsed, what is true, and the normal forms.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

class BrokerQuery : public BrokerTest {
  protected:
    BrokerQuery() {
        instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
        CMPIValue value{};
        value.uint32 = 42;
        instance->ft->setProperty(instance, "Count", &value, CMPI_uint32);
        instance->ft->setProperty(instance, "Name", chars("Emulex HBA"), CMPI_chars);
        value.boolean = 1;
        instance->ft->setProperty(instance, "Enabled", &value, CMPI_boolean);
        value.real64 = 2.5;
        instance->ft->setProperty(instance, "Load", &value, CMPI_real64);
        value.uint64 = ~0ULL;
        instance->ft->setProperty(instance, "Bytes", &value, CMPI_uint64);
    }

    CMPISelectExp *parse(const std::string &text, const char *language = "WQL") {
        return make().newSelectExp(cmpi, text.c_str(), language, nullptr, &status);
    }
    bool holds(const std::string &condition) {
        const CMPISelectExp *query = parse("SELECT * FROM Test_Base WHERE " + condition);
        EXPECT_NE(query, nullptr) << condition << ": " << text(status.msg);
        return query != nullptr && query->ft->evaluate(query, instance, &status) == 1;
    }
    // `a=1 b<>2 | c<3`: comparisons of a row side by side, rows apart by bars.
    std::string form(const CMPISelectCond *condition) {
        std::string result;
        const CMPICount rows = condition->ft->getCountAndType(condition, nullptr, nullptr);
        for (CMPICount i = 0; i < rows; ++i) {
            const CMPISubCond *row = condition->ft->getSubCondAt(condition, i, nullptr);
            result += i > 0 ? " |" : "";
            for (CMPICount j = 0; j < row->ft->getCount(row, nullptr); ++j) {
                result += ' ' + comparison(row->ft->getPredicateAt(row, j, nullptr));
            }
        }
        return result;
    }
    std::string comparison(const CMPIPredicate *predicate) {
        static const char *const kSigns[] = {
            "?", "=", "<>", "<", ">=", ">", "<=", "isa", "!isa", "like", "!like", "!null", "null"};
        CMPIType type = 0;
        CMPIPredOp op{};
        CMPIString *left = nullptr;
        CMPIString *right = nullptr;
        predicate->ft->getData(predicate, &type, &op, &left, &right);
        return text(left) + kSigns[op] + text(right);
    }

    CMPIInstance *instance;
    CMPIStatus status{};
};

TEST_F(BrokerQuery, ProjectionHasTheSelectedNames) {
    CMPIArray *projection = nullptr;
    const CMPISelectExp *query = make().newSelectExp(cmpi, "select Name, Count from Test_Service",
                                                     "WQL", &projection, &status);
    ASSERT_NE(query, nullptr);
    ASSERT_NE(projection, nullptr);
    EXPECT_EQ(projection->ft->getSize(projection, nullptr), 2U);
    EXPECT_EQ(text(projection->ft->getElementAt(projection, 1, nullptr)), "Count");
    EXPECT_EQ(text(query->ft->getString(query, nullptr)), "select Name, Count from Test_Service");
}

TEST_F(BrokerQuery, StarHasNoProjection) {
    CMPIArray *projection = make().newArray(cmpi, 1, CMPI_string, nullptr);
    make().newSelectExp(cmpi, "SELECT * FROM Test_Service", "WQL", &projection, nullptr);
    EXPECT_EQ(projection, nullptr);
}

TEST_F(BrokerQuery, UnknownLanguageIsNotSupported) {
    EXPECT_EQ(parse("SELECT * FROM Test_Base", "SQL"), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
}

TEST_F(BrokerQuery, InvalidTextsAreRefusedWithTheCause) {
    for (const char *query :
         {"", "SELECT", "SELECT *", "SELECT * FROM", "SELECT , FROM A", "SELECT * FROM A WHERE",
          "SELECT * FROM A WHERE x", "SELECT * FROM A WHERE x =", "SELECT * FROM A WHERE x = y",
          "SELECT * FROM A WHERE x = 'open", "SELECT * FROM A WHERE (x = 1",
          "SELECT * FROM A WHERE x = 1 y", "SELECT * FROM A WHERE x IS 1",
          "SELECT * FROM A WHERE NOT", "SELECT * FROM A; DROP"}) {
        EXPECT_EQ(parse(query), nullptr) << query;
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_QUERY) << query;
        EXPECT_NE(text(status.msg), "") << query;
    }
}

TEST_F(BrokerQuery, DeepOrLongTextsAreRefused) {
    const std::string start = "SELECT * FROM A WHERE ";
    EXPECT_EQ(parse(start + std::string(5000, '(') + "x = 1"), nullptr);
    EXPECT_EQ(parse(start + "x = '" + std::string(20000, 'x') + "'"), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_QUERY);
}

TEST_F(BrokerQuery, NumbersAreCompared) {
    EXPECT_TRUE(holds("Count = 42"));
    EXPECT_TRUE(holds("count <> 41"));
    EXPECT_TRUE(holds("Count != 41"));
    EXPECT_TRUE(holds("Count > 41 AND Count >= 42 AND Count < 43 AND Count <= 42"));
    EXPECT_FALSE(holds("Count < 42"));
    EXPECT_TRUE(holds("Load > 2.25"));
    EXPECT_TRUE(holds("Bytes > 9"));
    EXPECT_TRUE(holds("Count > -1"));
}

TEST_F(BrokerQuery, TextsAndBooleansAreCompared) {
    EXPECT_TRUE(holds("Name = 'Emulex HBA'"));
    EXPECT_TRUE(holds("Name = \"Emulex HBA\""));
    EXPECT_FALSE(holds("Name = 'emulex hba'"));
    EXPECT_TRUE(holds("Enabled = TRUE"));
    EXPECT_FALSE(holds("Enabled = false"));
}

TEST_F(BrokerQuery, DifferentTypesHaveNoOrder) {
    EXPECT_FALSE(holds("Name = 42"));
    EXPECT_FALSE(holds("Count = '42'"));
    EXPECT_FALSE(holds("Enabled = 1"));
    EXPECT_FALSE(holds("Count <> 'x'"));
}

TEST_F(BrokerQuery, LikeKnowsRunsAndSingleCharacters) {
    EXPECT_TRUE(holds("Name LIKE 'Emulex%'"));
    EXPECT_TRUE(holds("Name LIKE '%HBA'"));
    EXPECT_TRUE(holds("Name LIKE '%x_H%'"));
    EXPECT_FALSE(holds("Name LIKE 'HBA%'"));
    EXPECT_FALSE(holds("Name LIKE ''"));
}

TEST_F(BrokerQuery, NullsAreAskedForByName) {
    EXPECT_TRUE(holds("Caption IS NULL"));
    EXPECT_TRUE(holds("Nope IS NULL"));
    EXPECT_TRUE(holds("Name IS NOT NULL"));
    EXPECT_FALSE(holds("Caption = ''"));
}

TEST_F(BrokerQuery, IsaAndFromFollowSuperclasses) {
    EXPECT_TRUE(holds("this ISA Test_Base"));
    EXPECT_FALSE(holds("this ISA Test_Link"));
    const CMPISelectExp *query = parse("SELECT * FROM Test_Link");
    EXPECT_EQ(query->ft->evaluate(query, instance, nullptr), 0);
}

TEST_F(BrokerQuery, OperatorsBindAsInSql) {
    EXPECT_TRUE(holds("Count = 42 OR Count = 1 AND Name = 'x'"));
    EXPECT_FALSE(holds("(Count = 42 OR Count = 1) AND Name = 'x'"));
    EXPECT_TRUE(holds("NOT Count = 1 AND NOT (Count = 2 OR Count = 3)"));
}

TEST_F(BrokerQuery, NormalFormsMultiplyOut) {
    const CMPISelectExp *query =
        parse("SELECT * FROM A WHERE (a = 1 OR b = 2) AND NOT (c < 3 AND d LIKE 'x')");
    const CMPISelectCond *disjunctive = query->ft->getDOC(query, &status);
    int kind = -1;
    EXPECT_EQ(disjunctive->ft->getCountAndType(disjunctive, &kind, nullptr), 4U);
    EXPECT_EQ(kind, CMPI_COND_DOC);
    EXPECT_EQ(form(disjunctive), " a=1 c>=3 | a=1 d!likex | b=2 c>=3 | b=2 d!likex");
    const CMPISelectCond *conjunctive = query->ft->getCOD(query, &status);
    EXPECT_EQ(conjunctive->ft->getCountAndType(conjunctive, &kind, nullptr), 2U);
    EXPECT_EQ(kind, CMPI_COND_COD);
    EXPECT_EQ(form(conjunctive), " a=1 b=2 | c>=3 d!likex");
}

TEST_F(BrokerQuery, NormalFormsThatGrowTooLongAreRefused) {
    std::string text = "SELECT * FROM A WHERE (a = 1 OR b = 2)";
    for (int i = 0; i < 20; ++i) {
        text += " AND (a = 1 OR b = 2)";
    }
    const CMPISelectExp *query = parse(text);
    EXPECT_EQ(query->ft->getDOC(query, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_NE(query->ft->getCOD(query, &status), nullptr);
}

TEST_F(BrokerQuery, EntriesOutOfRangeAreNull) {
    const CMPISelectExp *query = parse("SELECT * FROM A WHERE a = 1");
    const CMPISelectCond *condition = query->ft->getDOC(query, nullptr);
    EXPECT_EQ(condition->ft->getSubCondAt(condition, 1, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    const CMPISubCond *row = condition->ft->getSubCondAt(condition, 0, nullptr);
    EXPECT_EQ(row->ft->getPredicateAt(row, 1, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
}

TEST_F(BrokerQuery, AccessorsAndNamedPredicatesAreNotSupported) {
    const CMPISelectExp *query = parse("SELECT * FROM A WHERE a = 1");
    query->ft->evaluateUsingAccessor(query, nullptr, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    const CMPISelectCond *condition = query->ft->getDOC(query, nullptr);
    const CMPISubCond *row = condition->ft->getSubCondAt(condition, 0, nullptr);
    EXPECT_EQ(row->ft->getPredicate(row, "a", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    const CMPIPredicate *predicate = row->ft->getPredicateAt(row, 0, nullptr);
    predicate->ft->evaluateUsingAccessor(predicate, nullptr, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(BrokerQuery, CloneIsReleasedByItsTaker) {
    CMPISelectExp *copy = parse("SELECT * FROM Test_Base WHERE Count = 42");
    copy = copy->ft->clone(copy, nullptr);
    EXPECT_EQ(copy->ft->evaluate(copy, instance, nullptr), 1);
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
}

}  // namespace
}  // namespace velkhost::broker::testing
