// SPDX-License-Identifier: MIT
#include "run_tool_main.hpp"

int main(int argc, char** argv) {
    return quarzel::tool::runToolMain(argc, argv, quarzel::tool::makeThreadWorkers);
}
