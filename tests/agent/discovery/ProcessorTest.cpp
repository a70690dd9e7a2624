// The microcode of the processors, and of those that only seem to have one.
#include "Machine.h"

#include <agent/discovery/processor/Microcode.h>

#include <gtest/gtest.h>

namespace agent::discovery::test {
namespace {

/// The lines of one processor in /proc/cpuinfo.
std::string processor(int number, const std::string& microcode, const std::string& flags = "fpu vme sse2") {
  return "processor\t: " + std::to_string(number) +
         "\nvendor_id\t: GenuineIntel\nmodel name\t: Some Processor 8160 @ 2.10GHz\nmicrocode\t: " +
         microcode + "\nflags\t\t: " + flags + "\nbugs\t\t: none\n\n";
}

TEST(ProcessorTable, OneForEachDistinctRevision) {
  const ProcessorTable table = parseProcessorTable(processor(0, "0xde") + processor(1, "0xde") +
                                                   processor(2, "0xf0") + processor(3, "0xde"));
  EXPECT_FALSE(table.isVirtual);
  ASSERT_EQ(table.distinct.size(), 2U);
  EXPECT_EQ(table.distinct[0].processor, 0U);
  EXPECT_EQ(table.distinct[0].revision, "0xde");
  EXPECT_EQ(table.distinct[0].model, "Some Processor 8160 @ 2.10GHz");
  EXPECT_EQ(table.distinct[1].processor, 2U);
  EXPECT_EQ(table.distinct[1].revision, "0xf0");
}

TEST(ProcessorTable, TheHypervisorFlagIsAWordOfItsOwn) {
  EXPECT_TRUE(parseProcessorTable(processor(0, "0x1", "fpu hypervisor lahf_lm")).isVirtual);
  EXPECT_TRUE(parseProcessorTable(processor(0, "0x1", "hypervisor")).isVirtual);
  EXPECT_FALSE(parseProcessorTable(processor(0, "0x1", "fpu hypervisor_x xhypervisor")).isVirtual);
}

TEST(ProcessorTable, LinesOfOtherFormsArePassedOver) {
  EXPECT_TRUE(parseProcessorTable("").distinct.empty());
  EXPECT_TRUE(parseProcessorTable("microcode : 0xde\n").distinct.empty()) << "of no processor";
  EXPECT_TRUE(parseProcessorTable("processor : x\nmicrocode : 0xde").distinct.empty());
  EXPECT_TRUE(parseProcessorTable("processor : 0\nmicrocode :\n::\nflags").distinct.empty());
  EXPECT_EQ(parseProcessorTable("processor : 0\nmicrocode : 0xde").distinct.size(), 1U) << "no last newline";
}

TEST(MicrocodeRevision, WhatHypervisorsMakeUpIsNone) {
  for (const char* text : {"0x0", "0x1", "0x01", "0x01000065", "0x1000065", "0xffffffff", "1", "", "de"}) {
    EXPECT_TRUE(isMadeUpRevision(text)) << text;
  }
  for (const char* text : {"0x2", "0xde", "0x2006e05", "0xa20120e"}) {
    EXPECT_FALSE(isMadeUpRevision(text)) << text;
  }
}

TEST(ProcessorSource, MicrocodeStandsBelowItsProcessor) {
  Machine machine("");
  machine.write("proc/cpuinfo", processor(0, "0x2006e05") + processor(1, "0x2006e05"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), R"(40 Computer System
  1000 Processor 36="GenuineIntel" 108="Some Processor 8160 @ 2.10GHz"
    3 Processor Microcode 36="GenuineIntel" 108="Some Processor 8160 @ 2.10GHz" 307="0x2006e05"
)");
  EXPECT_EQ(tree.position(described(tree, "Processor")), "processor:0");
}

TEST(ProcessorSource, InAVirtualMachineMicrocodeIsAbsent) {
  Machine machine("sys/devices/system/cpu/cpu0/microcode/version = 0x2006e05");
  machine.write("proc/cpuinfo", processor(0, "0x2006e05", "fpu hypervisor"));
  const NodeTree tree = discoverAt(machine);
  EXPECT_EQ(shown(tree), "40 Computer System\n");
  EXPECT_FALSE(reportOn(tree, "processor", ""));
}

TEST(ProcessorSource, AMadeUpRevisionIsAbsentWithoutTheFlagToo) {
  for (const char* revision : {"0x1", "0x1000065"}) {
    Machine machine("");
    machine.write("proc/cpuinfo", processor(0, revision));
    EXPECT_EQ(shown(discoverAt(machine)), "40 Computer System\n") << revision;
  }
}

TEST(ProcessorSource, SysfsTellsWhereTheTableDoesNot) {
  Machine machine("sys/devices/system/cpu/cpu0/microcode/version = 0xde");
  EXPECT_EQ(shown(discoverAt(machine)), R"(40 Computer System
  1000 Processor
    3 Processor Microcode 307="0xde"
)");
  machine.write("proc/cpuinfo", "processor\t: 0\n");
  EXPECT_NE(described(discoverAt(machine), "Processor Microcode"), NodeTree::none);
}

}  // namespace
}  // namespace agent::discovery::test
