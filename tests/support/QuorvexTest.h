#pragma once
// Everything the tests share, one header per concern:
//   TestConstants.h      result folders, the example machine, the source tree
//   TemporaryFiles.h     temporary and scratch folders, exact file contents
//   ChildProcess.h       commands and code in child and fresh processes
//   DescriptorLimit.h    a process that can open no more descriptors
//   FailingSystemCalls.h system calls that fail as on a failing disk
//   Sandbox.h            the sandbox runner and a read-only /tmp
//   SimulatedConsole.h   the simulated console and its invocation log
//   Normalise.h          temporary file names and time stamps made fixed
//   ExpectedOutput.h     comparison with (and rewriting of) expected-output files
//   Lines.h              a text cut into its lines
//   TextDifference.h     where two texts part, for failure messages
//   Thrown.h             the exception a piece of code throws
//   ResultReading.h      a forked worker's whole result, waited for
//   TraceCapture.h       what the shared trace records
//   TracedTest.h         a test fixture whose trace is open before it runs
//   ModelText.h          one-line texts of model objects
//   FlushCountingBuffer.h a string buffer counting its flushes

#include "ChildProcess.h"
#include "CollectFolder.h"
#include "DescriptorLimit.h"
#include "ExpectedOutput.h"
#include "FailingSystemCalls.h"
#include "FlushCountingBuffer.h"
#include "Lines.h"
#include "ModelText.h"
#include "Normalise.h"
#include "ResultReading.h"
#include "Sandbox.h"
#include "SimulatedConsole.h"
#include "TemporaryFiles.h"
#include "TestConstants.h"
#include "TextDifference.h"
#include "Thrown.h"
#include "TraceCapture.h"
#include "TracedTest.h"
