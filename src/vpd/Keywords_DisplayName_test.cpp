#include "vpd/Keywords_DisplayName.h"

#include <gtest/gtest.h>

#include <iterator>
#include <sstream>
#include <string>

namespace {

using Quorvex::VPD::Keywords_DisplayName;

std::string u_listTable(Keywords_DisplayName const& table) {
    std::ostringstream out;
    for (auto const& row : table) {
        out << row.first << " = " << row.second << '\n';
    }
    return out.str();
}

// Every row, in byte order of the keywords.
constexpr char gc_ExpectedTable[] = R"(
AD = Addressing Field
AP = Asset Protection Key Password
AS = Indicates the start of an Vireo unique 128 byte data area
AT = Reserved - used for Strandway Architecture VPD
AX = Zeph Name
BC = Bar Code
BH = Batch Code
BR = Brand Keyword
CC = Customer Card Identification Number
CD = Card ID
CE = CCIN Extender
CI = CEC ID
CL = Code Level
CN = Customer Number
CV = Country Number
DC = Action Code, timestamp
DD = Reserved - used for Strandway Architecture VPD
DG = Reserved - used for Strandway Architecture VPD
DL = Drawer Level
DS = Displayable Message
DU = Drawer Unit
EA = Electronic Message for customer support (ECS)
EC = Engineering Change Level
FC = Feature Code or Request for Price Quotation (RPQ) number
FD = Field Bill of Material (FBM) EC level
FG = Flag Field
FI = Frame ID
FL = FRU Label
FN = FRU Number
FU = Function Unit
HN = HostName
L1 = Location Information: Individual or Company Name
L2 = Location Information: Street Address
L3 = Location Information: City, State, Country
L4 = Location Information: Zip Code
L5 = Location Information: Contact Name
L6 = Location Information: Contact Phone Number
LA = LIC Node Alternate Bus VPD
LI = Adapter Software Identification
LL = Adapter Software Level
LN = LIC Node VPD
LO = Location
LP = LIC Node Primary Bus VPD
MD = Model Number
MF = Map Format
MI = Microcode Image
MN = Manufacturer ID
MP = Module Plug count
MS = MES Number
N5 = Processor CoD Capacity Card Info
N6 = Memory CoD Capacity Info
N7 = Processor CoD Billing
N8 = Memory CoD Billing
NA = Network Address
NN = Node Name
NT = Used within MRPD for sub-machine type
NV = NVRAM ID, part number, location and size
NX = Reserved - used for Strandway Architecture VPD
OS = Operating System
PA = Op Panel installed flag
PC = Processor Component Definition
PD = Power Dissipation / consumption
PG = Point of Origin
PI = Processor ID or unique ID
PL = Zeph Location code
PM = Port Map: Contains the Loopway Port Map label information
PN = PartNumber of assembly
PO = Tessel VPD: Identification of the Tessel VPD area on the I/O backplane
PP = Power Parameters: Tessel field identifying Power node parameters
PR = Power: 8 bytes of binary information for Power Control
PT = Partition ID
RA = Reserved - used for Strandway Architecture VPD
RD = Power Domain ID
RI = Power Resource ID
RK = Rack Unique ID
RL = Non-alterable ROM level
RM = Alterable ROM level
RN = Rack Name
RS = Halcyon unique VPD: Start of a data area
RW = Reserved - used for Strandway Architecture VPD
S1 = Serial Number of attached machine
SC = Specify codes
SE = Machine or Cabinet Serial Number
SF = FCSI number
SI = Subsystem Vendor ID
SL = Reserved - used for Strandway Architecture VPD
SM = Slot Map
SN = Serial Number
SY = System Number
SZ = Size
TI = Attached machine type-model
TM = Machine Type-Model
U_ = User Data
V3 = Attached PYLONs
VE = Reserved - used for Strandway Architecture VPD
VI = Vendor ID / Device ID
VK = Version of Keywords
Y0 = Board Repair Actions
Y1 = Error Descriptor
Y2 = Only in system VPD EEPROM
Y3 = Maintenance Contract Information
YK = Ties together multiple enclosures that share the same combined SE and TM
YL = Hardware Location Code
Z_ = Product Specific Information
)";

TEST(VPD_Keywords_DisplayName, SE_SN_TM_YieldTheirDisplayNames) {
    Keywords_DisplayName const table;
    EXPECT_EQ(table["SE"], "Machine or Cabinet Serial Number");
    EXPECT_EQ(table["SN"], "Serial Number");
    EXPECT_EQ(table["TM"], "Machine Type-Model");
}

TEST(VPD_Keywords_DisplayName, UnknownKeywordYieldsItself) {
    Keywords_DisplayName const table;
    std::string const keyword = "ZZ";
    std::string const& name = table[keyword];
    EXPECT_EQ(name, "ZZ");
    EXPECT_EQ(&name, &keyword);
}

TEST(VPD_Keywords_DisplayName, EmptyKeywordYieldsEmptyString) {
    Keywords_DisplayName const table;
    EXPECT_EQ(table[""], "");
}

TEST(VPD_Keywords_DisplayName, LookUpNeverInserts) {
    Keywords_DisplayName const table;
    std::string const name = table["ZZ"];
    EXPECT_EQ(name, "ZZ");
    EXPECT_EQ(table.size(), 104u);
    EXPECT_EQ(table["ZZ"], "ZZ");
}

TEST(VPD_Keywords_DisplayName, HoldsAllRowsVerbatimInByteOrder) {
    Keywords_DisplayName const table;
    EXPECT_EQ(table.size(), 104u);
    EXPECT_EQ("\n" + u_listTable(table), gc_ExpectedTable);
}

TEST(VPD_Keywords_DisplayName, IterationIsInByteOrderNotInsertionOrder) {
    Keywords_DisplayName const table;
    auto row = table.begin();
    EXPECT_EQ((row++)->first, "AD");
    EXPECT_EQ((row++)->first, "AP");
    EXPECT_EQ((row++)->first, "AS");
    EXPECT_EQ(std::prev(table.end())->first, "Z_");
    auto tm = table.begin();
    while (tm != table.end() && tm->first != "TM") {
        ++tm;
    }
    ASSERT_NE(tm, table.end());
    EXPECT_EQ(tm->first, "TM");
    EXPECT_EQ(std::next(tm)->first, "U_");
    EXPECT_EQ(std::next(tm, 2)->first, "V3");
}

TEST(VPD_Keywords_DisplayName, SecondInsertKeepsFirstDisplayName) {
    Keywords_DisplayName table;
    table._insert("SE", "Other Name");
    EXPECT_EQ(table["SE"], "Machine or Cabinet Serial Number");
    table._insert("QQ", "First");
    table._insert("QQ", "Second");
    EXPECT_EQ(table["QQ"], "First");
}

TEST(VPD_Keywords_DisplayName, WildcardRowMatchesFirstOrSecondCharacter) {
    Keywords_DisplayName table;
    table._insert("*Q", "Any then Q");
    table._insert("Q*", "Q then any");
    EXPECT_EQ(table["XQ"], "Any then Q");
    EXPECT_EQ(table["QX"], "Q then any");
    // First position is tried first.
    EXPECT_EQ(table["QQ"], "Any then Q");
}

TEST(VPD_Keywords_DisplayName, WildcardReplacesOnlyOneCharacter) {
    Keywords_DisplayName table;
    table._insert("**", "Both");
    EXPECT_EQ(table["AB"], "AB");
    table._insert("*BC", "Three");
    EXPECT_EQ(table["ABC"], "Three");
    EXPECT_EQ(table["ABD"], "ABD");
}

TEST(VPD_Keywords_DisplayName, WildcardIsNotTriedBeyondSecondCharacter) {
    Keywords_DisplayName table;
    table._insert("AB*", "Third");
    EXPECT_EQ(table["ABC"], "ABC");
}

TEST(VPD_Keywords_DisplayName, OneCharacterKeywordTriesOnlyFirstPosition) {
    Keywords_DisplayName table;
    table._insert("*", "Any single");
    EXPECT_EQ(table["Q"], "Any single");
}

TEST(VPD_Keywords_DisplayName, CopyHoldsTheSameRows) {
    Keywords_DisplayName table;
    table._insert("QQ", "Extra");
    Keywords_DisplayName const copy(table);
    EXPECT_EQ(copy["QQ"], "Extra");
    EXPECT_EQ(copy.size(), 105u);
}

} // namespace
