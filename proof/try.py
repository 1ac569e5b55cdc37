import sys, time
sys.path.insert(0, "../bench")
from image import Image
import z3
from machine import *
import contracts
from contracts import *
img, name, n, m, w = sys.argv[1], sys.argv[2], *[int(x) for x in sys.argv[3:6]]
image = Image(f"../build/cortex-m0plus/bench/{img}")
mach = Machine(image.segments, image.code["__aeabi_idivmod"][0])
narrow = name[1:] if name not in FUNCTIONS and name.startswith("WStr") else name
contract, sig = FUNCTIONS[narrow]
unit = 2 if name[0] == "W" else 1
if name in ("BytesToWords", "StrToWStr", "WStrToStr", "WStrToWords"): units = {"src": 1 if name[0] != "W" else 2, "des": 1 if name == "WStrToStr" else 2}
else: units = {}
arrays, args, cargs = [], [], []
def fresh(name, size): 
    return z3.BitVec(name, 32) if size == 4 else z3.ZeroExt(32 - 8 * size, z3.BitVec(name, 8 * size))
for i, one in enumerate(sig.split()):
    a, kind = one.split(":")
    u = units.get(a, unit)
    base = 0x20000000 + 0x400 * i + (u if u < 4 else 0)
    def arr(count, term, size=u):
        un = [fresh(f"{a}[{k}]", size) for k in range(count)] + [0] * term
        x = Array(a, base if size < 4 else base & ~3, size, un); arrays.append(x); return x
    x = None
    if kind == "text": x = arr(n, 1)
    elif kind == "pattern": x = arr(m, 1)
    elif kind == "with": x = arr(w, 1)
    elif kind == "counted": x = arr(n + 1, 0)
    elif kind == "out": x = arr({"StrReplace": n * max(w, 1) + 2, "WStrToStr": 9 * n + 2}.get(narrow, n + 2), 0)
    elif kind == "words": x = arr(n, 0)
    elif kind == "room": x = arr(m, 1); x.units += [fresh(f"{a}[{m+1+k}]", u) for k in range(n + 1)]
    elif kind == "offset": x = arr(0, 0, 4); x.units.append(0)
    elif kind == "pointers": x = arr(n // 2 + 2, 0, 4)
    if x: args.append(x.address); cargs.append(x)
    elif kind == "unit": v = fresh(a, u); args.append(v); cargs.append(v)
    else: v = z3.BitVec(a, 32); args.append(v); cargs.append(v)
t = time.process_time()
memory = Memory(image.segments)
call = Call(arrays)
for x in arrays: memory.give(x.address, x.size, x.units, x.name not in ('trimSet', 'dlmt', 'off', 'wrd', 'substr', 'rep', 'with'))
expected = contract(call, *cargs)
t1 = time.process_time()
ends = mach.run(image.functions[name][0], args, memory, [c for c in call.needs if c is not True])
t2 = time.process_time()
cyc = 0
for s in ends:
    bad = []
    if expected is not None: bad.append(term(s.r[0]) != term(expected))
    for a, v in s.memory.cells.items():
        if a < STACK_TOP - STACK_SIZE:
            if not is_same(v, call.cells[a]): bad.append(term(v) != term(call.cells[a]))
            bad.append(And(s.memory.written.get(a, False), Not(call.written.get(a, False))))
            bad.append(And(s.memory.read.get(a, False), Not(call.readable.get(a, False))))
    bad = Or(*bad)
    for r in KEPT:
        if s.r[r] != (STACK_TOP if r == SP else 0xDEAD0000+4*r): print("not kept", r)
    if bad is not False:
        mdl = mach.example(mach.named(z3.And(s.path, bad)))
        if mdl is not None:
            print("BAD", s.r[0], [(d, mdl[d]) for d in mdl.decls() if "path" not in d.name()]); print(mdl.eval(term(expected), True)) if expected is not None else 0; 
            for a, v in s.memory.cells.items():
                if a < STACK_TOP - STACK_SIZE: print(hex(a), mdl.eval(term(v), True), mdl.eval(term(call.cells[a]), True), s.memory.written.get(a), s.memory.read.get(a))
            break
    cyc = max(cyc, s.cycles)
print(f"{name} {img} {n},{m},{w}: {len(ends)} ends, {mach.checks} checks {mach.restarts} restarts, {mach.steps} steps, contract {t1-t:.1f} run {t2-t1:.1f} check {time.process_time()-t2:.1f} cycles {cyc} stack {STACK_TOP-min(s.lowest for s in ends)} needed {sum(map(len,mach.needed.values()))}")
