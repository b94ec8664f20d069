# Sourced by run.sh and test.sh: the one configuration of build/, the folder whose tool the README
# runs. Both scripts pass every option it relies on, so that either can follow the other without
# a rebuild and whatever a hand-made configure left in the cache does not count.
configure_main_build() {
    cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo \
          -DCMAKE_C_COMPILER=gcc -DCMAKE_CXX_COMPILER=g++ -DVEXMAP_WERROR=ON \
          -DVEXMAP_BUILD_TESTS=ON -DVEXMAP_BUILD_TOOLS=ON -DVEXMAP_BUILD_BENCHMARKS=ON \
          -DVEXMAP_SANITIZE=OFF -DVEXMAP_THREAD_SANITIZE=OFF -DVEXMAP_FUZZ=OFF >/dev/null
}
