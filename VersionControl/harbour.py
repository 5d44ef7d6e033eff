"""A harbour as three people left it: a scene with conflicts of the kinds that designers meet, and clean changes
between them."""

HEADER = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n"
CLASSES = {"GameObject": 1, "Transform": 4, "Camera": 20, "Light": 108, "MonoBehaviour": 114}
SCRIPT = "{fileID: 11500000, guid: 4f0c2b7d, type: 3}"


def vector(x, y, z):
    return f"{{x: {x}, y: {y}, z: {z}}}"


def colour(r, g, b, a=1):
    return f"{{r: {r}, g: {g}, b: {b}, a: {a}}}"


def reference(number):
    return f"{{fileID: {number}}}"


class Scene:
    """Objects by id: the class and the fields, whose values are written as they are; a list is written in lines."""

    def __init__(self):
        self.objects = {}

    def place(self, number, name, father=0, position=(0, 0, 0)):
        """A GameObject, and under the next id its Transform."""
        self.objects[number] = "GameObject", {"m_Component": [f"component: {reference(number + 1)}"], "m_Layer": 0,
                                              "m_Name": name, "m_IsActive": 1}
        self.objects[number + 1] = "Transform", {
            "m_GameObject": reference(number), "m_LocalPosition": vector(*position), "m_Children": [],
            "m_Father": reference(father + 1 if father else 0)}

    def component(self, number, place, kind, **fields):
        self[place]["m_Component"].append(f"component: {reference(number)}")
        self.objects[number] = kind, {"m_GameObject": reference(place), **fields}

    def move(self, number, father):
        """Hangs a place into another."""
        self[number + 1]["m_Father"] = reference(father + 1)

    def remove(self, *numbers):
        for number in numbers:
            del self.objects[number]

    def __getitem__(self, number):
        return self.objects[number][1]

    def text(self):
        for number, (kind, fields) in self.objects.items():
            if kind == "Transform":
                fields["m_Children"] = [reference(child) for child, (_, other) in self.objects.items()
                                        if other.get("m_Father") == reference(number)]
        return HEADER + "".join(f"--- !o!{CLASSES[kind]} &{number}\n{kind}:\n" + "".join(map(line, fields.items()))
                                for number, (kind, fields) in self.objects.items())


def line(field):
    name, value = field
    if not isinstance(value, list):
        return f"  {name}: {value}\n"
    return f"  {name}:\n" + "".join(f"  - {item}\n" for item in value) if value else f"  {name}: []\n"


TALE = ("The barge waits for the evening tide, then it leaves. Nobody knows where it goes, but the crew does, and they "
        "never tell.")


def base_scene():
    scene = Scene()
    scene.place(10, "Harbour")
    scene.place(20, "Pier", 10, (4, 0, 2))
    scene.place(30, "Lantern", 20, (1, 2, 3))
    scene.component(32, 30, "Light", m_Color=colour(1, 1, 1), m_Intensity=4, m_Range=10, m_Shadows="hard")
    scene.place(40, "Barge", 10, (-20, 0, -10))
    scene.component(42, 40, "MonoBehaviour", m_Script=SCRIPT, m_Description=TALE, m_Target=reference(20), m_Speed=3,
                    m_Crew=["Anna", "Boris"])
    scene.place(50, "Sluice", 10, (18, 0, 9))
    scene.place(60, "Gate", 10, (22, 0, 9))
    scene.place(70, "Buoy", 10, (-6, 0, 14))
    scene.component(72, 70, "Light", m_Color=colour(1, 0, 0), m_Intensity=2, m_Range=5, m_Shadows="none")
    scene.place(80, "Crates", 20, (3, 0, -4))
    for number in range(6):
        scene.place(90 + 2 * number, f"Crate {number + 1}", 80, (number, 0, number % 3))
    scene.place(110, "Camera", 0, (0, 12, -30))
    scene.component(112, 110, "Camera", m_FieldOfView=60, m_Background=colour(0.2, 0.3, 0.5, 0), m_Near=0.3,
                    m_Title="Harbour at dusk", m_Depth=1)
    return scene


def our_scene():
    scene = base_scene()
    scene[30]["m_Name"] = "Harbour lantern"
    scene[31]["m_LocalPosition"] = vector(2.5, 2, 3)
    scene[32].update({"m_Color": colour(1, 0.8, 0.5), "m_Intensity": 2.5, "m_Range": 12.5})
    scene[40].update({"m_Layer": 2, "m_IsActive": 0})
    scene[42].update({"m_Description": TALE.replace("evening", "morning"), "m_Target": reference(70), "m_Speed": 4,
                  "m_Stops": ["Pier", "Sluice", "Sea"]})
    scene.move(50, 60)
    scene[70]["m_Layer"] = 5
    scene[72]["m_Intensity"] = 8
    scene[81]["m_LocalPosition"] = vector(9, 0, -7)
    scene.remove(94, 95)
    scene.place(130, "Flag", 20, (0, 5, 0))
    scene[112].update({"m_FieldOfView": 50, "m_Background": colour(0.1, 0.1, 0.3, 0), "m_Title": "Harbour at night",
                   "m_Near": 0.1})
    return scene


def their_scene():
    scene = base_scene()
    scene[20]["m_Layer"] = 3
    scene[30]["m_Name"] = "Pier lantern"
    scene[31]["m_LocalPosition"] = vector(1, 2, -4)
    scene[32].update({"m_Color": colour(0.5, 0.7, 1, 0.5), "m_Intensity": 6, "m_Shadows": "soft"})
    scene[40].update({"m_Name": "Large barge", "m_Layer": 4, "m_IsActive": 2})
    scene[41]["m_LocalPosition"] = vector(-32, 0, -18)
    scene[42].update({"m_Description": TALE.replace("the evening tide", "nobody"), "m_Target": reference(50),
                  "m_Stops": ["Pier", "Sea"]})
    del scene[42]["m_Speed"]
    scene.move(60, 50)
    scene.remove(70, 71, 72)
    scene.place(130, "Pennant", 20, (0, 7, 0))
    scene.place(140, "Gull", 0, (10, 15, 20))
    scene[112].update({"m_FieldOfView": 75, "m_Background": colour(0.9, 0.6, 0.3, 1), "m_Title": "Harbour at dawn",
                   "m_Near": 0.5, "m_Depth": 2})
    return scene


def harbour():
    """Base, theirs and ours."""
    return base_scene().text(), their_scene().text(), our_scene().text()
