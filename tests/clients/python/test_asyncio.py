"""The same package in asyncio programs."""

import asyncio

import pytest

import qitrmc


@pytest.fixture
def played(bench):
    """Runs a coroutine function with a connection."""
    bench.restore()

    def play(part):
        async def main():
            async with qitrmc.connect_async(bench.url) as chassis:
                return await part(chassis)
        return asyncio.run(main())
    return play


def test_properties_and_commands(played):
    async def part(chassis):
        async with chassis.session("Mod1", "Mod2") as session:
            await session["Mod2/ch0:1"].set("PSU.Voltage", [1, 2])
            assert await session["Mod2/ch0:1"]["PSU.Voltage"] == [1.0, 2.0]
            await session["Mod1"].set("DMM.Function", "Current")
            assert (await session["Mod1"]["DMM.Function"]).name == "Current"
            assert (await session["Mod1"].info("DMM.Range")).unit == "V"
            assert await session["Mod1"].run("DMM.Trigger") >= 0
            await session["Mod1"].reset()
            await session.commit()
    played(part)


def test_memory(played):
    async def part(chassis):
        async with chassis.session("Mod1") as session:
            await session["Mod1"].registers.write_bytes(256, b"abcd", width=32)
            assert await session["Mod1"].registers.read(256) == 0x64636261
            await session["Mod1/user"].nvmem.write(3, b"xyz")
            assert await session["Mod1/user"].nvmem.read(2, 5) == b"\0xyz\0"
    played(part)


def test_a_session_ends_with_its_block_and_after_an_exception(played):
    async def part(chassis):
        with pytest.raises(KeyError):
            async with chassis.session("Mod2"):
                assert len(await chassis.holders("Mod2")) == 1
                raise KeyError
        assert await chassis.holders("Mod2") == []
        session = await chassis.session("Mod2")
        await session.close()
        assert await chassis.holders("Mod2") == []
    played(part)


def test_tasks_run_side_by_side_and_one_waits_for_the_other(played, caplog):
    async def part(chassis):
        first = await chassis.session("Mod2")

        async def second():
            async with chassis.session("Mod2", wait=60) as session:
                return await session["Mod2/ch0"]["PSU.Voltage"]
        waiting = asyncio.create_task(second())
        while not caplog.messages:
            await first["Mod2/ch0"].set("PSU.Voltage", 4.5)
        assert not waiting.done()
        await first.close()
        assert await waiting == 4.5
        async with chassis.session("Mod2") as session:
            await session["Mod2"].reset()
    played(part)


def test_watching(played):
    async def part(chassis):
        async with chassis.session("Mod1") as session:
            read = [row["DMM.Range"] async for row in session["Mod1"].watch("DMM.Range", every=0, count=3)]
            assert read == [10.0, 10.0, 10.0]
    played(part)


def test_errors_and_suggestions(played):
    async def part(chassis):
        async with chassis.session("Mod1") as session:
            with pytest.raises(qitrmc.UnknownProperty, match="Did you mean DMM.Range"):
                await session["Mod1"]["DMM.Rnage"]
            with pytest.raises(qitrmc.DeviceReserved) as caught:
                await chassis.session("Mod1")
            assert caught.value.sessions == [session.id]
    played(part)


def test_modules_and_calls(played):
    async def part(chassis):
        assert [module.name for module in await chassis.modules()] == ["Mod1", "Mod2", "Mod4", "Mod5"]
        assert (await chassis.health()).is_well
        assert await chassis.call("getModuleName", device="Bench", slot_number=1) == {
            "module": "Mod1", "present": True}
    played(part)
