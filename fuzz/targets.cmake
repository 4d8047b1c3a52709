# The fuzz targets: fuzz/<name>.cpp defines LLVMFuzzerTestOneInput and
# fuzz/corpus/<name>/ holds its seed inputs.
set(CARNET_FUZZ_TARGETS read_line load code selection matricule drawing stores)
