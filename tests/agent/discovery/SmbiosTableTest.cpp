#include "SmbiosBuilder.h"

#include <agent/discovery/dmi/SmbiosEntryPoint.h>
#include <agent/discovery/dmi/SmbiosStructures.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

using namespace smbios;
using testing::ElementsAre;

constexpr const char* threeStructures = R"(
  1 @0x0100: 1b 2b | Corvane | Rack 7
  2 @0x0200: 0x1234w
  end
)";

std::vector<int> typesOf(TableReader& reader) {
  std::vector<int> types;
  while (const auto structure = reader.next()) {
    types.push_back(structure->type());
  }
  return types;
}

/// In a block of its own, so that the sanitizers see a read beyond it.
class Exact {
 public:
  explicit Exact(std::string_view bytes) : bytes_(bytes.begin(), bytes.end()) {}
  [[nodiscard]] Bytes bytes() const { return std::as_bytes(std::span(bytes_)); }

 private:
  std::vector<char> bytes_;
};

TEST(SmbiosTable, GivesEachStructureWithItsFieldsAndStrings) {
  const Exact table(smbiosTable(threeStructures));
  TableReader reader(table.bytes());
  const auto first = reader.next();
  ASSERT_TRUE(first);
  EXPECT_EQ(first->type(), 1);
  EXPECT_EQ(first->handle(), 0x0100);
  EXPECT_EQ(first->length(), 6U);
  EXPECT_EQ(first->stringAt(4), "Corvane");
  EXPECT_EQ(first->stringAt(5), "Rack 7");
  EXPECT_EQ(first->stringAt(6), std::nullopt) << "beyond the structure";
  const auto second = reader.next();
  ASSERT_TRUE(second);
  EXPECT_EQ(second->at<std::uint16_t>(4), 0x1234);
  EXPECT_EQ(second->at<std::uint8_t>(5), 0x12);
  EXPECT_EQ(second->at<std::uint16_t>(5), std::nullopt) << "its second byte is beyond the structure";
  EXPECT_EQ(second->at<std::uint64_t>(0xffffffffffffffff), std::nullopt);
  EXPECT_EQ(second->stringAt(4), std::nullopt) << "a number of a string where there are none";
  EXPECT_EQ(reader.end(), TableReader::End::None);
  EXPECT_EQ(reader.next()->type(), TableReader::endMarker);
  EXPECT_FALSE(reader.next());
  EXPECT_EQ(reader.end(), TableReader::End::Marker);
  EXPECT_EQ(reader.count(), 3U);
  EXPECT_EQ(reader.offset(), table.bytes().size());
}

TEST(SmbiosTable, AStringNumberBeyondTheStringsIsAbsent) {
  const Exact table(smbiosTable("1 @1: 0b 1b 2b 3b 255b | one | two"));
  const auto structure = TableReader(table.bytes()).next();
  ASSERT_TRUE(structure);
  EXPECT_EQ(structure->stringAt(4), std::nullopt);
  EXPECT_EQ(structure->stringAt(5), "one");
  EXPECT_EQ(structure->stringAt(6), "two");
  EXPECT_EQ(structure->stringAt(7), std::nullopt);
  EXPECT_EQ(structure->stringAt(8), std::nullopt);
}

TEST(SmbiosTable, WithoutAnEndMarkerItEndsWithItsBytes) {
  const Exact table(smbiosTable("1 @1:\n2 @2: 1b | one"));
  TableReader reader(table.bytes());
  EXPECT_THAT(typesOf(reader), ElementsAre(1, 2));
  EXPECT_EQ(reader.end(), TableReader::End::NoMarker);
  const Exact empty("");
  TableReader none(empty.bytes());
  EXPECT_FALSE(none.next());
  EXPECT_EQ(none.end(), TableReader::End::NoMarker);
}

TEST(SmbiosTable, CutAnywhereItGivesWhatIsWholeAndSaysSo) {
  const std::string whole = smbiosTable(threeStructures);
  const std::size_t first = smbiosTable("1 @0x0100: 1b 2b | Corvane | Rack 7").size();
  const std::size_t second = first + smbiosTable("2 @0x0200: 0x1234w").size();
  for (std::size_t length = 0; length < whole.size(); ++length) {
    const Exact table(std::string_view(whole).substr(0, length));
    TableReader reader(table.bytes());
    const std::size_t expected = length < first ? 0 : length < second ? 1 : 2;
    EXPECT_EQ(typesOf(reader).size(), expected) << length;
    const bool isBetween = length == 0 || length == first || length == second;
    EXPECT_EQ(reader.end(), isBetween ? TableReader::End::NoMarker : TableReader::End::CutShort) << length;
    EXPECT_EQ(reader.offset(), expected == 0 ? 0 : expected == 1 ? first : second) << length;
  }
}

TEST(SmbiosTable, JunkBehindTheLastStructureIsNotTaken) {
  const std::string structure = smbiosTable("1 @1: 1b | one");
  for (const std::string& junk : {std::string(64, '\0'), std::string("\x05\x03\x00\x00\x00\x00", 6),
                                  std::string("\x00\x00\x50\x00\x06\x00\x00\x00", 8)}) {
    const Exact table(structure + junk);
    TableReader reader(table.bytes());
    EXPECT_THAT(typesOf(reader), ElementsAre(1));
    EXPECT_EQ(reader.end(), TableReader::End::NotAStructure);
    EXPECT_EQ(reader.offset(), structure.size());
  }
  const Exact table(structure + std::string(64, '\xff'));
  TableReader reader(table.bytes());
  EXPECT_THAT(typesOf(reader), ElementsAre(1));
  EXPECT_EQ(reader.end(), TableReader::End::CutShort) << "a structure of 255 bytes where there are 64";
}

TEST(SmbiosTable, NothingBehindTheEndMarkerIsTaken) {
  const std::string whole = smbiosTable(threeStructures);
  const Exact table(whole + smbiosTable("0 @9: 1b | not this one"));
  TableReader reader(table.bytes());
  EXPECT_THAT(typesOf(reader), ElementsAre(1, 2, 127));
  EXPECT_EQ(reader.offset(), whole.size());
}

TEST(SmbiosTable, TheCountOfTheEntryPointBoundsIt) {
  const Exact table(smbiosTable("1 @1:\n2 @2:\n3 @3:"));
  TableReader reader(table.bytes(), 2);
  EXPECT_THAT(typesOf(reader), ElementsAre(1, 2));
  EXPECT_EQ(reader.end(), TableReader::End::Counted);
}

TEST(SmbiosEntryPoint, Of32BitsTellsLengthAndCount) {
  const Exact bytes(entryPoint32(2, 8, 1234, 17));
  const auto outcome = parseEntryPoint(bytes.bytes());
  ASSERT_TRUE(outcome.entryPoint) << outcome.error;
  EXPECT_EQ(outcome.entryPoint->major, 2U);
  EXPECT_EQ(outcome.entryPoint->minor, 8U);
  EXPECT_EQ(outcome.entryPoint->tableLength, 1234U);
  EXPECT_EQ(outcome.entryPoint->structures, 17);
}

TEST(SmbiosEntryPoint, Of32BitsMayClaimVersion3AndTheLengthOfVersion21) {
  EXPECT_EQ(parseEntryPoint(bytesOf(entryPoint32(3, 2, 1, 1))).entryPoint->major, 3U);
  std::string mistaken = entryPoint32(2, 1, 1234, 17);
  mistaken.pop_back();
  mistaken[0x04] =
      static_cast<char>(mistaken[0x04] + 1 + 0x21);  // what the length and the revision were more
  mistaken[0x05] = 0x1e;
  const Exact bytes(mistaken);
  const auto outcome = parseEntryPoint(bytes.bytes());
  ASSERT_TRUE(outcome.entryPoint) << outcome.error;
  EXPECT_EQ(outcome.entryPoint->structures, 17);
}

TEST(SmbiosEntryPoint, Of64BitsTellsNoCount) {
  const Exact bytes(entryPoint64(3, 7, 100000));
  const auto outcome = parseEntryPoint(bytes.bytes());
  ASSERT_TRUE(outcome.entryPoint) << outcome.error;
  EXPECT_EQ(outcome.entryPoint->major, 3U);
  EXPECT_EQ(outcome.entryPoint->minor, 7U);
  EXPECT_EQ(outcome.entryPoint->tableLength, 100000U);
  EXPECT_EQ(outcome.entryPoint->structures, std::nullopt);
}

TEST(SmbiosEntryPoint, TheOldOneHasItsVersionInTwoDigits) {
  const Exact bytes(entryPoint32(2, 0, 99, 3).substr(0x10));
  const auto outcome = parseEntryPoint(bytes.bytes());
  ASSERT_TRUE(outcome.entryPoint) << outcome.error;
  EXPECT_EQ(outcome.entryPoint->major, 2U);
  EXPECT_EQ(outcome.entryPoint->minor, 0U);
  EXPECT_EQ(outcome.entryPoint->tableLength, 99U);
  EXPECT_EQ(outcome.entryPoint->structures, 3);
}

TEST(SmbiosEntryPoint, DamagedOrCutShortItIsNone) {
  for (const std::string& whole : {entryPoint32(2, 8, 99, 3), entryPoint64(3, 0, 99)}) {
    for (std::size_t length = 0; length < whole.size(); ++length) {
      const Exact bytes(std::string_view(whole).substr(0, length));
      const auto outcome = parseEntryPoint(bytes.bytes());
      EXPECT_FALSE(outcome.entryPoint) << length;
      EXPECT_NE(outcome.error, "") << length;
    }
    for (std::size_t place = 0; place < whole.size(); ++place) {
      std::string damaged = whole;
      damaged[place] = static_cast<char>(damaged[place] ^ 0x40);
      EXPECT_FALSE(parseEntryPoint(bytesOf(damaged)).entryPoint) << place;
    }
  }
  std::string damaged = entryPoint64(3, 0, 99);
  damaged[0x0c] = static_cast<char>(damaged[0x0c] + 2);
  EXPECT_EQ(parseEntryPoint(bytesOf(damaged)).error,
            "the bytes of the 64-bit entry point add up to 2, expected 0");
}

TEST(SmbiosType0, OfTwentyBytesHasNoReleases) {
  const std::string table = smbiosTable("0 @0: 1b 2b 0xf000w 3b 3b 0q 0w | Corvane | 080014 | 11/06/18");
  const auto structure = TableReader(bytesOf(table)).next();
  ASSERT_TRUE(structure);
  ASSERT_EQ(structure->length(), 20U);
  const Bios bios = decodeBios(*structure);
  EXPECT_EQ(bios.vendor, "Corvane");
  EXPECT_EQ(bios.version, "080014");
  EXPECT_EQ(bios.date, "11/06/18");
  EXPECT_FALSE(bios.release);
  EXPECT_FALSE(bios.controllerRelease);
}

TEST(SmbiosType0, AReleaseOf255And255IsAbsentAndHalfOfOneToo) {
  const auto decoded = [](const std::string& releases) {
    const std::string table = smbiosTable("0 @0: 0b 0b 0w 0b 0b 0q 0w " + releases);
    return decodeBios(*TableReader(bytesOf(table)).next());
  };
  EXPECT_FALSE(decoded("255b 255b 255b 255b").release);
  EXPECT_FALSE(decoded("255b 255b 255b 255b").controllerRelease);
  const Bios bios = decoded("5b 255b 1b 32b");
  ASSERT_TRUE(bios.release && bios.controllerRelease);
  EXPECT_EQ(bios.release->major, 5U);
  EXPECT_EQ(bios.release->minor, 255U);
  EXPECT_EQ(bios.controllerRelease->major, 1U);
  EXPECT_EQ(bios.controllerRelease->minor, 32U);
  EXPECT_FALSE(decoded("5b").release);
  EXPECT_FALSE(decoded("5b 17b 1b").controllerRelease);
}

/// Of fields in a structure with the string "Trusted"; its description is not looked at.
Tpm decodedTpm(const std::string& fields) {
  const std::string table = smbiosTable("43 @0x2b: " + fields + " | Trusted");
  Tpm tpm = decodeTpm(*TableReader(bytesOf(table)).next());
  tpm.description.reset();  // a view of the table
  return tpm;
}

TEST(SmbiosType43, HasADescription) {
  const std::string table = smbiosTable("43 @0x2b: 0d 2b 0b 0d 0d 1b 0q 0d | Trusted");
  EXPECT_EQ(decodeTpm(*TableReader(bytesOf(table)).next()).description, "Trusted");
}

TEST(SmbiosType43, OfTpm2HasTwoWords) {
  const Tpm tpm = decodedTpm("0x43544e49d 2b 0b 0x00070055d 0x0011cb02d 1b 0x10q 0d");
  EXPECT_EQ(tpm.vendor, "INTC");
  EXPECT_EQ(tpm.version, "7.85.17.51970");
  ASSERT_TRUE(tpm.release);
  EXPECT_EQ(tpm.release->major, 7U);
  EXPECT_EQ(tpm.release->minor, 85U);
  EXPECT_THAT(tpm.otherVersions, ElementsAre("7.85", "7.85.17.51970", "70055.11cb02"));
  EXPECT_EQ(decodedTpm("0d 2b 0b 0x00070055d 0d 1b 0q 0d").version, "7.85");
}

TEST(SmbiosType43, OfTpm12HasTwoBytesBehindThoseOfTheInterface) {
  const Tpm tpm = decodedTpm("0x584649d 1b 2b 0x11030102d 0d 1b 0q 0d");
  EXPECT_EQ(tpm.vendor, "IFX");
  EXPECT_EQ(tpm.version, "3.17");
}

TEST(SmbiosType43, WithoutAVersionOrTooShortForItTellsNone) {
  EXPECT_FALSE(decodedTpm("0d 2b 0b 0d 0d 1b 0q 0d").release);
  EXPECT_FALSE(decodedTpm("0d 1b 2b 0x00000102d 0d 1b 0q 0d").release) << "the interface's version alone";
  EXPECT_FALSE(decodedTpm("0d 2b 0b 0x00070055d 0w 1b").release);
}

TEST(SmbiosType45, HoldsAllItsFields) {
  const std::string table = smbiosTable(
      "45 @0x2d: 1b 2b 1b 3b 1b 4b 5b 6b 0x00100000q 0x0003w 4b 2b 0x0009w 0x000aw "
      "| System BIOS | 2.14 | 0F3A | 2023-03-09 | Corvane | 2.0");
  const smbios::Firmware firmware = decodeFirmware(*TableReader(bytesOf(table)).next());
  EXPECT_EQ(firmware.name, "System BIOS");
  EXPECT_EQ(firmware.version, "2.14");
  EXPECT_EQ(firmware.versionFormat, smbios::Firmware::MajorMinor);
  EXPECT_EQ(firmware.id, "0F3A");
  EXPECT_TRUE(firmware.isGuid);
  EXPECT_EQ(firmware.date, "2023-03-09");
  EXPECT_EQ(firmware.maker, "Corvane");
  EXPECT_EQ(firmware.lowestVersion, "2.0");
  EXPECT_EQ(firmware.imageSize, 0x100000U);
  EXPECT_EQ(firmware.characteristics, 3);
  EXPECT_EQ(firmware.state, 4);
  EXPECT_THAT(firmware.components, ElementsAre(9, 10));
  EXPECT_EQ(firmware.neededLength, 28U);
}

TEST(SmbiosType45, TooShortItHoldsWhatThereIsRoomFor) {
  const std::string table = smbiosTable("45 @1: 1b 2b 0b 3b 0b | Name | 1.0 | id");
  const smbios::Firmware firmware = decodeFirmware(*TableReader(bytesOf(table)).next());
  EXPECT_EQ(firmware.version, "1.0");
  EXPECT_EQ(firmware.id, "id");
  EXPECT_EQ(firmware.date, std::nullopt);
  EXPECT_EQ(firmware.imageSize, std::nullopt);
  EXPECT_EQ(firmware.characteristics, std::nullopt);
  EXPECT_EQ(firmware.state, std::nullopt);
  EXPECT_EQ(firmware.neededLength, 24U);
  const std::string short3 = smbiosTable("45 @1: 1b 2b 0b 0b 0b 0b 0b 0b 0q 0w 4b 3b 7w | Name | 1.0");
  const smbios::Firmware cut = decodeFirmware(*TableReader(bytesOf(short3)).next());
  EXPECT_THAT(cut.components, ElementsAre(7));
  EXPECT_EQ(cut.neededLength, 30U);
}

TEST(SmbiosType45, AnImageSizeOfAllOnesIsUnknown) {
  const std::string table = smbiosTable("45 @1: 0b 0b 0b 0b 0b 0b 0b 0b 0xffffffffffffffffq 0w 4b 0b");
  EXPECT_EQ(decodeFirmware(*TableReader(bytesOf(table)).next()).imageSize, std::nullopt);
}

TEST(SmbiosPciAddress, OfSlotsAndOnboardDevices) {
  const auto address = [](const std::string& line) {
    const std::string table = smbiosTable(line);
    return pciAddress(*TableReader(bytesOf(table)).next());
  };
  EXPECT_EQ(address("41 @1: 1b 0x85b 1b 0x0001w 0x3bb 0xf9b | NIC"), "0001:3b:1f.1");
  EXPECT_EQ(address("9 @1: 1b 0b 0b 0b 0b 0w 0b 0b 0x0000w 0x18b 0x00b | Slot 1"), "0000:18:00.0");
  EXPECT_EQ(address("9 @1: 1b 0b 0b 0b 0b 0w 0b 0b 0xffffw 0xffb 0xffb | Slot 2"), std::nullopt);
  EXPECT_EQ(address("9 @1: 1b 0b 0b 0b 0b 0w 0b 0b | Slot of version 2.0"), std::nullopt);
}

}  // namespace
}  // namespace agent::discovery::test
