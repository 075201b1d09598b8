/*
 * Part of bench/whole-run: the floor of a survey run. It does the process
 * work that any correct survey of one machine must do and nothing else: the
 * partition listing, then per active partition the client run and, only
 * after a successful client run, the fetch of its result. Every console
 * command is run as the survey tool runs it: two files made by mkstemp from
 * /tmp/ShellCommand.XXXXXX, system("CMD > OUT 2> ERR"), both files read back
 * and both removed. A partition whose client run fails gets the bytes of its
 * default VPD document, written with one call. No trace, no status file, no
 * output lines.
 *
 * Usage: whole-run-floor MACHINE [COMMAND-LOG]
 * With COMMAND-LOG, every command line is also appended to that file (for
 * the benchmark's check that floor and tool run the same commands).
 */
#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <time.h>
#include <unistd.h>

enum { COMMAND_SIZE = 4096, DOCUMENT_SIZE = 16384, READ_BLOCK = 8192 };

static const char listing_tool[] = "/opt/vtc/bin/lspartition -ix -c ";
static const char action_tool[] = "/usr/bin/runact-api -c ZOR.ServiceEvent::::";
static const char program[] = "quorvexPYLON_VPD_Survey_ClientPartition";
static const char vpd_folder[] = "/var/adm/quorvex/";

static FILE *command_log;

struct output {
    char *text;
    size_t length;
    size_t capacity;
};

struct partition {
    const char *id;
    const char *ip;
    const char *status;
    const char *host;
    const char *os_name;
    const char *os_version;
};

static void fail(const char *what) {
    perror(what);
    exit(1);
}

static void append_output(struct output *out, const char *bytes, size_t count) {
    if (out->length + count + 1 > out->capacity) {
        out->capacity = (out->length + count + 1) * 2;
        out->text = realloc(out->text, out->capacity);
        if (out->text == NULL) {
            fail("realloc");
        }
    }
    memcpy(out->text + out->length, bytes, count);
    out->length += count;
    out->text[out->length] = '\0';
}

static void read_file(const char *path, struct output *out) {
    char block[READ_BLOCK];
    ssize_t got;
    int descriptor = open(path, O_RDONLY | O_CLOEXEC);
    out->length = 0;
    append_output(out, "", 0);
    if (descriptor < 0) {
        return;
    }
    while ((got = read(descriptor, block, sizeof block)) > 0) {
        append_output(out, block, (size_t)got);
    }
    close(descriptor);
}

static void make_temporary(char *path) {
    int descriptor;
    strcpy(path, "/tmp/ShellCommand.XXXXXX");
    descriptor = mkstemp(path);
    if (descriptor < 0) {
        fail("mkstemp");
    }
    close(descriptor);
}

/* Runs one console command; its standard output ends up in out. */
static void run_command(const char *command, struct output *out, struct output *err) {
    char out_path[32];
    char err_path[32];
    char full[COMMAND_SIZE + 64];
    make_temporary(out_path);
    make_temporary(err_path);
    snprintf(full, sizeof full, "%s > %s 2> %s", command, out_path, err_path);
    if (command_log != NULL) {
        fprintf(command_log, "%s\n", command);
    }
    if (system(full) == -1) {
        fail("system");
    }
    read_file(out_path, out);
    read_file(err_path, err);
    remove(out_path);
    remove(err_path);
}

/* Cuts text at the separator; returns the rest, or NULL when there is none. */
static char *cut(char *text, char separator) {
    char *at = strchr(text, separator);
    if (at == NULL) {
        return NULL;
    }
    *at = '\0';
    return at + 1;
}

static void parse_record(char *record, struct partition *partition) {
    const char **fields[] = {&partition->id,   &partition->ip,      &partition->status,
                             &partition->host, &partition->os_name, &partition->os_version};
    size_t i;
    for (i = 0; i < sizeof fields / sizeof fields[0]; ++i) {
        *fields[i] = record != NULL ? record : "";
        record = record != NULL ? cut(record, ',') : NULL;
    }
}

/* The value after "KEY::" in a remote action output line, up to "::". */
static int value_is_zero(const char *line, const char *key) {
    const char *at = strstr(line, key);
    return at != NULL && strncmp(at + strlen(key), "::0::", 5) == 0;
}

/* "[KEY] = VALUE" lines with the keys right-aligned, as in the tool's reason. */
static size_t print_pairs(char *text, size_t size, const char *line) {
    char copy[COMMAND_SIZE];
    char *keys[16];
    char *values[16];
    size_t count = 0;
    size_t width = 0;
    size_t used = 0;
    size_t i;
    char *rest = copy;
    snprintf(copy, sizeof copy, "%s", line);
    cut(copy, '\n');
    while (rest != NULL && *rest != '\0' && count < 16) {
        char *separator = strstr(rest, "::");
        keys[count] = rest;
        values[count] = (char *)"";
        rest = NULL;
        if (separator != NULL) {
            *separator = '\0';
            values[count] = separator + 2;
            separator = strstr(values[count], "::");
            if (separator != NULL) {
                *separator = '\0';
                rest = separator + 2;
            }
        }
        if (strlen(keys[count]) > width) {
            width = strlen(keys[count]);
        }
        ++count;
    }
    for (i = 0; i < count; ++i) {
        used += (size_t)snprintf(text + used, size - used, "[%*s] = %s\n", (int)width, keys[i],
                                 values[i]);
    }
    return used;
}

static const char document_format[] =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
    "   <ResourceSet class=\"com.zor.inventory.Hardware\" timestamp=\"%lu000\" "
    "type=\"Hardware\" version=\"1.0\">\n"
    "      <Resource displayName=\"%s\" uniqueId=\"%s\">\n"
    "         %s\n"
    "         <ResourceList displayName=\"Partitions\">\n"
    "            <Resource displayName=\"%s\" uniqueId=\"%s-%s\">\n"
    "               %s\n"
    "               <Property displayName=\"HostName\" name=\"HN\">\n"
    "                  HN\n"
    "                  <Value type=\"string\">%s</Value>\n"
    "               </Property>\n"
    "               <Property displayName=\"Operating System\" name=\"OS\">\n"
    "                  OS\n"
    "                  <Value type=\"string\">%s %s</Value>\n"
    "               </Property>\n"
    "               <Property displayName=\"Partition ID\" name=\"PT\">\n"
    "                  PT\n"
    "                  <Value type=\"string\">%s</Value>\n"
    "               </Property>\n"
    "               <Property displayName=\"Machine or Cabinet Serial Number\" name=\"SE\">\n"
    "                  SE\n"
    "                  <Value type=\"string\">%s</Value>\n"
    "               </Property>\n"
    "               <Property displayName=\"Machine Type-Model\" name=\"TM\">\n"
    "                  TM\n"
    "                  <Value type=\"string\">%s</Value>\n"
    "               </Property>\n"
    "               <Property displayName=\"VD\" name=\"VD\">\n"
    "                  VD\n"
    "                  <Value type=\"string\">Partition not surveyed, reason: \n"
    "%s.\n"
    "\n"
    "%s"
    "\n"
    "\n"
    "</Value>\n"
    "               </Property>\n"
    "            </Resource>\n"
    "         </ResourceList>\n"
    "      </Resource>\n"
    "   </ResourceSet>\n"
    "</com.zor.inventory>";

/* The default document of a partition whose client run failed. */
static void write_default_document(const char *path, const char *type_model, const char *serial,
                                   const struct partition *partition, const char *client_line) {
    char document[DOCUMENT_SIZE];
    char pairs[COMMAND_SIZE];
    char machine[520];
    int length;
    int descriptor;
    const char *reason = value_is_zero(client_line, "Rc") ? "Partition Failed" : "RELAY Failed";
    print_pairs(pairs, sizeof pairs, client_line);
    snprintf(machine, sizeof machine, "%s-%s", type_model, serial);
    length = snprintf(document, sizeof document, document_format, (unsigned long)time(NULL),
                      machine, machine, machine, partition->host, machine, partition->id,
                      partition->host, partition->host, partition->os_name, partition->os_version,
                      partition->id, serial, type_model, reason, pairs);
    descriptor = open(path, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0644);
    if (descriptor < 0) {
        return;
    }
    if (write(descriptor, document, (size_t)length) != length) {
        fail("write");
    }
    close(descriptor);
}

static void survey_partition(const char *identity, const char *type_model, const char *serial,
                             const struct partition *partition, struct output *out,
                             struct output *err) {
    char command[COMMAND_SIZE];
    char local[1024];
    snprintf(local, sizeof local, "VPD/%s_%s-%s.VPD.xml", program, identity, partition->id);
    snprintf(command, sizeof command,
             "%srunCmdOnPartition::CallerID::0::CecMT::\"%s\"::CecMS::\"%s\"::PartitionId::\"%s\""
             "::CmdID::0::CmdOpts::\" -v  -of %s-%s.VPD.xml -c %s -pylonv 4.0.11\""
             "::RemoteFN::\"%s-%s.QuorvexOutput\""
             "::RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"",
             action_tool, type_model, serial, partition->id, identity, partition->id, identity,
             identity, partition->id);
    run_command(command, out, err);
    if (!value_is_zero(out->text, "Rc") || !value_is_zero(out->text, "RcCmd")) {
        char path[1200];
        snprintf(path, sizeof path, "%s%s", vpd_folder, local);
        write_default_document(path, type_model, serial, partition, out->text);
        return;
    }
    snprintf(command, sizeof command,
             "%sgetFileFromPartition::CallerID::0::CecMT::\"%s\"::CecMS::\"%s\"::PartitionId::\"%s\""
             "::RemoteFN::\"%s-%s.VPD.xml\"::LocalFN::\"%s\""
             "::LocalFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon\"",
             action_tool, type_model, serial, partition->id, identity, partition->id, local);
    run_command(command, out, err);
}

int main(int argc, char **argv) {
    char command[COMMAND_SIZE];
    char type_model[256];
    struct output listing = {NULL, 0, 0};
    struct output out = {NULL, 0, 0};
    struct output err = {NULL, 0, 0};
    const char *serial;
    char *record;
    if (argc < 2 || argc > 3 || strchr(argv[1], '_') == NULL) {
        fprintf(stderr, "usage: %s MACHINE [COMMAND-LOG]\n", argv[0]);
        return 2;
    }
    if (argc == 3 && (command_log = fopen(argv[2], "w")) == NULL) {
        fail(argv[2]);
    }
    snprintf(type_model, sizeof type_model, "%s", argv[1]);
    serial = cut(type_model, '_');
    snprintf(command, sizeof command, "%s%s", listing_tool, argv[1]);
    run_command(command, &listing, &err);
    cut(listing.text, '\n');
    for (record = listing.text; record != NULL && *record != '\0';) {
        char *next = cut(record, ';');
        struct partition partition;
        parse_record(record, &partition);
        if (atoi(partition.status) > 2) {
            survey_partition(argv[1], type_model, serial, &partition, &out, &err);
        }
        record = next;
    }
    if (command_log != NULL) {
        fclose(command_log);
    }
    free(listing.text);
    free(out.text);
    free(err.text);
    return 0;
}
