#!/usr/bin/env python3
"""Opens pages that `senseloom view` wrote in a real browser, and does what people do with them.

page_test.py TOOL SOURCE FOLDER [--write]    --write: what is drawn becomes what is expected
"""
import json
import os
import pathlib
import subprocess
import sys
import unittest
import urllib.parse

from browser import KEYS, Browser, missing, reduced

SKIPPED = 77
CLASS_NAMES = "unknown,sitting,walking,running,cycling,riding,no majority"
# Two clients of tapping; the first one has a bad key, and the second one a text that is no JSON.
TAPS = """{"call":"open","session":"lock","sensor":"STAP"}
{"call":"set_option","session":"lock","option":{"classMask":1,"clasMask":2}}
{"call":"open","session":"torch","sensor":"STAP"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":0,"classes":1}}
{"call":"set_option","session":"torch","option":"{"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1000,"classes":2}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":2000,"classes":3}}
{"call":"close","session":"lock"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":3000,"classes":2}}
"""
MARKUP = "</script><script>window.injected=1</script><img src=x onerror=window.injected=2><!--"

tool, source, folder = (pathlib.Path(argument).resolve() for argument in sys.argv[1:4])


def page_of(trace, *more, name="trace.jsonl"):
    """The address of the page of a trace, given as a text or as a file."""
    if not isinstance(trace, pathlib.Path):
        file = folder / name
        file.write_text(trace)
        trace = file
    page = folder / (trace.stem + ".html")
    environment = dict(os.environ, SENSELOOM_GESTURE_SCRIPT=str(source / "examples" / "gesture_hmm.script"))
    subprocess.run([tool, "view", trace, "-o", page, *more], check=True, env=environment, stderr=subprocess.DEVNULL)
    return page.as_uri()


class PageTest(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        folder.mkdir(parents=True, exist_ok=True)
        cls.browser = Browser()
        cls.commute = page_of(source / "examples" / "commute.jsonl", "--class-names", CLASS_NAMES)
        cls.taps = page_of(TAPS)

    @classmethod
    def tearDownClass(cls):
        cls.browser.__exit__()

    def setUp(self):
        self.browser.show_as(1100, 900)

    def tearDown(self):
        """Whatever a test does: nothing is said on the console, and nothing is asked for but pages in files."""
        self.assertEqual([entry["message"] for entry in self.browser.log("browser")], [])
        for entry in self.browser.log("performance"):
            message = json.loads(entry["message"])["message"]
            if message["method"] == "Network.requestWillBeSent":
                address = message["params"]["request"]["url"]
                self.assertTrue(address.startswith((folder.as_uri(), "data:image/png")), address)

    def open(self, address, view=""):
        self.browser.open("about:blank")
        self.browser.open(address + view)
        self.browser.drawn()

    def text(self, selector):
        return self.browser.run("return document.querySelector(arguments[0]).innerText", selector)

    def value(self):
        return self.browser.run("return document.getElementById('ruler').getAttribute('aria-valuetext')")

    def view(self):
        address = self.browser.run("return location.hash.slice(1)")
        return {name: values[0] for name, values in urllib.parse.parse_qs(address).items()}

    def place(self, selector):
        return self.browser.run(
            "const box = document.querySelector(arguments[0]).getBoundingClientRect();"
            "return {x: box.left, y: box.top, width: box.width, height: box.height}", selector)

    def point(self, selector, share, *more):
        box = self.place(selector)
        self.browser.pointer({"type": "pointerMove", "duration": 0, "x": round(box["x"] + share * box["width"]),
                              "y": round(box["y"] + box["height"] / 2)}, *more)

    def click(self, selector, share=0.5):
        self.point(selector, share, {"type": "pointerDown", "button": 0}, {"type": "pointerUp", "button": 0})

    def test_opens_with_the_counts_of_the_trace(self):
        self.open(self.commute)
        self.assertEqual(self.text("h1"), "commute.jsonl")
        self.assertEqual(self.text("#about"), "2,413 calls, 2,400 records, 3 sessions")
        self.assertEqual(self.browser.run("return document.title"), "commute.jsonl")
        labels = self.browser.run("return [...document.querySelectorAll('.label')].map(label => label.innerText)")
        self.assertEqual(labels, ["records", "logger\n38 of 2,196 records", "nav\n39 of 1,428 records",
                                  "fitness\n39 of 2,004 records"])

    def test_tells_what_became_of_the_record_that_is_pointed_at(self):
        self.open(self.taps)
        self.point(".records canvas", 0.27)  # of four seconds: the second record
        self.assertEqual(self.text("#record p").strip(), "line 6, 0:00:01 (timestamp 1000), STAP: class 2")
        self.assertEqual(self.text("#record tbody").split("\n"),
                         ["lock\t class not wanted: bits 2, mask 1\t", "torch\t delivered\tclass 2"])
        self.assertEqual(self.view(), {})

    def test_keeps_the_record_that_is_clicked(self):
        self.open(self.taps)
        self.click(".session canvas", 0.52)
        self.assertEqual(self.view(), {"record": "2"})
        self.open(self.taps, "#record=2")
        self.assertEqual(self.text("#record p").strip(), "line 7, 0:00:02 (timestamp 2000), STAP: class 1 + 2")

    def test_goes_from_record_to_record_by_keys(self):
        self.open(self.taps)
        self.browser.keys(KEYS["end"])
        self.assertEqual(self.value(), "line 9, 0:00:03 (timestamp 3000), STAP: class 2; torch delivered, class 2")
        self.browser.keys(KEYS["left"], KEYS["left"])
        self.assertIn("line 6, ", self.value())
        self.browser.keys(KEYS["home"])
        self.assertEqual(self.value(), "line 4, 0:00:00 (timestamp 0), STAP: class 1; lock delivered, class 1; "
                                       "torch delivered, class 1")
        self.browser.keys(KEYS["right"])
        self.assertIn("line 6, ", self.value())

    def test_zooms_by_keys_and_comes_back(self):
        self.open(self.commute)
        self.browser.keys("+", "+")
        zoomed = self.view()
        whole = 35_000_000  # milliseconds, roughly
        self.assertAlmostEqual(float(zoomed["to"]) - float(zoomed["from"]), whole / 1.6 ** 2, delta=0.05 * whole)
        self.browser.keys(KEYS["page_down"])
        self.assertGreater(float(self.view()["from"]), float(zoomed["from"]))
        self.browser.keys("0")
        self.assertEqual(self.view(), {})

    def test_zooms_by_the_wheel_where_the_pointer_is(self):
        self.open(self.taps)
        box = self.place(".records canvas")
        self.browser.wheel(round(box["x"]) + 1, round(box["y"]) + 9, -300)
        self.assertLess(float(self.view()["from"]), 10)
        self.assertAlmostEqual(float(self.view()["to"]), 4000 / 2.718, delta=30)

    def test_moves_when_it_is_dragged(self):
        self.open(self.taps, "#from=0&to=3000")
        box = self.place(".records canvas")
        y = round(box["y"]) + 9
        self.point(".records canvas", 0.5, {"type": "pointerDown", "button": 0},
                   *({"type": "pointerMove", "duration": 20, "x": round(box["x"] + share * box["width"]), "y": y}
                     for share in (0.4, 0.3)), {"type": "pointerUp", "button": 0})
        self.assertAlmostEqual(float(self.view()["from"]), 600, delta=10)
        self.assertNotIn("record", self.view())

    def test_an_address_shows_the_same_again(self):
        self.open(self.commute)
        self.browser.keys("+", "+", KEYS["right"], KEYS["right"])
        self.click("[data-reason='1 3']")
        address, shown = self.browser.run("return location.href"), self.drawn()
        self.open(address)
        self.assertEqual(self.drawn(), shown)

    def drawn(self):
        return self.browser.run("return [document.querySelector('main').innerText,"
                                "...[...document.querySelectorAll('canvas')].map(canvas => canvas.toDataURL())]")

    def test_a_reason_leaves_its_records(self):
        self.open(self.commute)
        self.click("[data-reason='1 3']")
        self.assertEqual(self.text("#found"), "Only “unchanged” of nav.")
        self.assertEqual(self.browser.run("return document.querySelector(\"[data-reason='1 3']\").ariaPressed"), "true")
        self.browser.run("document.activeElement.blur()")
        for _ in range(5):
            self.browser.keys(KEYS["right"])
            self.assertIn("nav unchanged: class ", self.value())
        self.browser.keys(KEYS["escape"])
        self.assertEqual(self.text("#found"), "")

    def test_a_search_leaves_the_lanes_and_records_of_its_names(self):
        self.open(self.commute, "#search=NAV, running")
        labels = self.browser.run("return [...document.querySelectorAll('.label b')].map(label => label.innerText)")
        self.assertEqual(labels, ["records", "nav"])
        self.browser.keys(KEYS["home"])
        self.assertIn("running", self.value())
        self.browser.keys("/", "x")
        self.assertEqual(self.text("#found"), "Nothing is called “runningx”.")

    def test_negotiations_open_as_tables(self):
        self.open(self.taps)
        self.browser.keys("n")
        self.assertEqual(self.text("#negotiation h2"), "Line 5: torch on STAP sets {")
        self.assertTrue(self.text("#negotiation-body").startswith("not JSON ("), self.text("#negotiation-body"))
        self.browser.keys(KEYS["escape"])
        self.assertEqual(self.browser.run("return document.querySelector('dialog').open"), False)
        self.click("#calls li:first-child button")
        self.assertIn("unknown key \"clasMask\" has no effect", self.text("#negotiation-body"))
        self.assertEqual(self.text("#negotiation tbody tr:first-child").split("\t"),
                         ["classMask", "bitwise or", "1", "1", "101 = 1", "lock"])
        self.click("#next")
        self.assertEqual(self.text("#negotiation h2"), "Line 5: torch on STAP sets {")
        self.assertEqual(self.view()["event"], "3")
        self.click("#close")
        self.assertNotIn("event", self.view())

    def test_a_click_on_the_line_of_a_negotiation_opens_it(self):
        self.open(self.taps)
        self.click(".session canvas", 0.751)  # at three seconds
        self.assertEqual(self.text("#negotiation h2"), "Line 8: lock on STAP leaves")

    def test_a_screen_reader_finds_everything(self):
        self.open(self.taps, "#record=1")
        nodes = self.browser.cdp("Accessibility.getFullAXTree")["nodes"]
        named = {(node["role"]["value"], node.get("name", {}).get("value", "")) for node in nodes if "role" in node}
        for expected in (("slider", "Record"), ("combobox", "Search"), ("heading", "What became of the records"),
                         ("heading", "Requests and negotiations"), ("region", "Time line"),
                         ("image", "What lock received: 2 of 3 records"), ("button", "class not wanted 1"),
                         ("button", "line 5: torch on STAP sets {"), ("columnheader", "became of it"),
                         ("rowheader", "torch"), ("cell", " class not wanted: bits 2, mask 1")):
            self.assertIn(expected, named)
        slider = next(node for node in nodes if node.get("role", {}).get("value") == "slider")
        self.assertEqual(slider["value"]["value"], 2)
        nameless = [role for role, name in named if role in ("button", "slider", "image") and not name.strip()]
        self.assertEqual(nameless, [])

    def test_every_control_is_reached_by_the_keyboard(self):
        self.open(self.taps)
        reached = []
        for _ in range(40):
            self.browser.keys(KEYS["tab"])
            reached.append(self.browser.run(
                "const a = document.activeElement; return a.id || a.dataset.key || a.dataset.reason || a.innerText"))
        for expected in ("search", "-", "+", "0", "ruler", "class 1", "How to move about", "0 0", "0 2",
                         "line 2: lock on STAP sets {\"classMask\":1,\"clasMask\":2}"):
            self.assertIn(expected, reached)

    def test_fits_a_narrow_screen(self):
        self.browser.show_as(360, 740)
        for view in ("", "#record=1", "#event=1"):
            self.open(self.commute, view)
            self.assertEqual(self.browser.run("return document.documentElement.scrollWidth"), 360, view)

    def test_markup_in_a_trace_stays_text(self):
        evil = {name: MARKUP + name for name in ("session", "key", "option", "other")}
        calls = [{"call": "open", "session": evil["session"], "sensor": "STAP"},
                 {"call": "set_option", "session": evil["session"], "option": {evil["key"]: 1}},
                 {"call": "set_option", "session": evil["session"], "option": evil["option"]},
                 {"call": "dispatch", "sensor": "STAP", "record": {"timestamp": 1, "classes": 1}},
                 {"call": "dispatch", "sensor": "STAP", "record": {"timestamp": 9, "classes": 2}}]
        trace = "".join(json.dumps(call) + "\n" for call in calls)
        page = page_of(trace, "--class-names", f"{MARKUP},{MARKUP}", name="<img src=x onerror=alert(1)>.jsonl")
        for view in ("#event=1", "#event=2", "#record=0", "#" + urllib.parse.urlencode({"search": MARKUP})):
            self.open(page, view)
            self.assertEqual(self.browser.run("return [window.injected ?? null, document.images.length,"
                                              "document.scripts.length]"), [None, 0, 4])
        self.open(page, "#event=2")
        self.assertEqual(self.text("#negotiation h2"), f"Line 3: {evil['session']} on STAP sets {evil['option']}")
        self.assertEqual(self.text("h1"), "<img src=x onerror=alert(1)>.jsonl")

    def test_every_example_is_drawn(self):
        for example in sorted((source / "examples").glob("*.jsonl")):
            self.open(page_of(example))
            self.browser.keys(KEYS["end"])
            self.assertIn("line ", self.value(), example)

    def test_a_trace_without_records_says_so(self):
        self.open(page_of('{"call":"open","session":"a","sensor":"LIFT"}', name="empty.jsonl"))
        self.assertEqual(self.text("#empty"), "The trace has no records.")

    def test_records_and_sums_agree(self):
        """A trace that is too long to draw each record: its first and last records are found all the same."""
        made = subprocess.run([tool, "generate", "commute", "--seed", "3", "--records", "70000"], check=True,
                              capture_output=True, text=True)
        self.open(page_of(made.stdout, name="long.jsonl"))
        self.browser.keys(KEYS["end"])
        calls = [(number, json.loads(line)) for number, line in enumerate(made.stdout.splitlines(), 1)]
        times = [(number, call["record"]["timestamp"]) for number, call in calls if call["call"] == "dispatch"]
        self.assertIn(f"line {times[-1][0]:,}, ", self.value())
        self.assertIn(f"(timestamp {times[-1][1]})", self.value())
        pictures = []
        for record in (32_760, 32_780):  # up to the first, each record is drawn; up to the second, sums of 64
            self.open((folder / "long.html").as_uri(), f"#from=0&to={times[record][1] - times[0][1]}")
            pictures.append(reduced(self.browser, self.browser.picture(), 55, 45)[1])
        far = sum(abs(one - other) > 40 for one, other in zip(*pictures))
        self.assertLess(far, 0.02 * len(pictures[0]))
        self.assertNotEqual(*pictures)

    def test_looks_as_expected(self):
        for name, width, height, dark in (("light", 1100, 900, False), ("dark", 1100, 900, True),
                                          ("narrow", 360, 900, False)):
            self.browser.show_as(width, height, dark)
            self.open(self.commute, "#record=700")
            made, colours = reduced(self.browser, self.browser.picture(), width // 10, height // 10)
            file = source / "tests" / "tool" / "view" / "pictures" / f"{name}.png"
            if "--write" in sys.argv:
                file.write_bytes(made)
            expected = reduced(self.browser, file.read_bytes(), width // 10, height // 10)[1]
            far = sum(abs(one - other) > 40 for one, other in zip(colours, expected))
            self.assertLess(far, 0.03 * len(expected), f"{name}: {far} of {len(expected)} numbers differ")


lacking = missing()
if lacking:
    print(f"There is no {lacking} to open the page in.")
    sys.exit(SKIPPED)
unittest.main(argv=sys.argv[:1])
