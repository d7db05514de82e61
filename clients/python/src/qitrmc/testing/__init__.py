"""A simulated chassis for the tests of your own programs.

    from qitrmc.testing import chassis

    with chassis("rack.json") as rack:
        rack.fail("executeCommand", qitrmc.ResourceBusy, resource="Psu", count=1)
        with rack.connect() as connected: ...

Where pytest is installed, the fixture `qitrmc_chassis` is one of these, ended after the test.
"""

from .simulated import SimulatedChassis, chassis

__all__ = ["SimulatedChassis", "chassis"]
