"""A merge that breaks what a component requires."""

from test_systems import HEADER

TYPES = HEADER + """--- !o!1 &1
MergeTypeInfo:
- {id: 500, name: Engine, ismulti: 0, baseid: 2, requires: '', conflicts: ''}
- {id: 501, name: Wheel, ismulti: 0, baseid: 2, requires: f4010000, conflicts: ''}
"""


def car(*names):
    """A car with these of the components Engine and Wheel, which needs an engine."""
    numbers = {"Engine": 500, "Wheel": 501}
    listed = "".join(f"\n  - component: {{fileID: {numbers[name]}}}" for name in names) or " []"
    parts = "".join(f"--- !o!{numbers[name]} &{numbers[name]}\n{name}:\n  m_GameObject: {{fileID: 10}}\n" for name in names)
    return f"{HEADER}--- !o!1 &10\nGameObject:\n  m_Component:{listed}\n  m_Name: Car\n{parts}"


def merge_cars(user):
    """Theirs removes the engine, and ours adds a wheel."""
    user.sides(car("Engine"), car(), car("Engine", "Wheel"))
    types = user.home / "types"
    types.write_text(TYPES, encoding="ascii")
    user.git("merge", "topic", fails=True, OVRIN_TYPE_INFO=str(types))
