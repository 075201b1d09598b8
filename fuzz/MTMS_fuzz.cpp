// The machine identity from an arbitrary text, its text forms and order.
// Input: three FuzzedDataProvider strings (dash replacement, separator,
// second identity) around the identity text, which is the rest.

#include "Fuzz_Utility.h"

#include "system/MTMS.h"

#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <exception>
#include <stdexcept>
#include <string>

namespace {

constexpr char gc_InvalidMarker[] = "ERROR";
constexpr std::string::size_type gc_TM_PrefixLength = 4;
constexpr std::string::size_type gc_SE_PrefixLength = 6;

void u_check_TextForm(Quorvex::System::MTMS const& mtms, std::string const& text) {
    std::string typeModel;
    std::string serial;
    Fuzz_Utility::u_expected_TM_SE(text, typeModel, serial);
    if (typeModel.find('-') == std::string::npos) {
        typeModel += gc_InvalidMarker;
        serial += gc_InvalidMarker;
    }
    Fuzz_Utility::u_require(mtms.get_MachineType_Model() == typeModel &&
                                mtms.get_Serial() == serial,
                            R"(the text splits at its last "_", marked when no "-")", text);
    std::string const joined = typeModel + "_" + serial;
    Fuzz_Utility::u_require(mtms.__StringValue() == joined && std::string(mtms) == joined,
                            R"(the text form joins type-model and serial with "_")", text);
    Fuzz_Utility::u_require(mtms.to_String("") == typeModel + serial,
                            "the separator stands between type-model and serial", text);
    if (text.find('_') != std::string::npos && text.find('-') < text.rfind('_')) {
        Fuzz_Utility::u_require(joined == text, "a well-formed text comes back unchanged", text);
    }
}

void u_check_DashReplacement(Quorvex::System::MTMS const& mtms, std::string const& replacement,
                             std::string const& separator) {
    std::string const& typeModel = mtms.get_MachineType_Model();
    std::string::size_type const dash = typeModel.find('-');
    try {
        std::string const text = mtms.to_String(replacement, separator);
        Fuzz_Utility::u_require(dash != std::string::npos &&
                                    text == typeModel.substr(0, dash) + replacement +
                                                typeModel.substr(dash + 1) + separator +
                                                mtms.get_Serial(),
                                "the first \"-\" of the type-model is replaced", typeModel);
    } catch (std::out_of_range const&) {
        Fuzz_Utility::u_require(dash == std::string::npos,
                                "only a type-model without \"-\" throws out_of_range", typeModel);
    }
}

void u_check_Cleaning(std::string const& typeModel, std::string const& serial) {
    Quorvex::System::MTMS const mtms(typeModel, serial);
    std::string const cleanTypeModel =
        Fuzz_Utility::u_without_ConsolePrefix(typeModel, gc_TM_PrefixLength);
    std::string const cleanSerial =
        Fuzz_Utility::u_without_ConsolePrefix(serial, gc_SE_PrefixLength);
    Fuzz_Utility::u_require(
        mtms.get_MachineType_Model() == cleanTypeModel && mtms.get_Serial() == cleanSerial,
        "a leading \"ZOR\" drops 4 characters of the type-model and 6 of the serial",
        typeModel + "|" + serial);
    Quorvex::System::MTMS assigned;
    assigned.assign_TM_SE(typeModel, serial);
    Fuzz_Utility::u_require(assigned.get_MachineType_Model() == cleanTypeModel &&
                                assigned.get_Serial() == cleanSerial,
                            "assigning cleans like constructing", typeModel + "|" + serial);
}

void u_check_Order(Quorvex::System::MTMS const& a, Quorvex::System::MTMS const& b) {
    std::string const textA = a;
    std::string const textB = b;
    // Identities compare as their text forms, and nothing sorts before itself.
    // cppcheck-suppress knownConditionTrueFalse
    bool const equality = (a == b) == (textA == textB) && (a != b) == (textA != textB);
    // cppcheck-suppress [knownConditionTrueFalse,duplicateExpression]
    bool const order = (a < b) == (textA < textB) && !(a < a);
    Fuzz_Utility::u_require(equality && order, "equality and order are those of the text forms",
                            textA + "|" + textB);
    Quorvex::System::MTMS copy(a);
    Fuzz_Utility::u_require(copy == a, "a copy is equal", textA);
    copy = b;
    Fuzz_Utility::u_require(copy == b, "an assigned identity is equal", textB);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(std::uint8_t const* data, std::size_t size) {
    FuzzedDataProvider provider(data, size);
    std::string const replacement = provider.ConsumeRandomLengthString();
    std::string const separator = provider.ConsumeRandomLengthString();
    std::string const other = provider.ConsumeRandomLengthString();
    std::string const text = provider.ConsumeRemainingBytesAsString();
    try {
        Quorvex::System::MTMS const mtms(text);
        u_check_TextForm(mtms, text);
        u_check_DashReplacement(mtms, replacement, separator);
        u_check_Cleaning(text, other);
        u_check_Order(mtms, Quorvex::System::MTMS(other));
    } catch (std::exception const& error) {
        Fuzz_Utility::u_fail("an identity throws nothing but to_String's out_of_range",
                             error.what());
    }
    return 0;
}
