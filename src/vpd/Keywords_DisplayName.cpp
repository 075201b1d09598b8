#include "vpd/Keywords_DisplayName.h"

namespace Quorvex::VPD {

namespace {

struct KeywordRow {
    const char* keyword;
    const char* displayName;
};

// Inserted in this order. The texts go unchanged into every VPD document
// that other programs read.
// Kept for the inventory importers: see docs/compatibility.md#keyword-display-names
constexpr KeywordRow gc_KeywordRows[] = {
    {"EC", "Engineering Change Level"},
    {"FN", "FRU Number"},
    {"MN", "Manufacturer ID"},
    {"PN", "PartNumber of assembly"},
    {"SE", "Machine or Cabinet Serial Number"},
    {"SN", "Serial Number"},
    {"TM", "Machine Type-Model"},
    {"AD", "Addressing Field"},
    {"AP", "Asset Protection Key Password"},
    {"AS", "Indicates the start of an Vireo unique 128 byte data area"},
    {"AT", "Reserved - used for Strandway Architecture VPD"},
    {"AX", "Zeph Name"},
    {"BC", "Bar Code"},
    {"BH", "Batch Code"},
    {"BR", "Brand Keyword"},
    {"CC", "Customer Card Identification Number"},
    {"CE", "CCIN Extender"},
    {"CD", "Card ID"},
    {"CI", "CEC ID"},
    {"CL", "Code Level"},
    {"CN", "Customer Number"},
    {"CV", "Country Number"},
    {"DC", "Action Code, timestamp"},
    {"DD", "Reserved - used for Strandway Architecture VPD"},
    {"DG", "Reserved - used for Strandway Architecture VPD"},
    {"DU", "Drawer Unit"},
    {"DL", "Drawer Level"},
    {"DS", "Displayable Message"},
    {"EA", "Electronic Message for customer support (ECS)"},
    {"FC", "Feature Code or Request for Price Quotation (RPQ) number"},
    {"FD", "Field Bill of Material (FBM) EC level"},
    {"FG", "Flag Field"},
    {"FI", "Frame ID"},
    {"FL", "FRU Label"},
    {"FU", "Function Unit"},
    {"HN", "HostName"},
    {"L1", "Location Information: Individual or Company Name"},
    {"L2", "Location Information: Street Address"},
    {"L3", "Location Information: City, State, Country"},
    {"L4", "Location Information: Zip Code"},
    {"L5", "Location Information: Contact Name"},
    {"L6", "Location Information: Contact Phone Number"},
    {"LA", "LIC Node Alternate Bus VPD"},
    {"LI", "Adapter Software Identification"},
    {"LL", "Adapter Software Level"},
    {"LN", "LIC Node VPD"},
    {"LO", "Location"},
    {"LP", "LIC Node Primary Bus VPD"},
    {"MD", "Model Number"},
    {"MF", "Map Format"},
    {"MI", "Microcode Image"},
    {"MP", "Module Plug count"},
    {"MS", "MES Number"},
    {"NA", "Network Address"},
    {"NN", "Node Name"},
    {"NT", "Used within MRPD for sub-machine type"},
    {"NV", "NVRAM ID, part number, location and size"},
    {"NX", "Reserved - used for Strandway Architecture VPD"},
    {"OS", "Operating System"},
    {"PA", "Op Panel installed flag"},
    {"PC", "Processor Component Definition"},
    {"PD", "Power Dissipation / consumption"},
    {"PI", "Processor ID or unique ID"},
    {"PL", "Zeph Location code"},
    {"PM", "Port Map: Contains the Loopway Port Map label information"},
    {"PG", "Point of Origin"},
    {"PO", "Tessel VPD: Identification of the Tessel VPD area on the I/O backplane"},
    {"PP", "Power Parameters: Tessel field identifying Power node parameters"},
    {"PR", "Power: 8 bytes of binary information for Power Control"},
    {"PT", "Partition ID"},
    {"RA", "Reserved - used for Strandway Architecture VPD"},
    {"RD", "Power Domain ID"},
    {"RI", "Power Resource ID"},
    {"RK", "Rack Unique ID"},
    {"RL", "Non-alterable ROM level"},
    {"RM", "Alterable ROM level"},
    {"RN", "Rack Name"},
    {"RS", "Halcyon unique VPD: Start of a data area"},
    {"RW", "Reserved - used for Strandway Architecture VPD"},
    {"S1", "Serial Number of attached machine"},
    {"SC", "Specify codes"},
    {"SF", "FCSI number"},
    {"SI", "Subsystem Vendor ID"},
    {"SL", "Reserved - used for Strandway Architecture VPD"},
    {"SM", "Slot Map"},
    {"SY", "System Number"},
    {"SZ", "Size"},
    {"TI", "Attached machine type-model"},
    {"V3", "Attached PYLONs"},
    {"VE", "Reserved - used for Strandway Architecture VPD"},
    {"VI", "Vendor ID / Device ID"},
    {"VK", "Version of Keywords"},
    {"N5", "Processor CoD Capacity Card Info"},
    {"N6", "Memory CoD Capacity Info"},
    {"N7", "Processor CoD Billing"},
    {"N8", "Memory CoD Billing"},
    {"U_", "User Data"},
    {"Y0", "Board Repair Actions"},
    {"Y1", "Error Descriptor"},
    {"Y2", "Only in system VPD EEPROM"},
    {"Y3", "Maintenance Contract Information"},
    {"YK", "Ties together multiple enclosures that share the same combined SE and TM"},
    {"YL", "Hardware Location Code"},
    {"Z_", "Product Specific Information"},
};

constexpr std::string::size_type gc_NumberOf_WildcardPositions = 2;
constexpr char gc_Wildcard = '*';

} // namespace

Keywords_DisplayName::Keywords_DisplayName() {
    for (KeywordRow const& row : gc_KeywordRows) {
        _insert(row.keyword, row.displayName);
    }
}

std::string const& Keywords_DisplayName::operator[](std::string const& keyword) const {
    auto hit = _Table.find(keyword);
    if (hit == _Table.end()) {
        hit = _find_Wildcard(keyword);
    }
    return hit == _Table.end() ? keyword : hit->second;
}

Keywords_DisplayName::const_iterator Keywords_DisplayName::begin() const {
    return _Table.begin();
}

Keywords_DisplayName::const_iterator Keywords_DisplayName::end() const {
    return _Table.end();
}

std::size_t Keywords_DisplayName::size() const {
    return _Table.size();
}

void Keywords_DisplayName::_insert(std::string const& keyword, std::string const& displayName) {
    _Table.emplace(keyword, displayName);
}

Keywords_DisplayName::const_iterator
Keywords_DisplayName::_find_Wildcard(std::string const& keyword) const {
    for (std::string::size_type i = 0; i < gc_NumberOf_WildcardPositions && i < keyword.size();
         ++i) {
        std::string pattern = keyword;
        pattern[i] = gc_Wildcard;
        auto const hit = _Table.find(pattern);
        if (hit != _Table.end()) {
            return hit;
        }
    }
    return _Table.end();
}

} // namespace Quorvex::VPD
