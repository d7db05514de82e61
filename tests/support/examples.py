"""How many random examples a test tries: one in five, and all if QITRMC_SERIES is "whole".

The examples are the same in every run and every build.
"""

import os


def examples(count):
    return count if os.environ.get("QITRMC_SERIES") == "whole" else count // 5
