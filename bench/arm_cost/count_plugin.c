// A plugin for qemu-user that counts executed guest instructions: all, those of the vector and
// floating-point units, and those that access memory. Exact for programs of one thread.
//
// With the argument "listing=on" it also prints, for every instruction that was executed, how often
// and at which address.
//
// The few declarations of the plugin interface (version 1) that it needs stand here, because Debian
// ships no header for it.
#include <inttypes.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

typedef uint64_t qemu_plugin_id_t;
struct qemu_plugin_tb;
struct qemu_plugin_insn;
enum qemu_plugin_op { QEMU_PLUGIN_INLINE_ADD_U64 };

void qemu_plugin_register_vcpu_tb_trans_cb(qemu_plugin_id_t id,
                                           void (*cb)(qemu_plugin_id_t, struct qemu_plugin_tb*));
void qemu_plugin_register_atexit_cb(qemu_plugin_id_t id, void (*cb)(qemu_plugin_id_t, void*),
                                    void* data);
void qemu_plugin_register_vcpu_insn_exec_inline(struct qemu_plugin_insn* insn,
                                                enum qemu_plugin_op op, void* counter,
                                                uint64_t increment);
size_t qemu_plugin_tb_n_insns(const struct qemu_plugin_tb* tb);
struct qemu_plugin_insn* qemu_plugin_tb_get_insn(const struct qemu_plugin_tb* tb, size_t index);
uint64_t qemu_plugin_insn_vaddr(const struct qemu_plugin_insn* insn);
char* qemu_plugin_insn_disas(const struct qemu_plugin_insn* insn);
void qemu_plugin_outs(const char* text);

__attribute__((visibility("default"))) int qemu_plugin_version = 1;

static uint64_t all, vector, memory;

// Counts by address, a hash table. Blocks are translated more than once, so an address may come
// again. Programs of more instructions than it holds are not listed wholly, which on_exit tells.
enum { kSites = 1 << 18 };
struct site {
  uint64_t address;
  uint64_t executions;
};
static struct site sites[kSites];
static size_t sites_used;
static int lists;

static struct site* site_at(uint64_t address) {
  size_t i = (size_t)(address / 2) % kSites;
  while (sites[i].address != 0 && sites[i].address != address) i = (i + 1) % kSites;
  if (sites[i].address == 0) {
    if (sites_used == kSites / 2) return NULL;
    ++sites_used;
    sites[i].address = address;
  }
  return &sites[i];
}

static int starts_with_any(const char* text, const char* const* prefixes) {
  for (; *prefixes; ++prefixes)
    if (strncmp(text, *prefixes, strlen(*prefixes)) == 0) return 1;
  return 0;
}

static void count(struct qemu_plugin_insn* insn, uint64_t* counter) {
  qemu_plugin_register_vcpu_insn_exec_inline(insn, QEMU_PLUGIN_INLINE_ADD_U64, counter, 1);
}

static void on_block(qemu_plugin_id_t id, struct qemu_plugin_tb* block) {
  static const char* const kMemory[] = {"ld",  "st",  "vld",   "vst",  "push",
                                        "pop", "vpush", "vpop", NULL};
  (void)id;
  for (size_t i = 0; i < qemu_plugin_tb_n_insns(block); ++i) {
    struct qemu_plugin_insn* insn = qemu_plugin_tb_get_insn(block, i);
    char* text = qemu_plugin_insn_disas(insn);
    count(insn, &all);
    if (text && text[0] == 'v') count(insn, &vector);
    if (text && starts_with_any(text, kMemory)) count(insn, &memory);
    free(text);
    struct site* const site = lists ? site_at(qemu_plugin_insn_vaddr(insn)) : NULL;
    if (site) count(insn, &site->executions);
  }
}

static void on_exit(qemu_plugin_id_t id, void* data) {
  char line[96];
  (void)id, (void)data;
  snprintf(line, sizeof line, "%" PRIu64 " %" PRIu64 " %" PRIu64 "\n", all, vector, memory);
  qemu_plugin_outs(line);
  if (sites_used == kSites / 2) qemu_plugin_outs("too many instructions to list\n");
  for (size_t i = 0; i < kSites; ++i) {
    if (sites[i].executions == 0) continue;
    snprintf(line, sizeof line, "%" PRIx64 " %" PRIu64 "\n", sites[i].address,
             sites[i].executions);
    qemu_plugin_outs(line);
  }
}

__attribute__((visibility("default"))) int qemu_plugin_install(qemu_plugin_id_t id,
                                                               const void* info, int argc,
                                                               char** argv) {
  (void)info;
  for (int i = 0; i < argc; ++i) lists |= strcmp(argv[i], "listing=on") == 0;
  qemu_plugin_register_vcpu_tb_trans_cb(id, on_block);
  qemu_plugin_register_atexit_cb(id, on_exit, NULL);
  return 0;
}
