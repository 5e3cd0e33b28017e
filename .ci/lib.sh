# Shared by the steps: what scripts have, and the unit tests on all processors. Sourced, not run.
source "$(dirname "${BASH_SOURCE[0]}")/../scripts/lib.sh"

# What each run of the unit tests tells of the bodies that it ran.
bodies=build/bodies

# Tests that call the bodies of all instruction sets themselves, by name; what is left calls what the library chooses.
walking='*KernelSweep.Every*:FloatKernelSweep*:Targets/*:*MatricesFromCodes*:Matrices.*:YUV422*:Downsample*:ApproxPower*'
walking+=':Vector*:BoxBlurKernels*:ConvertFloat*:WarpSpan*'

# run_tests NAME FILTER [COMMAND...]: the unit tests of build/release, or of the build folder that $tested names, in one process
# a processor, each behind a command such as an emulator. Walks over all codes, which the tests of the release go whole, are
# thinned out.
run_tests() {
    local name=$1 filter=$2 shards shard failed=0 processes=()
    shift 2
    shards=$(nproc)
    mkdir -p "$bodies"
    for ((shard = 0; shard < shards; shard++)); do
        rm -f "$bodies/$name.$shard"
        GTEST_TOTAL_SHARDS=$shards GTEST_SHARD_INDEX=$shard PIXELKILN_BODIES_RUN=$bodies/$name.$shard \
            PIXELKILN_TEST_STRIDE=17 timeout 15m "$@" "${tested:-build/release}/tests/pixelkiln_tests" --gtest_brief=1 \
            --gtest_filter="$filter" \
            >"$bodies/$name.$shard.log" 2>&1 &
        processes+=($!)
    done
    for ((shard = 0; shard < shards; shard++)); do
        wait "${processes[shard]}" || { failed=1 && cat "$bodies/$name.$shard.log" >&2; }
        tail -n 1 "$bodies/$name.$shard.log"
    done
    [ "$failed" -eq 0 ] || fail "tests failed: $name"
}
