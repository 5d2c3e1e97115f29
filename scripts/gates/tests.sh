# Gates that build and run the tests, the properties and the proofs; scripts/check runs them.
# shellcheck shell=bash

gate_tests() {
  scripts/test
}

gate_asan() {
  build asan && ASAN_OPTIONS=detect_stack_use_after_return=1 UBSAN_OPTIONS=print_stacktrace=1 \
    run_tests asan
}

gate_tsan() {
  build tsan && TSAN_OPTIONS=halt_on_error=1 run_tests tsan
}

gate_faults() {
  need g++ cmake ninja python3
  scripts/faults 40
}

# Twenty seconds a property.
gate_fuzz() {
  need clang++-14 cmake ninja
  scripts/fuzz 20
}
