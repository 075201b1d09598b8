// A VPD document as arbitrary bytes, read into components; and values taken
// from the same bytes, written into a document by the survey's writer and
// read back. Input: the document's bytes; for the second check, three
// FuzzedDataProvider strings (host name, operating system, serial number)
// and the location code, which is the rest.

#include "Fuzz_Utility.h"

#include "inventory/ComponentKeys.h"
#include "inventory/DocumentReader.h"
#include "transform/VPD_2_OStream.h"
#include "vpd/ResourceList.h"

#include <fuzzer/FuzzedDataProvider.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <exception>
#include <map>
#include <sstream>
#include <string>

namespace {

using inventory::Component;
using inventory::ComponentKey;
using inventory::DocumentReading;

void u_check_Stop(DocumentReading const& reading, std::string const& bytes) {
    if (!reading.stop) {
        Fuzz_Utility::u_require(reading.unreadableText().empty(),
                                "a document read whole has no unreadable text", bytes);
        return;
    }
    // Expat counts a carriage return as a line end too.
    auto const lineEnds =
        std::count_if(bytes.begin(), bytes.end(), [](char c) { return c == '\n' || c == '\r'; });
    Fuzz_Utility::u_require(reading.stop->line >= 1 &&
                                reading.stop->line <= static_cast<unsigned long>(lineEnds) + 1,
                            "reading stops at a line of the document", bytes);
    Fuzz_Utility::u_require(!reading.stop->reason.empty() &&
                                reading.unreadableText() == "document unreadable at line " +
                                                                std::to_string(reading.stop->line) +
                                                                ": " + reading.stop->reason,
                            "an unreadable document says where and why", bytes);
}

// The key a component must have, without its occurrence number.
ComponentKey u_expected_Key(Component const& component) {
    auto const location = std::find_if(
        component.keywords.begin(), component.keywords.end(),
        [](inventory::Keyword const& keyword) {
            return keyword.name == inventory::gc_LocationCodeKeyword && !keyword.value.empty();
        });
    if (location != component.keywords.end()) {
        return {ComponentKey::Kind::LocationCode, location->value};
    }
    if (!component.uniqueId.empty()) {
        return {ComponentKey::Kind::UniqueId, component.uniqueId};
    }
    return {ComponentKey::Kind::DisplayName, component.displayName};
}

void u_check_Components(DocumentReading const& reading, std::string const& bytes) {
    Fuzz_Utility::u_require(!reading.isDefaultDocument() || reading.components.empty(),
                            "a default document gives no components", bytes);
    std::map<std::pair<ComponentKey::Kind, std::string>, unsigned> seen;
    for (std::size_t index = 0; index < reading.components.size(); ++index) {
        Component const& component = reading.components[index];
        Fuzz_Utility::u_require(!component.parent || *component.parent < index,
                                "a component's resource comes before it", bytes);
        ComponentKey expected = u_expected_Key(component);
        expected.occurrence = ++seen[{expected.kind, expected.text}];
        Fuzz_Utility::u_require(component.key == expected,
                                "location code, else unique ID, else display name, numbered",
                                bytes);
    }
}

std::string u_written(std::string const& host, std::string const& system, std::string const& serial,
                      std::string const& location) {
    Quorvex::VPD::Resource adapter("ent0", "M-1-ent0");
    adapter.insert_Property(Quorvex::VPD::Property("SN", serial));
    adapter.insert_Property(Quorvex::VPD::Property("YL", location));
    Quorvex::VPD::Resource partition(host, "M-1");
    partition.insert_Property(Quorvex::VPD::Property("HN", host));
    partition.insert_Property(Quorvex::VPD::Property("OS", system));
    partition.insert_Resource("Adapters", adapter);
    Quorvex::VPD::Resource machine("M", "M");
    machine.insert_Resource("Partitions", partition);
    Quorvex::VPD::ResourceSet set("com.zor.inventory.Hardware", "Hardware", "1.0", "1");
    set.set_Resource(machine);
    std::ostringstream out;
    Transform::VPD_2_OStream{out}(set);
    return out.str();
}

// Printable ASCII without the closing value tag reads back as written; a
// host name, which is also an attribute value, without a quote as well.
bool u_is_Recoverable(std::string const& value, bool isAttribute) {
    bool const printable =
        std::all_of(value.begin(), value.end(), [](char c) { return c >= ' ' && c <= '~'; });
    return printable && value.find("</Value>") == std::string::npos &&
           (!isAttribute || value.find('"') == std::string::npos);
}

void u_check_RoundTrip(std::uint8_t const* data, std::size_t size) {
    FuzzedDataProvider provider(data, size);
    std::string const host = provider.ConsumeRandomLengthString();
    std::string const system = provider.ConsumeRandomLengthString();
    std::string const serial = provider.ConsumeRandomLengthString();
    std::string const location = provider.ConsumeRemainingBytesAsString();
    if (!u_is_Recoverable(host, true) || !u_is_Recoverable(system, false) ||
        !u_is_Recoverable(serial, false) || !u_is_Recoverable(location, false)) {
        return;
    }
    std::string const document = u_written(host, system, serial, location);
    DocumentReading const reading = inventory::readDocument(document);
    Fuzz_Utility::u_require(!reading.isUnreadable() && reading.components.size() == 3,
                            "a written document reads whole", document);
    Component const& partition = reading.components[1];
    Component const& adapter = reading.components[2];
    Fuzz_Utility::u_require(partition.displayName == host && partition.valueOf("HN") == host &&
                                partition.valueOf("OS") == system &&
                                adapter.valueOf("SN") == serial &&
                                adapter.valueOf("YL") == location,
                            "written values read back as written", document);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    std::string const bytes(reinterpret_cast<char const*>(data), size);
    try {
        DocumentReading const reading = inventory::readDocument(bytes);
        u_check_Stop(reading, bytes);
        u_check_Components(reading, bytes);
        u_check_RoundTrip(data, size);
    } catch (std::exception const& error) {
        Fuzz_Utility::u_fail("reading a document never throws", error.what());
    }
    return 0;
}
