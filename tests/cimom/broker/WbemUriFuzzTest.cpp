// Random paths survive writing and reading; random texts never do harm.
#include "Fixture.h"

#include <cimom/broker/WbemUri.h>

#include <random>

namespace cimom {
namespace {

class WbemUriFuzz : public BrokerTest {
 protected:
  std::uint64_t random(std::uint64_t below) {
    return std::uniform_int_distribution<std::uint64_t>(0, below - 1)(engine_);
  }

  std::string randomText() {
    static constexpr std::string_view characters = "ab\"\\,=.:/'() \t\n\x7f\xc3\xa4";
    std::string out;
    for (std::uint64_t size = random(12); size > 0; --size) {
      out += characters[random(characters.size())];
    }
    return out;
  }

  /// A value of the type out of all that it can have.
  CMPIValue randomValue(CMPIType type, unsigned depth) {
    CMPIValue value = number(engine_() >> random(64));
    if (type == CMPI_string) {
      value.string = newString(randomText().c_str());
    } else if (type == CMPI_dateTime) {
      value.dateTime = eft_->newDateTimeFromBinary(mb_, value.uint64 % 253402300800000000U, 0, nullptr);
    } else if (type == CMPI_ref) {
      value.ref = randomPath(depth + 1);
    } else if (type == CMPI_real32) {
      value.real32 = static_cast<float>(value.sint64) / 1000.0F;
    } else if (type == CMPI_real64) {
      value.real64 = static_cast<double>(value.sint64) / 1000.0;
    } else if (type == CMPI_boolean) {
      value.boolean &= 1U;
    }
    return value;
  }

  ObjectPath* randomPath(unsigned depth) {
    static const std::vector<std::string> nameSpaces = {"", "root", "root/cimv2", "root/a-b_c/d1"};
    static const std::vector<std::string> hosts = {"", "host", "10.0.0.1:5988", "[fe80::1]"};
    ObjectPath* const path =
        ObjectPath::create(request_.arena(), broker_.classes(), nameSpaces[random(4)], "Test_Keyed");
    path->setHostName(hosts[random(4)]);
    for (const auto& [name, type] : propertyTypes()) {
      const bool fits = type != CMPI_instance && (type != CMPI_ref || depth < 3);
      if (fits && random(2) == 0) {
        const CMPIValue value = randomValue(type, depth);
        EXPECT_EQ(path->addKey(name, &value, type), CMPI_RC_OK) << name;
      }
    }
    return path;
  }

  // Deterministic: a failure can be run again.
  std::mt19937_64 engine_{20240229};  // NOLINT(cert-msc32-c,cert-msc51-cpp)
};

TEST_F(WbemUriFuzz, WhatIsPrintedCanBeTypedBack) {
  for (int round = 0; round < 3000; ++round) {
    const ObjectPath& path = *randomPath(0);
    const std::string uri = formatWbemUri(path);
    const ObjectPath* read = nullptr;
    ASSERT_NO_THROW(read = parseWbemUri(request_.arena(), broker_.classes(), uri, {})) << uri;
    ASSERT_TRUE(samePath(path, *read)) << uri;
    ASSERT_EQ(read->nameSpace(), path.nameSpace()) << uri;
    ASSERT_EQ(read->hostName(), path.hostName()) << uri;
    for (const NamedValue& key : path.keys()) {
      ASSERT_EQ(read->find(key.name)->data.type, key.data.type) << uri;
    }
    ASSERT_EQ(formatWbemUri(*read), uri);
    request_.recycle();
  }
}

// Either an error, or a path that is written and read again as it is.
TEST_F(WbemUriFuzz, DamagedTextsDoNoHarm) {
  static constexpr std::string_view characters = "\"\\,=.:/'-+0aT_ \x01\xff";
  int paths = 0;
  int errors = 0;
  for (int round = 0; round < 20000; ++round) {
    std::string uri = formatWbemUri(*randomPath(2));
    for (std::uint64_t damage = random(3) + 1; damage > 0; --damage) {
      const std::uint64_t position = random(uri.size());
      if (random(3) == 0) {
        uri.erase(position, random(8));
      } else {
        uri.insert(position, 1, characters[random(characters.size())]);
      }
      if (uri.empty()) {
        uri = "C";
      }
    }
    try {
      const ObjectPath* const path = parseWbemUri(request_.arena(), broker_.classes(), uri, {});
      const std::string again = formatWbemUri(*path);
      ASSERT_EQ(formatWbemUri(*parseWbemUri(request_.arena(), broker_.classes(), again, {})), again) << uri;
      ++paths;
    } catch (const WbemUriError& error) {
      ASSERT_GE(error.column(), 1U) << uri;
      ASSERT_LE(error.column(), uri.size() + 1) << uri;
      ++errors;
    }
    request_.recycle();
  }
  EXPECT_GT(paths, 100);
  EXPECT_GT(errors, 100);
}

TEST_F(WbemUriFuzz, EveryPrefixDoesNoHarm) {
  const std::string uri =
      R"(//host/root/test:Test_Keyed.Reference="Test_Link.Left=\"C.K=\\\"x\\\"\"",Char16='\x20AC',Real64=-1.5e3)";
  for (std::size_t size = 0; size < uri.size(); ++size) {
    try {
      (void)parseWbemUri(request_.arena(), broker_.classes(), uri.substr(0, size), {});
    } catch (const WbemUriError& error) {
      EXPECT_LE(error.column(), size + 1);
    }
  }
  EXPECT_NO_THROW((void)parseWbemUri(request_.arena(), broker_.classes(), uri, {}));
}

}  // namespace
}  // namespace cimom
