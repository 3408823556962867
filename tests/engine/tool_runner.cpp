// The tool suite's runner, shared so that these tests drive the same binary the same way.
#include "tool/ToolRunner.cpp"
