// Ingesting and computing the changes of a whole estate's runs: 20 consoles
// x 50 machines x 200 partitions, each partition with a VPD document shaped
// like the simulated console's (bench/README.md, "The history of runs").
//
//   history_changes_bench generate DIR   first round of documents
//   history_changes_bench change DIR     second round: a few documents change
//   history_changes_bench ingest DIR DB  records one run per console
#include "history/ChangeRecorder.h"
#include "history/HistoryDatabase.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <SQLiteCpp/SQLiteCpp.h>

#include <sys/stat.h>

#include <cerrno>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <string>

namespace {

constexpr int gc_Consoles = 20;
constexpr int gc_Machines = 50;
constexpr int gc_Partitions = 200;
// In the second round every this many partitions gets a new adapter
// serial, a new code level, or loses a memory module.
constexpr int gc_ChangeEvery = 997;
// Partitions whose survey fails in a round: every this many.
constexpr int gc_FailEvery = 500;

std::string consoleFolder(std::string const& dir, int console) {
    return dir + "/c" + std::to_string(console);
}

std::string documentName(int machine, int partition) {
    return "m" + std::to_string(machine) + "-p" + std::to_string(partition) + ".VPD.xml";
}

void makeFolder(std::string const& path) {
    if (mkdir(path.c_str(), 0755) != 0 && errno != EEXIST) {
        throw util::SystemError("create folder", path, errno);
    }
}

void writeText(std::string const& path, std::string const& text) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << text;
    if (!out.flush()) {
        throw util::SystemError("write", path, errno);
    }
}

std::string property(std::string const& indent, std::string const& keyword, std::string const& name,
                     std::string const& value) {
    return indent + "<Property displayName=\"" + name + "\" name=\"" + keyword + "\">\n" + indent +
           "   " + keyword + "\n" + indent + "   <Value type=\"string\">" + value + "</Value>\n" +
           indent + "</Property>\n";
}

std::string resource(std::string const& name, std::string const& id, std::string const& body) {
    std::string const indent = "                  ";
    return indent + "<Resource displayName=\"" + name + "\" uniqueId=\"" + id + "\">\n" + indent +
           "   " + name + "\n" + body + indent + "</Resource>\n";
}

std::string card(std::string const& id, std::string const& name, std::string const& serial,
                 std::string const& slot) {
    std::string const indent = "                     ";
    return resource(name, id + "-" + name,
                    property(indent, "CC", "Customer Card Identification Number", "2CE3") +
                        property(indent, "FN", "FRU Number", "01FT741") +
                        property(indent, "PN", "PartNumber of assembly", "01FT739") +
                        property(indent, "SN", "Serial Number", serial) +
                        property(indent, "YL", "Hardware Location Code", slot));
}

std::string memory(std::string const& id, std::string const& name, std::string const& serial,
                   std::string const& slot) {
    std::string const indent = "                     ";
    return resource(name, id + "-" + name,
                    property(indent, "FN", "FRU Number", "78P6575") +
                        property(indent, "SN", "Serial Number", serial) +
                        property(indent, "SZ", "Size", "64GB") +
                        property(indent, "YL", "Hardware Location Code", slot));
}

// What a partition's document holds in a round.
struct Variant {
    std::string adapterSerial;
    std::string codeLevel = "FW950.80";
    bool secondDimm = true;
};

Variant variantOf(int round, long long index) {
    std::string const serial = "Y" + std::to_string(100000000 + index);
    Variant variant{serial + "A"};
    if (round == 2 && index % gc_ChangeEvery == 1) {
        variant.adapterSerial = serial + "B";
    }
    if (round == 2 && index % gc_ChangeEvery == 2) {
        variant.codeLevel = "FW950.90";
    }
    if (round == 2 && index % gc_ChangeEvery == 3) {
        variant.secondDimm = false;
    }
    return variant;
}

std::string partitionBody(std::string const& host, std::string const& id, Variant const& variant,
                          long long index) {
    std::string const indent = "               ";
    std::string const slot = "U78D5.ND1.C" + std::to_string(index) + "-P1-";
    std::string body = property(indent, "CL", "Code Level", variant.codeLevel) +
                       property(indent, "HN", "HostName", host) +
                       property(indent, "OS", "Operating System", "Zeph 7.2") +
                       property(indent, "PT", "Partition ID", std::to_string(index % 1000)) +
                       property(indent, "SE", "Machine or Cabinet Serial Number", "21ABCDE") +
                       property(indent, "TM", "Machine Type-Model", "9119-MHE");
    std::string const serial = std::to_string(200000000 + index);
    body += indent + "<ResourceList displayName=\"Adapters\">\n" +
            card(id, "ent0", variant.adapterSerial, slot + "C6-T1") +
            card(id, "fcs0", "YA" + serial, slot + "C3-T1") +
            card(id, "sas0", "YL" + serial, slot + "C9-T1") + indent + "</ResourceList>\n";
    body += indent + "<ResourceList displayName=\"Memory\">\n" +
            memory(id, "DIMM-C17", "YH1" + serial, slot + "C17");
    if (variant.secondDimm) {
        body += memory(id, "DIMM-C18", "YH2" + serial, slot + "C18");
    }
    return body + indent + "</ResourceList>\n";
}

std::string document(int round, int machine, long long index) {
    std::string const host = "host" + std::to_string(index);
    std::string const system = "9119-MHE-" + std::to_string(machine);
    std::string const id = system + "-" + std::to_string(index);
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
           "   <ResourceSet class=\"com.zor.inventory.Hardware\" timestamp=\"1700000000000\""
           " type=\"Hardware\" version=\"1.0\">\n"
           "      <Resource displayName=\"" +
           system + "\" uniqueId=\"" + system + "\">\n" + "         " + system +
           "\n         <ResourceList displayName=\"Partitions\">\n" +
           "            <Resource displayName=\"" + host + "\" uniqueId=\"" + id + "\">\n" +
           "               " + host + "\n" +
           partitionBody(host, id, variantOf(round, index), index) +
           "            </Resource>\n         </ResourceList>\n      </Resource>\n"
           "   </ResourceSet>\n</com.zor.inventory>\n";
}

long long indexOf(int console, int machine, int partition) {
    return (static_cast<long long>(console) * gc_Machines + machine) * gc_Partitions + partition;
}

void generate(std::string const& dir, int round) {
    makeFolder(dir);
    for (int console = 0; console < gc_Consoles; ++console) {
        makeFolder(consoleFolder(dir, console));
        for (int machine = 0; machine < gc_Machines; ++machine) {
            for (int partition = 0; partition < gc_Partitions; ++partition) {
                long long const index = indexOf(console, machine, partition);
                if (round == 1 || index % gc_ChangeEvery <= 3) {
                    writeText(consoleFolder(dir, console) + "/" + documentName(machine, partition),
                              document(round, machine, index));
                }
            }
        }
    }
    writeText(dir + "/round", std::to_string(round));
}

// The run rows quorvex-survey writes before it computes the changes.
class RunRows {
public:
    explicit RunRows(SQLite::Database& db)
        : _db(db), _machine(db, "INSERT INTO machine_results (run_id, machine, return_code)"
                                " VALUES (?, ?, '0')"),
          _partition(db, "INSERT INTO partition_results (run_id, machine, partition, ip,"
                         " outcome, status_text, reason, document, inventory)"
                         " VALUES (?, ?, ?, '10.0.0.1', ?, ?, ?, ?, 'none')") {}

    long long insert(int console, int round) {
        SQLite::Statement run(_db, "INSERT INTO runs (console, tool, started, ended, started_unix,"
                                   " recorded_unix, exit_status, return_code, partitions,"
                                   " surveyed, failed, summary) VALUES (?, 'quorvex-survey',"
                                   " 's', 'e', ?, ?, 0, '0', 10000, 10000, 0, '{}')");
        run.bind(1, "console" + std::to_string(console));
        run.bind(2, static_cast<std::int64_t>(round));
        run.bind(3, static_cast<std::int64_t>(round));
        run.exec();
        long long const id = _db.getLastInsertRowid();
        for (int machine = 0; machine < gc_Machines; ++machine) {
            _insertMachine(id, console, machine, round);
        }
        return id;
    }

private:
    SQLite::Database& _db;
    SQLite::Statement _machine;
    SQLite::Statement _partition;

    void _insertMachine(long long id, int console, int machine, int round) {
        std::string const name = "9119-MHE_" + std::to_string(machine);
        _machine.bind(1, static_cast<std::int64_t>(id));
        _machine.bind(2, name);
        _machine.exec();
        _machine.reset();
        for (int partition = 0; partition < gc_Partitions; ++partition) {
            long long const index = indexOf(console, machine, partition);
            bool const fails = index % gc_FailEvery == round;
            _partition.bind(1, static_cast<std::int64_t>(id));
            _partition.bind(2, name);
            _partition.bind(3, "host" + std::to_string(index));
            _partition.bind(4, fails ? "channel_failure" : "surveyed");
            _partition.bind(5, fails ? "Failed" : "Ok");
            if (fails) {
                _partition.bind(6, "timeout");
            } else {
                _partition.bind(6);
            }
            _partition.bind(7, "/var/adm/quorvex/VPD/" + documentName(machine, partition));
            _partition.exec();
            _partition.reset();
        }
    }
};

void ingest(std::string const& dir, std::string const& file) {
    int const round = std::stoi(util::readWholeFile(dir + "/round"));
    // Opened as quorvex-survey opens it: the same pragmas and schema.
    history::HistoryDatabase history(file);
    SQLite::Database& db = history.connection();
    auto const start = std::chrono::steady_clock::now();
    RunRows rows(db);
    for (int console = 0; console < gc_Consoles; ++console) {
        SQLite::Transaction transaction(db);
        long long const run = rows.insert(console, round);
        history::ChangeRecorder(consoleFolder(dir, console)).record(db, run);
        transaction.commit();
    }
    std::chrono::duration<double> const seconds = std::chrono::steady_clock::now() - start;
    std::printf("round %d: %d partitions in %.2f s; %lld documents, %lld events\n", round,
                gc_Consoles * gc_Machines * gc_Partitions, seconds.count(),
                static_cast<long long>(db.execAndGet("SELECT count(*) FROM documents").getInt64()),
                static_cast<long long>(db.execAndGet("SELECT count(*) FROM events").getInt64()));
    SQLite::Statement kinds(db, "SELECT scope, kind, count(*) FROM events GROUP BY scope, kind");
    while (kinds.executeStep()) {
        std::printf("  %s %s %d\n", kinds.getColumn(0).getText(), kinds.getColumn(1).getText(),
                    kinds.getColumn(2).getInt());
    }
}

} // namespace

int main(int argc, char** argv) {
    std::string const command = argc > 1 ? argv[1] : "";
    try {
        if (command == "generate" && argc == 3) {
            generate(argv[2], 1);
        } else if (command == "change" && argc == 3) {
            generate(argv[2], 2);
        } else if (command == "ingest" && argc == 4) {
            ingest(argv[2], argv[3]);
        } else {
            std::cerr << "usage: history_changes_bench generate DIR | change DIR | ingest DIR DB\n";
            return 2;
        }
    } catch (std::exception const& error) {
        std::cerr << "history_changes_bench: " << error.what() << "\n";
        return 1;
    }
    return 0;
}
