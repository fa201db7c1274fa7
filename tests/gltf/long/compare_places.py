# Run by Blender: GLB TREE. Imports the file and compares every object's place with what the scene's listing gives.
import json
import math
import sys

import bpy
import numpy
from mathutils import Matrix, Vector

if not hasattr(numpy, "bool"):
    numpy.bool = bool  # Blender 3.4 asks for it, and the numpy of the same Debian no longer has it

glb, listing = sys.argv[sys.argv.index("--") + 1:]
tree = json.load(open(listing))
bpy.ops.wm.read_factory_settings(use_empty=True)
bpy.ops.import_scene.gltf(filepath=glb)

UNIT = 0.01
TO_GLTF = Matrix.Diagonal((UNIT, UNIT, -UNIT, 1))
TO_BLENDER = Matrix(((1, 0, 0, 0), (0, 0, -1, 0), (0, 1, 0, 0), (0, 0, 0, 1)))


# Which angle turns about which axis, the outermost turn first, by rotation order.
ORDERS = ["zxy", "xzy", "xyz", "yxz", "yzx", "zyx"]


def rotation(order, angles):
    if order > 5:  # the scene's own: heading, pitch, bank
        angles, order = [angles[1], angles[0], angles[2]], 3
    named = dict(zip("xyz", angles))
    result = Matrix()
    for axis in ORDERS[order]:  # in left-handed axes angles turn the other way
        result = result @ Matrix.Rotation(-named[axis], 4, axis.upper())
    return result


def value_at(track, time, rest):
    keys = track["keys"]
    times = [key["time"][0] / key["time"][1] for key in keys]
    if not keys:
        return rest
    if time <= times[0]:
        return keys[0]["value"]
    for before, after, start, end in zip(keys, keys[1:], times, times[1:]):
        if time <= end:
            return before["value"] + (after["value"] - before["value"]) * (time - start) / (end - start)
    return keys[-1]["value"]


def vector_at(item, name, parameter, time):
    values = list(item[name])
    for track in item["tracks"]:
        path = track["path"]
        if path[0][0] == parameter:
            values[path[1][0] - 1000] = value_at(track, time, values[path[1][0] - 1000])
    return values


def look_at(place, target):
    forward = (target - place).normalized()
    side = forward.cross(Vector((0, -1, 0)))
    side = side.normalized() if side.length > 1e-12 else Vector((1, 0, 0))
    up = forward.cross(side).normalized()
    return Matrix((side, up, forward)).transposed().to_4x4()


class Item:
    def __init__(self, data, parent):
        self.data, self.parent = data, parent
        self.children = [Item(child, self) for child in data["children"]]

    def all(self):
        yield self
        for child in self.children:
            yield from child.all()

    def world(self, time):
        data = self.data
        up = self.parent.world(time) if self.parent else Matrix()
        place = Vector(vector_at(data, "pos", 903, time))
        turned = rotation(data["rotationOrder"], vector_at(data, "rot", 904, time))
        for tag in data["tags"]:
            if tag["type"] == 5676 and tag["data"].get("1001"):
                target = by_path[tag["data"]["1001"]].world(time).translation
                turned = look_at(place, up.inverted() @ target)
        return up @ Matrix.Translation(place) @ turned @ Matrix.Diagonal((*vector_at(data, "scale", 905, time), 1))

    def path(self):
        return (self.parent.path() + "/" if self.parent else "") + self.data["name"]


roots = [Item(data, None) for data in tree["objects"]]
items = [item for root in roots for item in root.all()]
by_path = {}
for one in items:
    by_path.setdefault(one.path(), one)

taken, names = set(), []
for one in items:  # as the converter makes them unique
    name, number = one.data["name"], 2
    while name and name in taken:
        name, number = "%s.%d" % (one.data["name"], number), number + 1
    taken.add(name)
    names.append(name)

document = tree["document"]
fps, end = document["fps"], max((key["time"][0] / key["time"][1] for one in items for track in one.data["tracks"]
                                 for key in track["keys"]), default=0)
compared = 0
for time in (0, round(end * fps / 2) / fps, end):
    frame = time * bpy.context.scene.render.fps / bpy.context.scene.render.fps_base
    bpy.context.scene.frame_set(math.floor(frame), subframe=frame - math.floor(frame))
    for one, name in zip(items, names):
        found = bpy.data.objects.get(name)
        if not name or len(name) > 60:
            continue
        assert found, name + " is not there"
        expected = TO_BLENDER @ TO_GLTF @ one.world(time) @ TO_GLTF.inverted() @ TO_BLENDER.inverted()
        actual = found.matrix_world
        where = "%s at %g s: %s, not %s" % (name, time, actual, expected)
        distance = (expected.translation - actual.translation).length
        assert distance < 1e-3 * max(1, expected.translation.length), where
        forward = (expected.to_3x3() @ Vector((0, 1, 0))).normalized()  # glTF's -z
        if one.data["type"] in (5102, 5103):
            assert found.type == {5102: "LIGHT", 5103: "CAMERA"}[one.data["type"]], name + " is a " + found.type
            seen = (actual.to_3x3() @ Vector((0, 0, -1))).normalized()
            assert (forward - seen).length < 1e-3, where
        elif found.type == "MESH":
            for row, other in zip(expected.to_3x3(), actual.to_3x3()):
                assert (row - other).length < 1e-3 * max(1, row.length), where
        compared += 1
print("compared %s: %d places" % (glb, compared))
