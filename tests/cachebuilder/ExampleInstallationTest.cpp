// The installation in examples/: fourteen boards that use the whole language. The facts here were taken from the
// boards' own tables, not from the descriptions.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <fstream>
#include <iterator>
#include <memory>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "cachebuilder/DeviceMenus.h"
#include "cachebuilder/FPGAResTree.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/CommandLine.h"
#include "qn/dsc/osdep/path.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"
#include "restree/TreeWriter.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::NarrowString;
using qn::dsc::String;
using qn::dsc::osdep::CopyDirectoryTree;
using qn::dsc::osdep::FaultyFileSystem;
using qn::dsc::osdep::FileSystemScope;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::PathFromArgument;
using qn::dsc::osdep::TemporaryFolder;

constexpr const char16_t* toolBelowRoot = u"Targets\\QN\\FPGA\\Utilities\\zkfpga_make_resource_cache";
constexpr const char16_t* workingBelowRoot = u"Targets\\QN\\FPGA";

std::string Utf8(std::u16string_view text) {
    return std::string(NarrowString(String(text)).View());
}
std::string Utf8(const String& text) {
    return Utf8(text.View());
}

std::string ReadBytes(const char* path) {
    std::ifstream stream(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

String ExampleFolder() {
    return PathFromArgument(ZKFPGA_EXAMPLE);
}

// The tree of the example as the tool builds it, from where it stands in the sources. Nothing is written.
class ExampleTree {
  public:
    ExampleTree() : root(u"", u"ProviderResourceTreeRoot", false) {
        FaultyFileSystem files;
        files.SetExecutablePath(JoinPath(ExampleFolder(), String(toolBelowRoot)));
        const FileSystemScope scope(files);
        FPGAResTree owner;
        owner.ScanTargets(JoinPath(ExampleFolder(), String(workingBelowRoot)), root);
    }

    ResTreeNode root;
};

ResTreeNode& Example() {
    static ExampleTree tree;
    return tree.root;
}

// "" where there is no such node; links are followed.
std::string Text(ResTreeNode& root, const char* path, const char* key) {
    ResTreeNode* node = root.Lookup(String(path).View(), nullptr);
    if (node == nullptr) {
        return std::string("no node ") + path;
    }
    const auto text = node->GetProperty(String(key).View());
    return text ? Utf8(*text) : "none";
}

// What `visit` says of each node, where it says anything, with the node's path.
template <typename Visit>
std::vector<std::string> Findings(ResTreeNode& top, Visit visit) {
    std::vector<std::string> findings;
    std::vector<ResTreeNode*> waiting{&top};
    while (!waiting.empty()) {
        ResTreeNode& node = *waiting.back();
        waiting.pop_back();
        for (EntryIterator entry = node.Begin(); entry != node.End(); ++entry) {
            const std::string finding = visit(node, *entry);
            if (!finding.empty()) {
                findings.push_back(Utf8(node.GetPath()) + ": " + Utf8(entry.Key()) + ": " + finding);
            }
            if (ResTreeNode* child = entry->Child()) {
                waiting.push_back(child);
            }
        }
    }
    return findings;
}

const std::vector<std::string> nothing;

TEST(ExampleInstallation, IsReadWithoutAReport) {
    EXPECT_EQ(Findings(Example(),
                       [](ResTreeNode&, NodeEntry& entry) {
                           return entry.Key() == u"XMLParseErrors" ? Utf8(*entry.Text()) : std::string();
                       }),
              nothing);
}

TEST(ExampleInstallation, HasNoUnresolvedLink) {
    EXPECT_EQ(Findings(Example(),
                       [](ResTreeNode&, NodeEntry& entry) {
                           const auto text = entry.Text();
                           return text && text->find(u"UNRESOLVED LINK") == 0 ? Utf8(*text) : "";
                       }),
              nothing);
}

TEST(ExampleInstallation, HasLinksThatLeadToNodes) {
    size_t links = 0;
    EXPECT_EQ(Findings(Example(),
                       [&links](ResTreeNode& node, NodeEntry& entry) {
                           if (entry.Kind() != LinkEntry) {
                               return std::string();
                           }
                           ++links;
                           return node.ResolveEntry(&entry) == nullptr ? Utf8(*entry.LinkPath()) : std::string();
                       }),
              nothing);
    // Four shortcuts on each of seven boards, 4 + 16 + 4 + 4 + 16 links in modules, one in the host set.
    EXPECT_EQ(links, 7U * 4U + 44U + 1U);
}

TEST(ExampleInstallation, HasReferencesThatLeadToNodes) {
    size_t references = 0;
    EXPECT_EQ(Findings(Example(),
                       [&references](ResTreeNode& node, NodeEntry& entry) {
                           std::string dead;
                           if (entry.Key() == u"Reserves" || entry.Key() == u"DefaultClock") {
                               std::vector<String> paths;
                               SplitList(*entry.Text(), u",", paths, true);
                               for (const String& path : paths) {
                                   ++references;
                                   dead += node.Lookup(path.View(), nullptr) == nullptr ? Utf8(path) : "";
                               }
                           }
                           return dead;
                       }),
              nothing);
    // A default clock on each board, 20 nodes that are taken along with others.
    EXPECT_EQ(references, 14U + 20U);
}

TEST(ExampleInstallation, LeavesNoParameterOpenOnABoard) {
    for (EntryIterator entry = Example().Begin(); entry != Example().End(); ++entry) {
        ASSERT_NE(entry->Child(), nullptr) << Utf8(entry.Key());
        if (entry->Child()->IsA(u"Target")) {
            EXPECT_EQ(Findings(*entry->Child(),
                               [](ResTreeNode&, NodeEntry& inner) {
                                   const auto text = inner.Text();
                                   return text && text->find(u"#{") != std::u16string_view::npos ? Utf8(*text) : "";
                               }),
                      nothing);
        }
    }
}

TEST(ExampleInstallation, HoldsFourteenBoardsAndWhatTheyShare) {
    std::vector<std::string> names;
    for (EntryIterator entry = Example().Begin(); entry != Example().End(); ++entry) {
        names.push_back((entry->Child()->IsA(u"Target") ? "Target " : "") + Utf8(entry.Key()));
    }
    const std::vector<std::string> expected = {
        "Target Atlys",          "BoardParts",      "FpgaDeviceSpecs",      "FPGAHostSet",        "Target KC705",
        "Target LX9 MicroBoard", "Target Mimas V2", "Target miniSpartan6+", "Target ML505",       "Target ML506",
        "Target ML605",          "Target Mojo V3",  "Target Papilio Pro",   "Target Pipistrello", "Target RHINO",
        "Target SP605",          "Target XUPV5"};
    EXPECT_EQ(names, expected);
}

struct BoardFacts {
    const char* board;
    const char* family;
    const char* part;
    size_t lines;
};

TEST(ExampleInstallation, HasTheFamilyPartAndLinesOfEachBoard) {
    const BoardFacts boards[] = {
        {"ML505", "virtex5", "XC5VLX50T-1FF1136", 130},    {"ML506", "virtex5", "XC5VSX50T-1FF1136", 130},
        {"XUPV5", "virtex5", "XC5VLX110T-1FF1136", 130},   {"ML605", "virtex6", "XC6VLX240T-1FF1156", 83},
        {"Atlys", "spartan6", "XC6SLX45-3CSG324", 83},     {"KC705", "kintex7", "XC7K325T-2FFG900", 96},
        {"SP605", "spartan6", "XC6SLX45T-FGG484-3", 158},  {"Pipistrello", "spartan6", "XC6SLX45-CSG324-3", 114},
        {"miniSpartan6+", "spartan6", "XC6SLX25", 106},    {"Papilio Pro", "spartan6", "XC6SLX9-TQG144-2", 51},
        {"Mimas V2", "spartan6", "XC6SLX9-CSG324-2", 100}, {"LX9 MicroBoard", "spartan6", "XC6SLX9-2CSG324", 117},
        {"RHINO", "spartan6", "XC6SLX150T-FGG676-3", 141}, {"Mojo V3", "spartan6", "XC6SLX9-2-TQG144", 14},
    };
    for (const BoardFacts& facts : boards) {
        const std::string path = std::string("/") + facts.board;
        EXPECT_EQ(Text(Example(), (path + "/FPGACompilation").c_str(), "DeviceFamily"), facts.family) << path;
        EXPECT_EQ(Text(Example(), (path + "/FPGACompilation").c_str(), "Part"), facts.part) << path;
        ResTreeNode* modules = Example().Lookup(String((path + "/IO").c_str()).View(), nullptr);
        ASSERT_NE(modules, nullptr) << path;
        size_t lines = 0;
        for (EntryIterator module = modules->Begin(); module != modules->End(); ++module) {
            ASSERT_NE(module->Child(), nullptr) << path << Utf8(module.Key());
            ResTreeNode& node = *module->Child();
            for (EntryIterator line = node.Begin(); line != node.End(); ++line) {
                ResTreeNode* lineNode = node.ResolveEntry(line);
                lines += lineNode != nullptr && lineNode->GetProperty(u"Pin") ? 1U : 0U;
            }
        }
        EXPECT_EQ(lines, facts.lines) << path;
    }
}

struct LineFacts {
    const char* path;  // Below the board's IO, with the board in front.
    const char* pin;
    const char* standard;
    const char* direction;
};

void PrintTo(const LineFacts& facts, std::ostream* stream) {
    *stream << facts.path;
}

class ExampleLine : public testing::TestWithParam<LineFacts> {};

TEST_P(ExampleLine, HasThePinStandardAndDirectionOfTheBoard) {
    const LineFacts& facts = GetParam();
    std::string path = facts.path;
    path.insert(path.find('/', 1), "/IO");
    EXPECT_EQ(Text(Example(), path.c_str(), "Pin"), facts.pin);
    EXPECT_EQ(Text(Example(), path.c_str(), "Standard"), facts.standard);
    EXPECT_EQ(Text(Example(), path.c_str(), "Direction"), facts.direction);
}

constexpr LineFacts lineFacts[] = {
    {"/ML505/Bus.IIC.Main/IIC_Main_SerialClock", "F9", "LVCMOS33", "none"},
    {"/ML505/Bus.LCDisplay/LCD_DB[7]", "T11", "LVCMOS25", "none"},
    {"/ML505/Clock.SMA/SMAClock_in_p", "H14", "LVCMOS25", "inout"},
    {"/ML505/Clock.SystemClock/SystemClock_200MHz_n", "K19", "LVDS_25", "in"},
    {"/ML505/EthernetPHY.RGMII/EthernetPHY_TX_DATA<3>", "AH10", "LVCMOS25", "out"},
    {"/ML505/EthernetPHY.RGMII/EthernetPHY_RX_Error", "E33", "LVCMOS25", "in"},
    // Copied from the reduced interface, and the full one's own.
    {"/ML505/EthernetPHY.GMII/EthernetPHY_TX_DATA<3>", "AH10", "LVCMOS25", "out"},
    {"/ML505/EthernetPHY.GMII/EthernetPHY_TX_DATA<4>", "AG8", "LVCMOS25", "out"},
    {"/ML505/EthernetPHY.GMII/EthernetPHY_RX_DATA<7>", "F33", "LVCMOS25", "in"},
    {"/ML505/EthernetPHY.SGMII/EthernetPHY_RefClock_125MHz_p", "P4", "none", "in"},
    {"/ML505/EthernetPHY/EthernetPHY_Management_Data", "H13", "LVCMOS25", "inout"},
    // From the range, and where the line differs from it.
    {"/ML505/GPIO.LED/GPIO_LED<0>", "H18", "LVCMOS25", "none"},
    {"/ML505/GPIO.LED/GPIO_LED<3>", "AD26", "LVCMOS18", "none"},
    {"/ML505/GPIO.LED/GPIO_LED<4>", "G16", "LVCMOS25", "none"},
    {"/ML505/GPIO.LED/GPIO_LED<7>", "AE24", "LVCMOS18", "none"},
    {"/ML505/GPIO.Switch/GPIO_Switches<7>", "AC24", "LVCMOS18", "none"},
    {"/ML505/Monitor.DVI.Output/Video_DVI_Data<11>", "AN14", "none", "none"},
    {"/ML505/Transceiver.SFP/SFP_TX_Disable", "K24", "LVCMOS18", "none"},
    {"/ML505/Transceiver.SFP/SFP_TX_p", "F2", "none", "none"},
    {"/ML505/UART/UART2_RX", "G10", "LVCMOS33", "in"},
    {"/ML506/GPIO.LED/GPIO_LED<6>", "AD24", "LVCMOS18", "none"},
    {"/XUPV5/GPIO.Button.Cursor/GPIO_Button_South", "V8", "LVCMOS18", "none"},
    {"/ML605/Bus.LCDisplay/LCD_DB[5]", "A", "LVCMOS25", "none"},
    {"/ML605/Clock.UserClock/UserClock", "U23", "LVCMOS25", "in"},
    {"/ML605/EthernetPHY.GMII/EthernetPHY_RX_DATA<0>", "AN13", "LVCMOS25", "in"},
    {"/ML605/EthernetPHY.GMII/EthernetPHY_RX_DATA<6>", "AC12", "LVCMOS25", "in"},
    {"/ML605/GPIO.Rotary/GPIO_Rotary_IncB", "AT31", "none", "none"},
    {"/ML605/GPIO.Switch/GPIO_Switches<2>", "BA31", "LVCMOS18", "none"},
    {"/ML605/USB_UART/USB_UART_RTS_n", "T23", "LVCMOS25", "in"},
    {"/Atlys/GPIO.Button.Cursor/GPIO_Button_Center", "F5", "LVCMOS25", "in"},
    {"/Atlys/GPIO.Button.Cursor/GPIO_Button_East", "F6", "LVCMOS15", "in"},
    {"/Atlys/GPIO.LED/GPIO_LED<6>", "P16", "LVCMOS33", "out"},
    {"/Atlys/GPIO.LED/GPIO_LED<7>", "N12", "LVCMOS25", "out"},
    {"/Atlys/HDMI.TX/TMDS_TX_2_n", "A8", "LVCMOS33", "out"},
    {"/Atlys/HDMI.TX/TMDS_TX_SerialData", "C9", "LVCMOS33", "inout"},
    {"/KC705/Clock.ProgUserClock/ProgUserClock_p", "K28", "LVDS_25", "in"},
    {"/KC705/Clock.ProgUserClock/ProgUserClock_n", "K29", "none", "in"},
    {"/KC705/GPIO.LED/GPIO_LED<3>", "AB9", "LVCMOS15", "out"},
    {"/KC705/GPIO.LED/GPIO_LED<4>", "AE26", "LVCMOS25", "out"},
    {"/KC705/Transceiver.SMA_RefClock/SMA_RefClock_p", "J8", "LVDS", "in"},
    {"/SP605/clk200/p", "K21", "LVDS_25", "none"},
    {"/SP605/user_led/user_led3", "W15", "LVCMOS25", "none"},
    {"/SP605/ddram/a[14]", "H5", "SSTL15_II", "none"},
    {"/SP605/ddram/dqs_n[1]", "V1", "DIFF_SSTL15_II", "none"},
    {"/SP605/ddram/reset_n", "E3", "LVCMOS15", "none"},
    {"/SP605/pcie_x1/rst_n", "J7", "LVCMOS25", "none"},
    {"/SP605/pcie_x1/tx_n", "A6", "none", "none"},
    {"/SP605/sfp_tx/p", "B14", "none", "none"},
    {"/SP605/sfp_rx/n", "C13", "none", "none"},
    {"/Pipistrello/user_led/user_led4", "A12", "LVTTL", "none"},
    {"/Pipistrello/hdmi/clk_p", "U5", "TMDS_33", "none"},
    {"/Pipistrello/hdmi/scl", "V9", "I2C", "none"},
    // From the shared file, with the board's standard; and links to those lines.
    {"/Pipistrello/spiflash/mosi", "T13", "LVTTL", "none"},
    {"/Pipistrello/spiflash/hold", "V14", "LVTTL", "none"},
    {"/Pipistrello/spiflash2x/dq[1]", "R13", "LVTTL", "none"},
    {"/Pipistrello/spiflash4x/dq[3]", "V14", "LVTTL", "none"},
    {"/Pipistrello/spisdcard/cs_n", "A2", "SDIO", "none"},
    {"/Pipistrello/ddram/a[12]", "G6", "MOBILE_DDR", "none"},
    {"/Pipistrello/usb_fifo/data[7]", "A7", "LVTTL", "none"},
    {"/miniSpartan6+/user_led/user_led7", "P7", "LVCMOS33", "none"},
    {"/miniSpartan6+/sdram/dq[15]", "C15", "LVCMOS33", "none"},
    {"/miniSpartan6+/spisdcard/cs_n", "K12", "LVCMOS33", "none"},
    {"/miniSpartan6+/hdmi_in/data2_n", "A5", "TMDS_33", "none"},
    {"/miniSpartan6+/hdmi_in/sda", "B1", "LVCMOS33", "none"},
    {"/Papilio Pro/clk32/clk32", "P94", "LVCMOS33", "none"},
    {"/Papilio Pro/sdram/dq[7]", "P8", "LVCMOS33", "none"},
    {"/Papilio Pro/spiflash2x/dq[0]", "P64", "LVCMOS33", "none"},
    {"/Mimas V2/dipswitch/dipswitch5", "E16", "LVCMOS33", "none"},
    {"/Mimas V2/spiflash/cs_n", "V3", "LVCMOS33", "none"},
    {"/Mimas V2/ddram/dqs[1]", "P2", "MOBILE_DDR", "none"},
    {"/Mimas V2/sevenseg/segment0", "A5", "LVCMOS33", "none"},
    {"/Mimas V2/vga_out/b[1]", "A11", "LVCMOS33", "none"},
    {"/LX9 MicroBoard/user_led/user_led2", "F5", "LVCMOS18", "none"},
    {"/LX9 MicroBoard/ddram/cs_n", "K6", "MOBILE_DDR", "none"},
    {"/LX9 MicroBoard/ddram/dm[1]", "K4", "MOBILE_DDR", "none"},
    {"/LX9 MicroBoard/pmod0/d[7]", "D18", "LVCMOS33", "none"},
    {"/LX9 MicroBoard/pmod1/d[7]", "F18", "LVCMOS33", "none"},
    {"/LX9 MicroBoard/pmod_diff/io[4]", "H12", "LVCMOS33", "none"},
    {"/LX9 MicroBoard/pmod_diff/iob[3]", "D18", "LVCMOS33", "none"},
    {"/LX9 MicroBoard/eth/tx_er", "L16", "LVCMOS33", "none"},
    {"/RHINO/user_led/user_led0", "Y3", "none", "none"},
    {"/RHINO/gpmc/wait", "AD26", "LVCMOS33", "none"},
    {"/RHINO/gpmc_ce_n/gpmc_ce_n2", "W25", "LVCMOS33", "none"},
    {"/RHINO/fmc150_ctrl/mon_int_n", "AD5", "none", "none"},
    {"/RHINO/fmc150_ctrl/pg_c2m", "AA23", "LVCMOS33", "none"},
    {"/RHINO/ti_dac/txenable", "AB15", "LVCMOS25", "none"},
    {"/RHINO/ti_adc/dat_b_n[6]", "V15", "LVDS_25", "none"},
    {"/RHINO/lmh6521_1/scsb", "E10", "LVCMOS33", "none"},
    {"/Mojo V3/user_led/user_led0", "P134", "LVCMOS33", "none"},
    {"/Mojo V3/cpu_reset_n/cpu_reset_n", "P38", "LVCMOS33", "none"},
    {"/Mojo V3/cclk/cclk", "P70", "LVCMOS33", "none"},
};

INSTANTIATE_TEST_SUITE_P(Boards, ExampleLine, testing::ValuesIn(lineFacts));

TEST(ExampleInstallation, HasTheBanksSuppliesDevicesAndFrequenciesOfTheModules) {
    EXPECT_EQ(Text(Example(), "/ML505/IO/Bus.LCDisplay", "Banks"), "3,12");
    EXPECT_EQ(Text(Example(), "/ML505/IO/Bus.LCDisplay", "Vcco"), "2.5V, 3.3V (VCC2V5, VCC3V3)");
    EXPECT_EQ(Text(Example(), "/ML505/IO/Bus.LCDisplay", "Device"), "S162DBABC (162D Series)");
    EXPECT_EQ(Text(Example(), "/ML505/IO/Clock.SystemClock", "Frequency"), "200 MHz");
    EXPECT_EQ(Text(Example(), "/ML505/IO/GPIO.LED.Cursor", "Vcco"), "3,3V (VCC1V8_FPGA)");
    EXPECT_EQ(Text(Example(), "/ML605/IO/Clock.UserClock", "Frequency"), "66 MHz, 100ppm");
    EXPECT_EQ(Text(Example(), "/Atlys/IO/HDMI.RX", "Device"), "TMDS141RHAR");
    EXPECT_EQ(Text(Example(), "/Atlys/IO/EthernetPHY.GMII", "Banks"), "11");
    EXPECT_EQ(Text(Example(), "/KC705/IO/EthernetPHY.SGMII", "Banks"), "14,15,117");
    EXPECT_EQ(Text(Example(), "/KC705/IO/Bus.IIC", "Device"), "PCA9548A-RGER - 8-Channel I2C Switch with Reset");
    EXPECT_EQ(Text(Example(), "/Atlys/IO/GPIO.Switch", "Banks"), "none");
}

TEST(ExampleInstallation, HasTheHeadersOfTheBoards) {
    EXPECT_EQ(Text(Example(), "/Pipistrello/Connectors/C", "Pins"),
              "F17,F16,E16,G16,F15,G14,F14,H14,H13,J13,G13,H12,K14,K13,K12,L12");
    EXPECT_EQ(Text(Example(), "/miniSpartan6+/Connectors/D", "Pins"), "D6,C6,E6,C5");
    EXPECT_EQ(Text(Example(), "/miniSpartan6+/Connectors/B", "Pins"), "E11,D14,D12,E12,E13,F13,F12,F14,G12,H14,J14");
    EXPECT_EQ(Text(Example(), "/Papilio Pro/Connectors/A", "Pins"),
              "P48,P51,P56,P58,P61,P66,P67,P75,P79,P81,P83,P85,P88,P93,P98,P100");
    EXPECT_EQ(Text(Example(), "/Mimas V2/Connectors/P8", "Pins"), "L16,L15,K16,K15,J18,J16,H18,H17");
    // A line for each position, labelled by the board's letter and the position.
    EXPECT_EQ(Text(Example(), "/Papilio Pro/Connectors/B/IO0", "Label"), "B:0");
    EXPECT_EQ(Text(Example(), "/Papilio Pro/Connectors/B/IO15", "Label"), "B:15");
    EXPECT_EQ(Text(Example(), "/miniSpartan6+/Connectors/B/IO10", "Label"), "B:10");
    EXPECT_EQ(Text(Example(), "/miniSpartan6+/Connectors/B/IO11", "Label"), "no node /miniSpartan6+/Connectors/B/IO11");
}

TEST(ExampleInstallation, GivesTheSameLinesToTheThreeBoardsThatShareThem) {
    std::vector<std::string> written;
    for (const char16_t* path : {u"/ML505/IO", u"/ML506/IO", u"/XUPV5/IO"}) {
        ResTreeNode* modules = Example().Lookup(path, nullptr);
        ASSERT_NE(modules, nullptr);
        String text;
        WriteNode(*modules, text, u"");
        written.push_back(Utf8(text));
    }
    EXPECT_GT(written[0].size(), 10000U);
    EXPECT_EQ(written[0], written[1]);
    EXPECT_EQ(written[0], written[2]);
}

TEST(ExampleInstallation, FillsTheDefaultsWithTheBoard) {
    const auto text =
        Example().Lookup(u"/ML605", nullptr)->GetProperty(u"LocalizedInformationToDisplayWhenAddingNewTarget");
    ASSERT_TRUE(text);
    // Without a host the language is English; the whole list stands behind the NUL.
    EXPECT_EQ(Utf8(text->substr(0, text->find(u'\0'))),
              "Connect the QN Probe to the JTAG port of the ML605, then switch the board on.");
    EXPECT_EQ(Text(Example(), "/ML605/Support", "Contact"), "boards@qn.example");
    EXPECT_EQ(Text(Example(), "/XUPV5/Support", "Contact"), "university@qn.example");
    EXPECT_EQ(Text(Example(), "/ML605/FPGACompilation", "BitfileDir"), "Bitfiles\\XC6VLX240T-1FF1156");
    EXPECT_EQ(Text(Example(), "/ML605/FPGACompilation", "ConstraintTemplate"),
              "NET \"%net%\" LOC = \"%pin%\" | IOSTANDARD = \"%standard%\";\n");
    EXPECT_EQ(Text(Example(), "/ML605/FPGACompilation", "DefaultClock"), "../IO/Clock.SystemClock");
}

TEST(ExampleInstallation, PutsTheFourthFamilyBesideTheOtherThree) {
    for (const char* family : {"Virtex5", "Virtex6", "spartan6", "Kintex7"}) {
        const std::string path = std::string("/FpgaDeviceSpecs/") + family + "/Compilation";
        EXPECT_EQ(Text(Example(), path.c_str(), "Part"), "#{Part}") << family;
    }
    EXPECT_EQ(Text(Example(), "/FpgaDeviceSpecs/spartan6", "XIPINMenusPath"), "Targets\\QN\\FPGA\\Menus\\Spartan6");
    EXPECT_EQ(Text(Example(), "/FpgaDeviceSpecs/Kintex7", "XIPINMenusPath"), "none");
    EXPECT_EQ(Text(Example(), "/FpgaDeviceSpecs/Kintex7/IOStandardList/LVDS", "DisplayName"), "LVDS (differential)");
}

// A copy of the example on which the tool has run.
class ExampleRun : public testing::Test {
  protected:
    void SetUp() override {
        CopyDirectoryTree(ExampleFolder(), folder.System(u""));
        before = folder.Tree();
        ASSERT_FALSE(before.empty());
        RunTool();
    }

    void RunTool() {
        files.SetExecutablePath(folder.System(toolBelowRoot));
        const FileSystemScope scope(files);
        FPGAResTree owner;
        ResTreeNode* root = nullptr;
        const int32_t built = owner.BuildResourceTree(folder.System(workingBelowRoot), false, root);
        const std::unique_ptr<ResTreeNode> ownedRoot(root);
        ASSERT_EQ(built, 0);
        ASSERT_EQ(InstallDeviceMenus(*root), 0);
    }

    TemporaryFolder folder;
    FaultyFileSystem files;
    std::vector<std::string> before;
};

TEST_F(ExampleRun, LeavesTheReviewedCache) {
    EXPECT_EQ(folder.ReadText("Targets/QN/FPGA/resource_cache.xml"),
              ReadBytes(ZKFPGA_SOURCE_DIR "/tests/data/example_resource_cache.xml"));
}

TEST_F(ExampleRun, CopiesTheMenusOfItsFamilyToEachBoardAndNothingElse) {
    const std::vector<std::string> common = {"Arithmetic/",       "Arithmetic/Arithmetic.menu", "Blocks.menu",
                                             "Clocking/",         "Clocking/Clocking.menu",     "Memory/",
                                             "Memory/Memory.menu"};
    std::vector<std::string> expected = before;
    expected.push_back("Targets/QN/FPGA/resource_cache.xml");
    for (const char* board : {"Atlys", "LX9MicroBoard", "MimasV2", "miniSpartan6Plus", "MojoV3", "PapilioPro",
                              "Pipistrello", "RHINO", "SP605", "ML505", "ML506", "ML605", "XUPV5"}) {
        const std::string place = std::string("Targets/QN/FPGA/") + board + "/";
        for (const std::string& path : common) {
            expected.push_back(place + path);
        }
    }
    for (const char* board : {"ML505", "ML506", "ML605", "XUPV5"}) {
        const std::string place = std::string("Targets/QN/FPGA/") + board + "/Transceivers/";
        expected.push_back(place);
        expected.push_back(place + "Transceivers.menu");
    }
    std::sort(expected.begin(), expected.end());
    EXPECT_EQ(folder.Tree(), expected);
}

TEST_F(ExampleRun, CopiesTheMenusOfTheFamilyOfTheBoard) {
    const std::string menus = "Targets/QN/FPGA/Menus/";
    for (const auto& [board, family] :
         {std::pair("ML506", "Virtex5"), std::pair("ML605", "Virtex6"), std::pair("RHINO", "Spartan6")}) {
        EXPECT_EQ(folder.ReadFile(std::string("Targets/QN/FPGA/") + board + "/Memory/Memory.menu"),
                  folder.ReadFile(menus + family + "/Memory/Memory.menu"))
            << board;
    }
    EXPECT_NE(folder.ReadFile(menus + "Virtex5/Memory/Memory.menu"),
              folder.ReadFile(menus + "Virtex6/Memory/Memory.menu"));
    EXPECT_NE(folder.ReadFile(menus + "Virtex5/Memory/Memory.menu"),
              folder.ReadFile(menus + "Spartan6/Memory/Memory.menu"));
}

TEST_F(ExampleRun, ASecondRunChangesNothing) {
    const std::vector<std::string> after = folder.Tree();
    const std::string cache = folder.ReadText("Targets/QN/FPGA/resource_cache.xml");
    RunTool();
    EXPECT_EQ(folder.Tree(), after);
    EXPECT_EQ(folder.ReadText("Targets/QN/FPGA/resource_cache.xml"), cache);
}

TEST_F(ExampleRun, AHostGetsTheSameLinesByWayOfTheCache) {
    files.SetExecutablePath(folder.System(u"Zarvik.exe"));
    const FileSystemScope scope(files);
    FPGAResTree owner;
    ResTreeNode* root = nullptr;
    const int32_t built = owner.BuildResourceTree(folder.System(workingBelowRoot), true, root);
    const std::unique_ptr<ResTreeNode> ownedRoot(root);
    ASSERT_EQ(built, 0);
    EXPECT_EQ(Text(*root, "/ML505", ":DeferredLoadPath"), "Targets\\QN\\FPGA\\ML505\\ML505_resource.xml");
    EXPECT_EQ(Text(*root, "/FPGAHostSet/PreferredHost", "MaximumTargets"), "16");
    for (const LineFacts& facts : lineFacts) {
        std::string path = facts.path;
        path.insert(path.find('/', 1), "/IO");
        EXPECT_EQ(Text(*root, path.c_str(), "Pin"), facts.pin) << path;
        EXPECT_EQ(Text(*root, path.c_str(), "Standard"), facts.standard) << path;
    }
    EXPECT_EQ(Text(*root, "/ML505", "XMLParseErrors"), "none");
}

// Each block of the page that is marked as an excerpt.
TEST(CacheFilePage, ShowsExcerptsOfTheExamplesCache) {
    const std::string page = ReadBytes(ZKFPGA_SOURCE_DIR "/docs/cache-file.md");
    const std::string cache = ReadBytes(ZKFPGA_SOURCE_DIR "/tests/data/example_resource_cache.xml");
    const std::string fence = "```xml excerpt\n";
    size_t excerpts = 0;
    for (size_t found = page.find(fence); found != std::string::npos; found = page.find(fence, found)) {
        const size_t begin = found + fence.size();
        const size_t end = page.find("```", begin);
        ASSERT_NE(end, std::string::npos);
        EXPECT_NE(cache.find(page.substr(begin, end - begin)), std::string::npos) << page.substr(begin, end - begin);
        ++excerpts;
        found = end;
    }
    EXPECT_EQ(excerpts, 2U);
}

}  // namespace
}  // namespace zkhw
