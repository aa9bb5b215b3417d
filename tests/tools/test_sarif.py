#!/usr/bin/env python3
"""Checks that 'netlist check --sarif' writes valid SARIF 2.1.0 that agrees with the tool's lines.

usage: test_sarif.py --tool BOOLEQ

sarif.schema.json next to this file is the part of the standard's schema for the objects that the
tool writes, because Debian does not provide the schema itself. It is compared with Debian's Python
classes for the standard's objects, which were made from the whole schema: every property must exist
there, and none that is required may be missing.
"""
import argparse
import json
import pathlib
import subprocess
import sys
import tempfile
import unittest

NO_TEST = 77
TOOL = None
NETLIST = """.model top
.inputs a b s
.outputs y z
.names s a b y
11- 1
0-1 1
.names a b s z
11- 1
.names y n
0 1
.end
"""


class Sarif(unittest.TestCase):
    maxDiff = None
    schema = json.loads(pathlib.Path(__file__).with_name("sarif.schema.json").read_text("utf-8"))

    def check(self, text, name="d.blif"):
        """The lines that the tool prints, and the file that it writes."""
        with tempfile.TemporaryDirectory() as directory:
            pathlib.Path(directory, name).write_text(text, encoding="utf-8")
            done = subprocess.run([TOOL, "netlist", "check", name, "--sarif", "out.sarif"],
                                  stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True,
                                  cwd=directory, timeout=60, check=False)
            self.assertEqual(done.stderr, "")
            log = json.loads(pathlib.Path(directory, "out.sarif").read_text("utf-8"))
        jsonschema.validate(log, self.schema)
        return done.stdout.splitlines(), log["runs"][0]

    def test_it_says_what_the_lines_say(self):
        lines, run = self.check(NETLIST)
        rules = run["tool"]["driver"]["rules"]
        said = []
        for result in run["results"]:
            location = result["locations"][0]
            physical = location["physicalLocation"]
            self.assertEqual(rules[result["ruleIndex"]]["id"], result["ruleId"])
            said.append(f'{physical["artifactLocation"]["uri"]}:{physical["region"]["startLine"]}: '
                        f'{result["level"]}: {result["ruleId"]}: {result["message"]["text"]}')
            name = location["logicalLocations"][0]["fullyQualifiedName"]
            self.assertTrue(result["message"]["text"].startswith(name + ": "))
        self.assertEqual(said, lines[:-1])
        self.assertGreaterEqual(len(said), 2)

    def test_nothing_found(self):
        lines, run = self.check(".model t\n.inputs a b\n.outputs y\n.names a b y\n11 1\n.end\n")
        self.assertEqual((lines, run["results"]), (["no findings in 1 table"], []))

    def test_strange_names(self):
        run = self.check(NETLIST, "a file \u00e4#.blif")[1]
        self.assertEqual(run["results"][0]["locations"][0]["physicalLocation"]["artifactLocation"],
                         {"uri": "a%20file%20%C3%A4%23.blif"})

    def test_the_schema_refuses(self):
        run = self.check(NETLIST)[1]
        for break_it in (lambda run: run.pop("tool"),
                         lambda run: run["results"][0].pop("message"),
                         lambda run: run["results"][0].update(level="bad"),
                         lambda run: run["results"][0].update(severity="bad")):
            broken = json.loads(json.dumps(run))
            break_it(broken)
            with self.assertRaises(jsonschema.ValidationError):
                jsonschema.validate({"version": "2.1.0", "runs": [broken]}, self.schema)

    @unittest.skipUnless(pathlib.Path("/usr/lib/python3/dist-packages/sarif_om").is_dir(),
                         "python3-sarif-python-om is not installed")
    def test_the_schema_is_part_of_the_standard(self):
        sys.path.append("/usr/lib/python3/dist-packages")
        import attr
        import sarif_om
        objects = {"sarifLog": self.schema, **self.schema["definitions"]}
        for name, schema in objects.items():
            fields = attr.fields_dict(getattr(sarif_om, name[0].upper() + name[1:]))
            known = {field.metadata["schema_property_name"] for field in fields.values()}
            self.assertLessEqual(set(schema["properties"]), known, name)
            required = {field.metadata["schema_property_name"] for field in fields.values()
                        if field.default is attr.NOTHING}
            self.assertEqual(set(schema["required"]), required, name)


if __name__ == "__main__":
    try:
        import jsonschema
    except ImportError:
        sys.path.append("/usr/lib/python3/dist-packages")
        try:
            import jsonschema
        except ImportError:
            sys.exit(NO_TEST)
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    TOOL = parser.parse_args().tool
    unittest.main(argv=sys.argv[:1])
