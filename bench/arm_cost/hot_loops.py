#!/usr/bin/env python3
"""Finds the hot loops of one function and puts them through llvm-mca, a static model.

  hot_loops.py PROGRAM FUNCTION PIXELS CPU PLUGIN

prints what percentage of the function's instructions the modelled loops hold, how many cycles the
model gives them per output pixel, and how many stores to the stack they execute per output pixel.

Loops come from what was executed, so nothing has to be marked in the sources: a backward branch and
the instructions up to it from its target, where each was executed as often as the branch.
"""

import os
import re
import shutil
import subprocess
import sys
import tempfile

# Loops that hold less of the function's instructions are left out.
LEAST_SHARE = 0.03
ITERATIONS = 500

MODELS = {
    "cortex-a9": ["-mtriple=thumbv7-linux-gnueabi", "-mattr=+neon", "-mcpu=cortex-a9"],
    "cortex-a57": ["-mtriple=aarch64-linux-gnu", "-mcpu=cortex-a57"],
}
EMULATORS = {"cortex-a9": ["qemu-arm", "-cpu", "cortex-a8"], "cortex-a57": ["qemu-aarch64"]}


def executions(cpu, plugin, program, function, calls):
    """How often each address was executed."""
    emulator, *options = EMULATORS[cpu]
    with tempfile.TemporaryDirectory() as folder:
        log = os.path.join(folder, "log")
        subprocess.run(
            [shutil.which(emulator), *options, "-plugin", f"{plugin},listing=on", "-d", "plugin",
             "-D", log, program, function, str(calls)],
            env={}, stdout=subprocess.DEVNULL, check=True)
        with open(log, encoding="ascii") as lines:
            pairs = [line.split() for line in lines.readlines()[1:]]
    return {int(address, 16): int(count) for address, count in pairs}


def disassembly(program):
    """(address, instruction) in the order of addresses."""
    text = subprocess.run(["llvm-objdump-16", "-d", "--no-show-raw-insn", program],
                          capture_output=True, text=True, check=True).stdout
    for line in text.splitlines():
        match = re.match(r"\s*([0-9a-f]+):\s+(.*)", line)
        if match:
            yield int(match.group(1), 16), match.group(2).strip()


def backward_target(address, instruction):
    match = re.match(r"(?:b|cb|tb)[a-z.]*\s.*?0x([0-9a-f]+) <", instruction)
    if match is None or re.match(r"blx?\s", instruction):
        return None
    target = int(match.group(1), 16)
    return target if target <= address else None


def hot_loops(counts, code):
    """(instructions, executions) of each loop; of loops in one another the larger one."""
    found = sorted(candidates(counts, code), key=lambda loop: -len(loop[0]))
    taken = set()
    for body, often in found:
        addresses = {address for address, _ in body}
        if not addresses & taken:
            taken |= addresses
            yield [text for _, text in body], often


def candidates(counts, code):
    index = {address: i for i, (address, _) in enumerate(code)}
    least = LEAST_SHARE * sum(counts.values())
    for i, (address, instruction) in enumerate(code):
        often = counts.get(address, 0)
        target = backward_target(address, instruction)
        if often == 0 or target not in index:
            continue
        body = code[index[target]:i + 1]
        # A loop that is entered or left in its middle has slightly different counts.
        if often * len(body) >= least and all(
                abs(counts.get(a, 0) - often) <= 0.1 * often for a, _ in body):
            yield body, often


def for_model(instructions):
    """The instructions in the form that llvm-mca takes for these processors."""
    conditional = 0
    for text in instructions:
        # Branches need a symbol for their target; then come comments.
        text = re.sub(r"\s*[@;/]{1,2} .*", "", re.sub(r"0x[0-9a-f]+ <.*", "loop", text))
        block = re.match(r"i(t[te]*)\s", text)
        if block:  # Cortex-A9 has no entry for IT: its instructions count as if always executed
            conditional = len(block.group(1))
            continue
        if conditional > 0:
            conditional -= 1
            text = re.sub(r"^(\w+?)(eq|ne|cs|hs|cc|lo|mi|pl|vs|vc|hi|ls|ge|lt|gt|le)(?=[\s.])",
                          r"\1", text)
        # Loads and stores of several registers have no entry either.
        one = re.match(r"v(ld|st)mia\s+(\w+)!, \{(s\d+)\}", text)
        if one:
            yield f"v{one.group(1)}r {one.group(3)}, [{one.group(2)}]"
            yield f"add {one.group(2)}, #4"
            continue
        text = re.sub(r"^v(ld|st)mia\s+(\w+), (\{d\d+(?:, d\d+){0,3}\})", r"v\g<1>1.64 \3, [\2]",
                      text)
        yield re.sub(r"^vswp\s", "vtrn.32 ", text)  # no entry either; as wide a permutation


def model_cycles(instructions, cpu):
    """Cycles of one iteration; None for an instruction that the model does not know."""
    result = subprocess.run(
        ["llvm-mca-16", *MODELS[cpu], f"-iterations={ITERATIONS}"],
        input="\n".join(for_model(instructions)) + "\n", capture_output=True, text=True,
        check=False)
    if result.returncode != 0:
        return None
    return int(re.search(r"Total Cycles:\s+(\d+)", result.stdout).group(1)) / ITERATIONS


def stack_stores(instructions):
    """Stores to the stack in one iteration: by its pointer or a register made of it in the loop."""
    bases = {"sp"}
    stores = 0
    for text in instructions:
        made = re.match(r"(?:add|mov)[a-z.]*\s+(\w+), sp\b", text)
        if made:
            bases.add(made.group(1))
        stored = re.match(r"v?st.*\[(\w+)", text) or re.match(r"v?stm\w*\s+(\w+)", text)
        stores += stored is not None and stored.group(1) in bases
    return stores


def main():
    program, function, pixels, cpu, plugin = sys.argv[1:]
    once = executions(cpu, plugin, program, function, 1)
    thrice = executions(cpu, plugin, program, function, 3)
    counts = {a: (n - once.get(a, 0)) / 2 for a, n in thrice.items() if n > once.get(a, 0)}
    instructions = cycles = stores = 0
    for body, often in hot_loops(counts, list(disassembly(program))):
        stores += often * stack_stores(body)
        each = model_cycles(body, cpu)
        if each is not None:
            instructions += often * len(body)
            cycles += often * each
    share = round(100 * instructions / sum(counts.values()))
    print(f"{share} {cycles / int(pixels):.2f} {stores / int(pixels):.2f}")


main()
