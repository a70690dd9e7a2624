// Every parser on texts that nobody wrote, the same ones in each run.
#include "DevlinkBytes.h"
#include "Machine.h"
#include "SmbiosBuilder.h"

#include <agent/discovery/BusAddress.h>
#include <agent/discovery/Values.h>
#include <agent/discovery/dmi/DmiValues.h>
#include <agent/discovery/dmi/SmbiosEntryPoint.h>
#include <agent/discovery/dmi/SmbiosStructures.h>
#include <agent/discovery/engine/EngineVersions.h>
#include <agent/discovery/esrt/ResourceEntry.h>
#include <agent/discovery/ipmi/DeviceId.h>
#include <agent/discovery/network/Devlink.h>
#include <agent/discovery/network/Interfaces.h>
#include <agent/discovery/network/Netlink.h>
#include <agent/discovery/processor/Microcode.h>
#include <agent/discovery/storage/AtaPage.h>
#include <agent/discovery/storage/ScsiPlace.h>
#include <agent/discovery/tpm/TpmCapabilities.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <functional>
#include <random>
#include <span>

namespace agent::discovery::test {
namespace {

constexpr std::uint32_t seed = 20231121;
constexpr auto share = std::chrono::milliseconds(200);

/// Changes a few bytes of a sample: replaced, inserted, cut away.
class Mutator {
 public:
  explicit Mutator(std::vector<std::string> samples) : samples_(std::move(samples)) {}

  std::string next() {
    std::string text = samples_[below(samples_.size())];
    for (std::size_t changes = below(4); changes > 0; --changes) {
      change(text);
    }
    return text;
  }

 private:
  void change(std::string& text) {
    static constexpr std::string_view liked = "0123456789/.:x -+\0\xff";
    const char byte = below(2) == 0 ? liked[below(liked.size())] : static_cast<char>(below(256));
    const std::size_t place = below(text.size() + 1);
    switch (below(3)) {
      case 0:
        text.insert(place, 1, byte);
        break;
      case 1:
        text.resize(place);
        break;
      default:
        if (place < text.size()) {
          text[place] = byte;
        }
    }
  }
  std::size_t below(std::size_t limit) { return random_() % limit; }

  std::vector<std::string> samples_;
  std::mt19937 random_{seed};  // NOLINT(cert-msc32-c,cert-msc51-cpp): the same texts in each run
};

/// Texts in blocks of their own on the heap, so that the sanitizers see a read beyond their end.
void feed(std::vector<std::string> samples, const std::function<void(std::string_view)>& check) {
  Mutator mutator(std::move(samples));
  const auto end = std::chrono::steady_clock::now() + share;
  do {
    const std::string text = mutator.next();
    const std::vector<char> exact(text.begin(), text.end());
    check({exact.data(), exact.size()});
  } while (std::chrono::steady_clock::now() < end && !testing::Test::HasFailure());
}

TEST(ParserFuzz, ADateIsADateOrNone) {
  feed({"12/31/2010", "3/9/99", "02/29/2024"}, [](std::string_view text) {
    const auto date = parseBiosDate(text);
    if (date) {
      ASSERT_EQ(date->size(), 10U) << text;
      ASSERT_EQ(parseBiosDate(*date), date) << text;
    }
  });
}

TEST(ParserFuzz, AFirmwareDateIsADateOrNone) {
  feed({"2021-05-15T00:00:00Z", "20210515", "12/31/10"}, [](std::string_view text) {
    const auto date = parseFirmwareDate(text);
    if (date) {
      ASSERT_EQ(parseBiosDate(*date), date) << text;
    }
  });
}

TEST(ParserFuzz, ATableIsReadWithinItsBytesAndItsWalkEnds) {
  feed({smbiosTable(
           "0 @0: 1b 2b 0w 3b 3b 0q 0w 5b 17b 1b 2b | Corvane | U41 | 03/09/2023\n"
           "43 @1: 0x43544e49d 2b 0b 0x00070055d 1d 1b 0q 0d | TPM\n"
           "41 @2: 1b 0x85b 1b 0w 0x3bb 0b | LAN\n"
           "45 @3: 1b 2b 1b 3b 1b 4b 5b 6b 9q 3w 4b 2b 2w 1w | a | 1.2 | b | 2021-05-15 | c | 1.0\nend")},
       [](std::string_view bytes) {
         smbios::TableReader reader(bytesOf(bytes));
         std::size_t before = 0;
         while (const auto structure = reader.next()) {
           ASSERT_GE(reader.offset(), before + structure->length() + 2);
           ASSERT_LE(reader.offset(), bytes.size());
           before = reader.offset();
           static_cast<void>(smbios::decodeBios(*structure));
           ASSERT_LE(smbios::decodeTpm(*structure).vendor.size(), 4U);
           const smbios::Firmware firmware = smbios::decodeFirmware(*structure);
           ASSERT_LE(firmware.components.size(), structure->length() / 2);
           const auto address = smbios::pciAddress(*structure);
           ASSERT_TRUE(!address || isPciAddress(*address));
         }
         ASSERT_NE(reader.end(), smbios::TableReader::End::None);
       });
}

TEST(ParserFuzz, AnEntryPointIsOneOrSaysWhyNot) {
  feed({entryPoint32(2, 8, 1000, 20), entryPoint64(3, 7, 1000), entryPoint32(2, 0, 1, 1).substr(16)},
       [](std::string_view bytes) {
         const auto outcome = smbios::parseEntryPoint(bytesOf(bytes));
         ASSERT_NE(outcome.entryPoint.has_value(), !outcome.error.empty());
       });
}

TEST(ParserFuzz, AReleaseIsTwoBytesOrNone) {
  feed({"5.17", "255.255", "0.0"}, [](std::string_view text) {
    const auto release = parseBiosRelease(text);
    ASSERT_TRUE(!release || (release->major <= 255 && release->minor <= 255)) << text;
  });
}

TEST(ParserFuzz, DriverInfoIsReadWithinItsBytes) {
  feed({driverInfoBytes("5.6.0-k", "1.61, 0x80000d62"),
        driverInfoBytes(std::string(32, 'v'), std::string(32, 'f'))},
       [](std::string_view bytes) {
         const auto info = parseDriverInfo(bytes);
         if (info && info->firmwareVersion) {
           ASSERT_FALSE(info->firmwareVersion->empty());
           ASSERT_EQ(meaningful(*info->firmwareVersion), info->firmwareVersion);
         }
       });
}

TEST(ParserFuzz, NetlinkIsReadWithinItsBytesAndItsWalkEnds) {
  feed({familyAnswer(1) + errorMessage(2, 19),
        message(devlinkFamily, 2,
                generic(51) + devlinkAttributes("fixed board.id=K9;running fw=1;stored fw=2"))},
       [](std::string_view bytes) {
         std::size_t left = bytes.size() + 1;
         while (const auto message = netlink::takeMessage(bytes)) {
           ASSERT_LT(bytes.size(), left);
           left = bytes.size();
           ASSERT_GE(netlink::errorOf(message->payload), 0);
           if (const auto answer = netlink::parseGeneric(message->payload)) {
             for (const DevlinkVersion& version : parseDevlinkInfo(answer->attributes).running) {
               ASSERT_EQ(meaningful(version.version), version.version);
             }
           }
         }
       });
}

TEST(ParserFuzz, ValuesStayWithinTheirBounds) {
  feed({"42", "0x1f", "N/A", "To be filled by O.E.M.", "  1.2 \n"}, [](std::string_view text) {
    const auto number = parseNumber(text, 1000);
    ASSERT_TRUE(!number || *number <= 1000) << text;
    const auto meant = meaningful(text);
    ASSERT_EQ(meant, meant ? meaningful(*meant) : std::nullopt) << text;
  });
}

TEST(ParserFuzz, APciAddressHasOneForm) {
  feed({"0000:3b:00.0", "10000:e1:1f.7", "virtio2"}, [](std::string_view text) {
    ASSERT_TRUE(!isPciAddress(text) ||
                (text.size() >= 12 && text.size() <= 16 && text[text.size() - 2] == '.'))
        << text;
  });
}

TEST(ParserFuzz, AControllersAnswerIsReadWithinItsBytes) {
  feed({std::string("\x20\x81\x02\x50\x02\xbf\x57\x01\x00\x49\x00\x01\xa0\x00\x00", 15)},
       [](std::string_view bytes) {
         const auto firmware = parseDeviceId(std::as_bytes(std::span(bytes)));
         ASSERT_TRUE(!firmware || (firmware->major < 128 && firmware->minor.value_or(0) < 100));
       });
}

TEST(ParserFuzz, AControllersRevisionIsTwoBytes) {
  feed({"2.5", "12.61", "130.1f"}, [](std::string_view text) {
    const auto firmware = parseRevisionText(text, std::string(text));
    ASSERT_TRUE(!firmware || (firmware->major < 128 && firmware->minor.value_or(0) < 100)) << text;
  });
}

TEST(ParserFuzz, AnAtaPageIsReadWithinItsBytes) {
  std::string page(572, ' ');
  page[1] = '\x89';
  page[56] = '\xec';
  feed({page}, [](std::string_view bytes) {
    const auto identity = parseAtaPage(bytes);
    ASSERT_TRUE(!identity || meaningful(identity->firmware.value_or("1")));
  });
}

TEST(ParserFuzz, AScsiAddressIsFourNumbers) {
  feed({"2:0:0:0", "10:0:3:4294967296"}, [](std::string_view text) {
    const auto address = parseScsiAddress(text);
    ASSERT_TRUE(!address || std::count(text.begin(), text.end(), ':') == 3) << text;
  });
}

TEST(ParserFuzz, AProcessorTableRepeatsNoRevision) {
  feed({"processor\t: 0\nflags\t: fpu hypervisor\nmicrocode\t: 0xde\n\nprocessor\t: 1\nmicrocode\t: 0xf0\n"},
       [](std::string_view text) {
         const auto table = parseProcessorTable(text);
         ASSERT_LE(table.distinct.size(), 2U) << text;
         for (const ProcessorMicrocode& first : table.distinct) {
           ASSERT_EQ(isMadeUpRevision(first.revision), isMadeUpRevision(" " + first.revision)) << text;
         }
       });
}

TEST(ParserFuzz, TpmAndEngineVersionsAreThoseOfALine) {
  feed(
      {"Manufacturer: 0x49465800\nTCG version: 1.2\nFirmware version: 4.32\n", "0:11.8.50.3425\n0:1.2.3.4\n"},
      [](std::string_view text) {
        const auto capabilities = parseTpmCapabilities(text);
        ASSERT_TRUE(!capabilities.version || !capabilities.version->empty()) << text;
        for (const EngineVersion& version : parseEngineVersions(text)) {
          ASSERT_NE(text.find(version.text), std::string_view::npos) << text;
        }
      });
}

TEST(ParserFuzz, AClassIdHasOneForm) {
  feed({"3B8C8162-188C-46A4-AEC9-BE43F1D65697"}, [](std::string_view text) {
    const auto id = parseClassId(text);
    ASSERT_TRUE(!id || (id->size() == 36 && parseClassId(*id) == id)) << text;
  });
}

}  // namespace
}  // namespace agent::discovery::test
