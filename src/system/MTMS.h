#pragma once

#include <string>

namespace Quorvex::System {

// Joins type-model and serial in the text form of a machine identity.
// A constant array, so it is ready before any other unit's start-up code runs.
inline constexpr char gc_TM_SE_Delimiter[] = "_";

// Identity of one managed machine: machine type-model and serial number.
class MTMS {
public:
    MTMS();
    // Both values are cleaned of the console's "ZOR" prefix.
    MTMS(std::string const& machineType_Model, std::string const& serial);
    // Splits a text form (type-model "_" serial) at its last "_"; a type-model
    // without "-" marks both fields with an appended "ERROR".
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: an identity text stands
    // wherever an identity is expected
    MTMS(std::string const& text);
    MTMS(MTMS const& other) = default;
    MTMS& operator=(MTMS const& other) = default;
    ~MTMS() = default;

    void assign_TM_SE(std::string const& machineType_Model, std::string const& serial);

    std::string const& get_MachineType_Model() const;
    std::string const& get_Serial() const;

    // type-model + separator + serial
    std::string to_String(std::string const& separator) const;
    // The first "-" of the type-model is replaced by dashReplacement; throws
    // std::out_of_range when the type-model holds no "-".
    std::string to_String(std::string const& dashReplacement, std::string const& separator) const;

    std::string __StringValue() const;
    operator std::string() const;

private:
    static std::string _verify_TM(std::string machineType_Model);
    static std::string _verify_SE(std::string serial);

    std::string _MachineType_Model;
    std::string _Serial;
};

// Equality and order are those of the text forms.
bool operator==(MTMS const& a, MTMS const& b);
bool operator!=(MTMS const& a, MTMS const& b);
bool operator<(MTMS const& a, MTMS const& b);

} // namespace Quorvex::System
