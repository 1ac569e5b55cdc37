import cProfile, pstats, sys, runpy
sys.argv = sys.argv[1:]
p = cProfile.Profile()
try:
    p.runcall(runpy.run_path, "try.py")
finally:
    pstats.Stats(p).sort_stats("tottime").print_stats(14)
