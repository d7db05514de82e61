#include "host/Usage.h"

namespace host {

const char* const kHelpText =
    R"(Usage: qitrmc-host [OPTION]...

Serves the web service plug-in of an instrument chassis over HTTP, for development and tests.
The service answers POST requests at /qitrmc/Call.

  --listen ADDR:PORT  where to listen (127.0.0.1:8080); port 0 takes a free one,
                      an IPv6 address stands in brackets
  --plugin PATH       the plug-in (libqitrmcsvc.so in ../lib beside the program's folder, or in it)
  --chassis FILE      the chassis that the simulated driver shows (QITRMC_SIM_CHASSIS)
  --state DIR         where the simulated driver keeps its state (QITRMC_SIM_STATE)
  --faults FILE       what the simulated driver does wrong on purpose (QITRMC_SIM_FAULTS); the file
                      may change, come and go while the host runs
  --trace FILE        where the simulated driver notes each call of it, "-" for standard error
                      (QITRMC_SIM_TRACE)
  --seed N            where the random numbers of the simulated chassis come from: the same seed
                      gives the same numbers (QITRMC_SIM_SEED; 0 to 18446744073709551615)
  --time-scale X      simulated seconds in one real second (QITRMC_SIM_TIME_SCALE; 0.001 to
                      1000000), or "calls": time goes by the calls of the driver alone
  --threads N         most connections at once, each with a thread of its own (512; 1 to 900)
  --max-body BYTES    largest request body; a larger one is answered with 413 (16777216)
  --timeout SECONDS   how long a client may stay idle, and how long it may take to send the head of
                      a request, to send its body and to fetch the response (30)
  --tls-cert FILE     serve HTTPS with this certificate chain in PEM form...
  --tls-key FILE      ...and this private key
  --help              show this text
  --version           show the version

SIGTERM and SIGINT end the host after the requests in flight; a second signal ends it at once.
Exit status: 0 after a normal end, 1 when it cannot serve, 2 for a wrong command line.
)";

const char* const kVersionText = "qitrmc-host " QITRMC_VERSION "\n";

}  // namespace host
