"""How many random examples a test tries.

The examples are the same in every run and every build. What one of them can break shows best under the
address sanitizer, so all of them run there, and one in five elsewhere: on what is shipped, and on ARM.
"""

import os
import pathlib


def examples(count):
    build = pathlib.Path(os.environ.get("QITRMC_BUILD_DIR", "build/dev"))
    return count if build.name == "asan" else count // 5
