#include "FailingSystemCalls.h"

#include <linux/audit.h>
#include <linux/filter.h>
#include <linux/seccomp.h>
#include <sys/prctl.h>

#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace QuorvexTest {

namespace {

#if defined(__x86_64__)
constexpr std::uint32_t gc_Architecture = AUDIT_ARCH_X86_64;
#elif defined(__aarch64__)
constexpr std::uint32_t gc_Architecture = AUDIT_ARCH_AARCH64;
#else
// cppcheck-suppress preprocessorErrorDirective ; only on machines it does not know
#error "no seccomp architecture known for this machine"
#endif

sock_filter statement(std::uint16_t code, std::uint32_t value) {
    return sock_filter{code, 0, 0, value};
}

sock_filter jumpIfEqual(std::uint32_t value, std::uint8_t ifEqual, std::uint8_t otherwise) {
    return sock_filter{BPF_JMP | BPF_JEQ | BPF_K, ifEqual, otherwise, value};
}

// Calls of another architecture (the 32-bit ones) pass; each listed call
// returns the error.
std::vector<sock_filter> program(std::vector<long> const& calls, int errorNumber) {
    std::vector<sock_filter> instructions{
        statement(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, arch)),
        jumpIfEqual(gc_Architecture, 1, 0),
        statement(BPF_RET | BPF_K, SECCOMP_RET_ALLOW),
        statement(BPF_LD | BPF_W | BPF_ABS, offsetof(seccomp_data, nr)),
    };
    for (long const call : calls) {
        instructions.push_back(jumpIfEqual(static_cast<std::uint32_t>(call), 0, 1));
        instructions.push_back(statement(
            BPF_RET | BPF_K,
            SECCOMP_RET_ERRNO | (static_cast<std::uint32_t>(errorNumber) & SECCOMP_RET_DATA)));
    }
    instructions.push_back(statement(BPF_RET | BPF_K, SECCOMP_RET_ALLOW));
    return instructions;
}

} // namespace

std::string failSystemCalls(std::vector<long> const& calls, int errorNumber) {
    std::vector<sock_filter> instructions = program(calls, errorNumber);
    sock_fprog const filter{static_cast<unsigned short>(instructions.size()), instructions.data()};
    if (::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0) != 0) {
        return std::string("cannot set no_new_privs: ") + std::strerror(errno);
    }
    if (::prctl(PR_SET_SECCOMP, SECCOMP_MODE_FILTER, &filter) != 0) {
        return std::string("cannot install the seccomp filter: ") + std::strerror(errno);
    }
    return "";
}

} // namespace QuorvexTest
