"""Properties as Python values, commands, and what notebooks show of them."""

import enum

import pytest

import qitrmc


def test_values_have_their_python_types(held):
    dmm = held["Mod1"]
    assert dmm["DMM.AutoRange"] is True
    assert dmm["DMM.Range"] == 10.0 and isinstance(dmm["DMM.Range"], float)
    assert dmm["DMM.SampleCount"] == 1 and isinstance(dmm["DMM.SampleCount"], int)
    assert dmm["DMM.Note"] == ""
    assert dmm["DMM.Readings"] == [0.5, -0.25, 1.75]
    assert dmm["DMM.InputsInUse"] == [True, True, False, False]
    assert dmm["DMM.Labels"] == ["A", "B", "C", "D"]


def test_integers_of_64_bits_are_exact(held):
    assert held["Mod1"]["DMM.Totals"] == [0, 18446744073709551615]
    assert held["Mod1"]["DMM.Timestamps"] == [-1, 0, 9223372036854775807]
    held["Mod1"]["DMM.TriggerDelay"] = -999999999999
    assert held["Mod1"]["DMM.TriggerDelay"] == -999999999999


def test_several_resources_give_lists(held):
    outputs = held["Mod2/ch0:1"]
    outputs["PSU.Voltage"] = [5, 3.3]
    assert outputs["PSU.Voltage"] == [5.0, 3.3]
    assert held["Mod2/ch1", "Mod2/ch0"]["PSU.Voltage"] == [3.3, 5.0]
    assert held["Mod2", "Mod1"]["Dev.SlotNum"] == [2, 1]


def test_an_enumerated_property_reads_as_an_item(held):
    function = held["Mod1"]["DMM.Function"]
    assert isinstance(function, enum.IntEnum)
    assert (function.name, function) == ("Voltage", 0)
    assert type(function).__name__ == "MeasurementFunction"


@pytest.mark.parametrize("item", ["Temperature", "temperature", 10])
def test_an_item_is_given_by_name_or_number(held, item):
    held["Mod1"]["DMM.Function"] = item
    assert held["Mod1"]["DMM.Function"] == 10


def test_an_item_is_given_as_it_was_read(held):
    items = held["Mod1"].info("DMM.Function").enum
    held["Mod1"]["DMM.Function"] = items.Resistance
    assert held["Mod1"]["DMM.Function"] is items.Resistance


def test_a_wrong_item_lists_the_items(held):
    items = "Voltage (0), Current (1), Resistance (2), Temperature (10)"
    with pytest.raises(qitrmc.WrongItem) as by_name:
        held["Mod1"]["DMM.Function"] = "Curent"
    assert items in str(by_name.value) and str(by_name.value).endswith("Did you mean Current?")
    with pytest.raises(qitrmc.ValueNotEnumerated) as by_number:
        held["Mod1"]["DMM.Function"] = 3
    assert items in str(by_number.value)
    assert held["Mod1"]["DMM.Function"] == 0


def test_a_driver_that_does_not_list_the_items_is_helped_out(bench, held):
    bench.fail("setProperty", qitrmc.ValueNotEnumerated)
    with pytest.raises(qitrmc.ValueNotEnumerated) as caught:
        held["Mod1/ch0"]["DMM.Coupling"] = 7
    bench.restore()
    assert caught.value.suggestion == "The items of DMM.Coupling are AC (0), DC (1), Ground (2)."


def test_items_on_several_resources(held):
    held["Mod1/ch0:1"]["DMM.Coupling"] = ["AC", "Ground"]
    assert [item.name for item in held["Mod1/ch0:1"]["DMM.Coupling"]] == ["AC", "Ground"]


def test_a_text_for_a_property_without_items_is_a_text(held):
    held["Mod1"]["DMM.Note"] = "Grüße"
    assert held["Mod1"]["DMM.Note"] == "Grüße"
    with pytest.raises(qitrmc.WrongValueType):
        held["Mod1"]["DMM.Range"] = "10"


def test_the_information_of_a_property(held):
    info = held["Mod1"].info("DMM.Range")
    assert (info.data_type, info.access, info.unit) == ("Double", "ReadWrite", "V")
    assert (info.minimum, info.maximum) == (0.1, 1000.0)
    assert info.description == "The largest value that can be measured."
    assert held["Mod1"].info("DMM.TriggerDelay").maximum == 1000000000000
    assert held["Mod1"].info("DMM.Note").minimum is None
    assert not held["Mod1"].info("DMM.UnlockCode").readable


def test_a_change_is_pending_until_its_commit(held):
    dmm = held["Mod1"]
    dmm["DMM.ApertureTime"] = 0.5
    assert dmm["DMM.ApertureTime"] == 0.02
    assert dmm.info("DMM.ApertureTime").pending_changes
    dmm.commit()
    assert dmm["DMM.ApertureTime"] == 0.5
    dmm["DMM.ApertureTime"] = 0.25
    held.commit()
    assert dmm["DMM.ApertureTime"] == 0.25


def test_properties_are_listed(held):
    assert "Dev.SerialNum" in held["Mod1"].properties()
    assert "DMM.Range" in held["Mod1"].properties()
    assert held["Mod1/ch0"].properties()[-1] == "DMM.SampleClock"
    assert "NVMEMArea.Size" in held["Mod1/user"].properties()
    assert held.properties()[0] == "Session.Comment"


def test_properties_of_the_session_and_the_system(held):
    held.set("Session.Timeout", 2.5)
    assert held.get("Session.Timeout") == 2.5
    assert held.get("Sys.Simulated") is True


def test_commands_take_their_time_and_are_listed(held):
    assert held["Mod1"].commands()[:2] == ["DMM.SelfTest", "DMM.Trigger"]
    assert held["Mod1"].command_info("DMM.SelfTest").startswith("Tests the module. Takes a moment")
    assert held["Mod1"].run("DMM.Trigger") >= 0
    assert held["Mod1"]["DMM.TriggerCount"] == 1
    with pytest.raises(qitrmc.CommandTimedOut):
        held["Mod1"].run("DMM.Calibrate", timeout=0.5)
    held["Mod1"].run("DMM.Calibrate", timeout=31)


def test_a_module_is_renamed(bench, chassis):
    with chassis.session("Mod5") as session:
        module = session["Mod5"]
        module.rename("Switch")
        try:
            assert "Switch" in chassis.devices()
            assert module["Dev.Name"] == "Switch"
        finally:
            module.rename("Mod5")


def test_a_chassis_is_renamed_with_its_modules(chassis):
    assert chassis.rename("Lab") == ["Lab-Mod1", "Lab-Mod2", "Lab-Mod4", "Lab-Mod5"]
    assert chassis.rename("Bench", "Lab")[0] == "Bench-Mod1"
    with chassis.session() as session:
        for slot in (1, 2, 4, 5):
            session[f"Bench-Mod{slot}"].rename(f"Mod{slot}")


def test_modules_and_the_address_of_the_chassis(chassis):
    modules = chassis.modules()
    assert [(module.slot, module.name, module.product) for module in modules] == [
        (1, "Mod1", "Multimeter"), (2, "Mod2", "Power supply"), (4, "Mod4", "Digitizer"),
        (5, "Mod5", "Switch matrix")]
    assert chassis.address() == ("192.0.2.10", "bench")


def test_any_method_can_be_called(chassis, held):
    assert chassis.call("getModuleName", device="Bench", slot_number=3) == {"present": False}
    assert held.call("getProperty", property="Session.ReservedDevices")["value"] == ["Mod1", "Mod2"]


def test_a_batch_gives_the_results_in_order(chassis, held):
    results = held.batch(("setProperty", {"property": "DMM.Range", "value": 1, "devices": "Mod1"}),
                         ("getProperty", {"property": "DMM.Range", "devices": "Mod1"}))
    assert results == [{"data_type": "Double"}, {"data_type": "Double", "value": 1.0}]
    assert chassis.batch() == []


def test_a_device_that_was_pulled_is_named(bench, chassis):
    bench.disconnect("Mod4")
    health = chassis.health()
    assert not health.is_well
    assert list(health.faults) == ["Mod4"]
    assert [module.state for module in chassis.modules() if module.name == "Mod4"] == [
        "The connection to the device is lost"]
    bench.restore()
    assert chassis.health().is_well


def test_a_notebook_shows_tables(chassis, held):
    held["Mod1"]["DMM.Note"] = "<b>&"
    page = held["Mod1"]._repr_html_()
    assert "<tr><th>Property</th><th>Value</th><th>Unit</th>" in page
    assert "<tr><td>DMM.Note</td><td>&lt;b&gt;&amp;</td>" in page
    assert "<td>DMM.Range</td><td>10.0</td><td>V</td><td>ReadWrite</td><td>0.1 to 1000</td>" in page
    assert "<td>DMM.Function</td><td>Voltage</td>" in page
    assert "<tr><td>1</td><td>Mod1</td><td>Multimeter</td>" in chassis._repr_html_()
